// SPDX-License-Identifier: MIT
#include "Platform/PropertyListDescription.h"

#include <fmt/format.h>

#include <algorithm>
#include <chrono>
#include <iterator>

namespace kestro {
namespace {

bool standsUnquoted(std::string_view text) {
  const auto isPlain = [](char c) {
    return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_';
  };
  return !text.empty() && std::ranges::all_of(text, isPlain);
}

class Describer {
 public:
  void append(const Value& value) {
    switch (value.type()) {
      case ValueType::Null:
        _text += "(null)";
        break;
      case ValueType::Text:
        appendText(value.text());
        break;
      case ValueType::Integer:
        appendInteger(value);
        break;
      case ValueType::Real:
        fmt::format_to(std::back_inserter(_text), "{}", value.realNumber());
        break;
      case ValueType::Boolean:
        _text += value.flag() ? '1' : '0';
        break;
      case ValueType::Date:
        fmt::format_to(std::back_inserter(_text), "{}",
                       std::chrono::duration<double>(value.moment().time_since_epoch()).count());
        break;
      case ValueType::Data:
        fmt::format_to(std::back_inserter(_text), "<{:02x}>", fmt::join(value.bytes(), ""));
        break;
      case ValueType::Dictionary:
        appendDictionary(value.dictionary());
        break;
      case ValueType::Array:
        appendArray(value.array());
        break;
    }
  }

  [[nodiscard]] std::string take() { return std::move(_text); }

 private:
  void appendText(std::string_view text) {
    if (standsUnquoted(text)) {
      _text += text;
      return;
    }
    _text += '"';
    for (const char c : text) {
      if (c == '"' || c == '\\' || c == '\n') _text += '\\';
      _text += c == '\n' ? 'n' : c;
    }
    _text += '"';
  }

  void appendInteger(const Value& value) {
    const std::int64_t number = value.integerBits();
    _text += value.isAboveInt64() ? std::to_string(static_cast<std::uint64_t>(number))
                                  : std::to_string(number);
  }

  void appendDictionary(const Dictionary& dictionary) {
    _text += "{ ";
    for (const auto& [key, value] : dictionary) {
      append(key);
      _text += " = ";
      append(value);
      _text += "; ";
    }
    _text += '}';
  }

  void appendArray(const Array& array) {
    _text += '(';
    std::string_view separator = " ";
    for (const Value& element : array) {
      _text += separator;
      append(element);
      separator = ", ";
    }
    _text += " )";
  }

  std::string _text;
};

}  // namespace

std::string describe(const Value& value) {
  Describer describer;
  describer.append(value);
  return describer.take();
}

}  // namespace kestro
