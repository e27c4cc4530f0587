// SPDX-License-Identifier: MIT
#include "Recordings/StorableValue.h"

#include <array>
#include <cstddef>

#include "Platform/PropertyListCoding.h"
#include "Platform/Utf8.h"

namespace kestro {
namespace {

constexpr std::string_view kReplacement = "\xEF\xBF\xBD";
constexpr std::array<std::string_view, 2> kNoncharacters = {"\xEF\xBF\xBE", "\xEF\xBF\xBF"};
constexpr std::string_view kUnknown = "(unknown)";

/// The size of the character that a text, which begins with valid UTF-8, begins with, when XML
/// cannot hold it; else 0.
std::size_t unstorableSize(std::string_view text) {
  const auto first = static_cast<unsigned char>(text.front());
  if (first < ' ') return first == '\t' || first == '\n' || first == '\r' ? 0 : 1;
  for (const std::string_view character : kNoncharacters) {
    if (text.starts_with(character)) return character.size();
  }
  return 0;
}

Value storable(const Value& value, std::size_t levels);

Value storable(const Array& array, std::size_t levels) {
  Array result;
  result.reserve(array.size());
  for (const Value& element : array) result.append(storable(element, levels));
  return result;
}

Value storable(const Dictionary& dictionary, std::size_t levels) {
  Dictionary result;
  for (const auto& [key, value] : dictionary) {
    if (!key.isText() || value.isNull()) continue;
    std::string text = storableText(key.text());
    while (result.contains(text)) text += kReplacement;
    result.set(text, storable(value, levels));
  }
  return result;
}

/// `levels` counts the containers around the value.
Value storable(const Value& value, std::size_t levels) {
  const bool mayHold = levels < PropertyListLimits::snapshotFile().levels;
  if (value.isText()) return storableText(value.text());
  if (value.isArray() && mayHold) return storable(value.array(), levels + 1);
  if (value.isDictionary() && mayHold) return storable(value.dictionary(), levels + 1);
  if (value.isNull() || value.isArray() || value.isDictionary()) return kUnknown;
  return value;
}

}  // namespace

std::string storableText(std::string_view text) {
  std::string result;
  result.reserve(text.size());
  std::size_t valid = validTextPrefix(text);
  for (std::size_t at = 0; at < text.size();) {
    if (at == valid) {
      result += kReplacement;
      ++at;
      valid = at + validTextPrefix(text.substr(at));
    } else if (const std::size_t size = unstorableSize(text.substr(at)); size != 0) {
      result += kReplacement;
      at += size;
    } else {
      result += text[at++];
    }
  }
  return result;
}

Value storableValue(const Value& value) { return storable(value, 0); }

}  // namespace kestro
