// SPDX-License-Identifier: MIT
#include "Platform/Linux/XmlPropertyListLeaves.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <chrono>
#include <cstdint>
#include <limits>
#include <optional>

#include "Platform/Linux/PropertyListDates.h"

namespace kestro {
namespace {

std::string_view trimmed(std::string_view text) {
  const std::size_t start = text.find_first_not_of(kXmlSpaces);
  if (start == std::string_view::npos) return {};
  return text.substr(start, text.find_last_not_of(kXmlSpaces) + 1 - start);
}

/// The number that is all of `digits`.
template <class T, class... Format>
std::optional<T> wholeNumber(std::string_view digits, Format... format) {
  T result = 0;
  const char* end = digits.data() + digits.size();
  const auto [stopped, error] = std::from_chars(digits.data(), end, result, format...);
  if (digits.empty() || stopped != end || error != std::errc()) return std::nullopt;
  return result;
}

/// An integer's amount without its sign.
std::optional<std::uint64_t> magnitude(std::string_view digits) {
  if (digits.starts_with("0x")) return wholeNumber<std::uint64_t>(digits.substr(2), 16);
  return wholeNumber<std::uint64_t>(digits, 10);
}

/// How many zeros stand in front of the first digit that counts, of a decimal number.
std::size_t leadingZeros(std::string_view digits) {
  if (digits.starts_with("0x")) return 0;
  return std::min(digits.find_first_not_of('0'), digits.size() - 1);
}

LeafVerdict checkInteger(std::string_view content) {
  constexpr std::uint64_t kLargest = std::numeric_limits<std::int64_t>::max();
  std::string_view digits = trimmed(content);
  const bool isNegative = digits.starts_with('-');
  if (isNegative || digits.starts_with('+')) digits.remove_prefix(1);
  const std::optional<std::uint64_t> amount = magnitude(digits);
  if (!amount || (isNegative && *amount > kLargest + 1)) {
    return {.problem = "an integer that is none or beyond 64 bits"};
  }
  return {.problem = {},
          .isLargeInteger = !isNegative && *amount > kLargest,
          .zerosAt = static_cast<std::size_t>(digits.data() - content.data()),
          .zeros = leadingZeros(digits)};
}

bool isReal(std::string_view content) {
  std::string_view digits = trimmed(content);
  if (digits.starts_with('+')) {
    digits.remove_prefix(1);
    if (digits.starts_with('-')) return false;
  }
  return digits.find('(') == std::string_view::npos && wholeNumber<double>(digits).has_value();
}

/// "2012-03-04T13:05:09Z", the only form.
std::optional<std::chrono::sys_seconds> dateOf(std::string_view content) {
  constexpr std::string_view kForm = "dddd-dd-ddTdd:dd:ddZ";
  const bool isInForm = std::ranges::equal(content, kForm, [](char character, char form) {
    return form == 'd' ? character >= '0' && character <= '9' : character == form;
  });
  if (!isInForm) return std::nullopt;
  const auto field = [content](std::size_t at, std::size_t width) {
    return *wholeNumber<unsigned>(content.substr(at, width), 10);
  };
  const std::chrono::year_month_day day{std::chrono::year(static_cast<int>(field(0, 4))),
                                        std::chrono::month(field(5, 2)),
                                        std::chrono::day(field(8, 2))};
  const unsigned hour = field(11, 2);
  const unsigned minute = field(14, 2);
  const unsigned second = field(17, 2);
  if (!day.ok() || day.year() < std::chrono::year(1) || hour > 23 || minute > 59 || second > 59)
    return std::nullopt;
  return std::chrono::sys_days(day) + std::chrono::hours(hour) + std::chrono::minutes(minute) +
         std::chrono::seconds(second);
}

LeafVerdict checkDate(std::string_view content) {
  const std::optional<std::chrono::sys_seconds> date = dateOf(content);
  if (!date) return {.problem = "a date that is none"};
  const std::chrono::duration<double> sinceEpoch = *date - kPropertyListEpoch;
  return {.problem = {}, .isFarDate = !isLibraryDate(sinceEpoch.count())};
}

enum class Base64 : std::uint8_t { No, Digit, Padding, Space };

constexpr std::array<Base64, 256> kBase64 = [] {
  std::array<Base64, 256> result = {};
  const auto set = [&result](std::string_view characters, Base64 kind) {
    for (const char character : characters) result[static_cast<std::uint8_t>(character)] = kind;
  };
  set("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/", Base64::Digit);
  set("=", Base64::Padding);
  set(" \t\r\n", Base64::Space);
  return result;
}();

bool isBase64(std::string_view content) {
  std::size_t digits = 0;
  std::size_t padding = 0;
  for (const char character : content) {
    const Base64 kind = kBase64[static_cast<std::uint8_t>(character)];
    if (kind == Base64::No || (kind == Base64::Digit && padding != 0)) return false;
    digits += kind == Base64::Digit ? 1 : 0;
    padding += kind == Base64::Padding ? 1 : 0;
  }
  return padding <= 2 && (digits + padding) % 4 == 0;
}

bool isCharacterNumber(std::string_view number) {
  const bool isHexadecimal = number.starts_with('x');
  if (isHexadecimal) number.remove_prefix(1);
  const auto code = wholeNumber<std::uint32_t>(number, isHexadecimal ? 16 : 10);
  if (!code) return false;
  const bool isSurrogate = *code >= 0xD800 && *code <= 0xDFFF;
  return *code != 0 && *code <= 0x10FFFF && !isSurrogate;
}

}  // namespace

LeafVerdict checkXmlLeaf(std::string_view name, std::string_view content) {
  if (name == "integer") return checkInteger(content);
  if (name == "date") return checkDate(content);
  if (name == "real") return {.problem = isReal(content) ? "" : "a real that is none"};
  if (name == "data") return {.problem = isBase64(content) ? "" : "data that is no base64"};
  if (name != "true" && name != "false") return {.problem = "an element of no property list"};
  return {.problem = trimmed(content).empty() ? "" : "a boolean with a content"};
}

bool isXmlEntity(std::string_view name) {
  if (name.starts_with('#')) return isCharacterNumber(name.substr(1));
  return name == "lt" || name == "gt" || name == "amp" || name == "apos" || name == "quot";
}

std::optional<std::string> declaredEncoding(std::string_view declaration) {
  const std::size_t key = declaration.find("encoding");
  if (key == std::string_view::npos) return std::nullopt;
  const std::size_t quote = declaration.find_first_of("\"'", key);
  if (quote == std::string_view::npos) return "";
  const std::string_view value = declaration.substr(quote + 1);
  std::string name(value.substr(0, value.find(declaration[quote])));
  std::ranges::transform(name, name.begin(), [](char character) {
    return character >= 'A' && character <= 'Z' ? static_cast<char>(character - 'A' + 'a')
                                                : character;
  });
  return name;
}

}  // namespace kestro
