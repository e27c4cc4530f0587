// SPDX-License-Identifier: MIT
#include "Sources/Modem/BusFields.h"

#include <fmt/format.h>

#include <charconv>
#include <cmath>

#include "Sources/Modem/ShownText.h"

namespace kestro {
namespace {

constexpr std::size_t kMaximumTexts = 64;

}  // namespace

std::optional<std::uint64_t> numberIn(std::string_view digits, int base) {
  std::uint64_t number = 0;
  const char* end = digits.data() + digits.size();
  const auto [parsed, error] = std::from_chars(digits.data(), end, number, base);
  if (error != std::errc() || parsed != end) return std::nullopt;
  return number;
}

BusProperties propertiesIn(const BusValue& value, std::string_view name, BusFaults& faults) {
  const auto* entries = std::get_if<BusValue::Entries>(&value.content);
  BusProperties properties;
  if (value.signature != "a{sv}" || entries == nullptr) {
    faults.wrongType(name, "a{sv}", value.signature);
    return properties;
  }
  for (const auto& [key, content] : *entries) {
    if (const auto* text = std::get_if<std::string>(&key.content)) properties[*text] = content;
  }
  return properties;
}

std::string BusFields::nameOf(std::string_view key) const {
  return fmt::format("{} {}", _name, key);
}

template <class T>
const T* BusFields::content(std::string_view key, std::string_view signature) const {
  const auto found = _properties.find(key);
  if (found == _properties.end()) return nullptr;
  const auto* content = std::get_if<T>(&found->second.content);
  if (content != nullptr && found->second.signature == signature) return content;
  _faults->wrongType(nameOf(key), signature, found->second.signature);
  return nullptr;
}

std::optional<bool> BusFields::flag(std::string_view key) const {
  const auto* flag = content<bool>(key, "b");
  return flag == nullptr ? std::nullopt : std::optional(*flag);
}

std::optional<std::int64_t> BusFields::integer(std::string_view key) const {
  const auto* number = content<std::int64_t>(key, "i");
  return number == nullptr ? std::nullopt : std::optional(*number);
}

std::optional<std::uint64_t> BusFields::number(std::string_view key, std::uint64_t greatest) const {
  const auto* number = content<std::uint64_t>(key, "u");
  if (number == nullptr) return std::nullopt;
  if (*number <= greatest) return *number;
  _faults->senseless(nameOf(key), fmt::format("{}", *number));
  return std::nullopt;
}

std::optional<std::uint64_t> BusFields::longNumber(std::string_view key) const {
  const auto* number = content<std::uint64_t>(key, "t");
  return number == nullptr ? std::nullopt : std::optional(*number);
}

std::optional<double> BusFields::real(std::string_view key, double least, double greatest) const {
  const auto* number = content<double>(key, "d");
  if (number == nullptr) return std::nullopt;
  if (std::isfinite(*number) && *number >= least && *number <= greatest) return *number;
  _faults->senseless(nameOf(key), fmt::format("{}", *number));
  return std::nullopt;
}

std::optional<std::string> BusFields::text(std::string_view key) const {
  const auto* text = content<std::string>(key, "s");
  if (text == nullptr || text->empty()) return std::nullopt;
  return shownText(*text);
}

std::optional<std::string> BusFields::path(std::string_view key) const {
  const auto* path = content<std::string>(key, "o");
  if (path == nullptr || *path == "/") return std::nullopt;
  return *path;
}

std::optional<std::uint64_t> BusFields::hexadecimal(std::string_view key,
                                                    std::uint64_t greatest) const {
  constexpr int kBase = 16;
  const auto* text = content<std::string>(key, "s");
  if (text == nullptr || text->empty()) return std::nullopt;
  const auto number = numberIn(*text, kBase);
  if (number && *number <= greatest) return number;
  _faults->senseless(nameOf(key), fmt::format("\"{}\"", *text));
  return std::nullopt;
}

std::vector<std::string> BusFields::texts(std::string_view key, std::string_view signature) const {
  std::vector<std::string> result;
  for (const BusValue& element : elements(key, signature)) {
    const auto* text = std::get_if<std::string>(&element.content);
    if (text != nullptr && result.size() < kMaximumTexts) result.push_back(*text);
  }
  return result;
}

std::vector<BusValue> BusFields::elements(std::string_view key, std::string_view signature) const {
  const auto* elements = content<BusValue::Elements>(key, signature);
  return elements == nullptr ? std::vector<BusValue>() : *elements;
}

BusFields BusFields::dictionary(std::string_view key) const {
  const auto found = _properties.find(key);
  const std::string name = nameOf(key);
  if (found == _properties.end()) return {{}, name, *_faults};
  return {propertiesIn(found->second, name, *_faults), name, *_faults};
}

}  // namespace kestro
