// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/NumberText.h"

#include <algorithm>
#include <charconv>
#include <cstddef>

namespace kestro {
namespace {

constexpr std::string_view kDigits = "0123456789";
constexpr std::ptrdiff_t kMostDigits = 15;  // a double holds no more of any number

bool isDigit(char c) { return kDigits.find(c) != std::string_view::npos; }

/// How many characters at the front are a decimal number: "-12", "+0.5".
std::size_t numberLength(std::string_view text) {
  const std::size_t sign = text.starts_with('-') || text.starts_with('+') ? 1 : 0;
  const std::size_t whole = std::min(text.find_first_not_of(kDigits, sign), text.size());
  if (whole == sign) return 0;
  if (whole + 1 >= text.size() || text[whole] != '.' || !isDigit(text[whole + 1])) return whole;
  return std::min(text.find_first_not_of(kDigits, whole + 1), text.size());
}

/// What follows a number, as a unit; nothing when it is none.
std::optional<std::string_view> unitIn(std::string_view rest) {
  if (rest.empty() || rest == "%") return rest;
  if (rest.front() != ' ') return std::nullopt;
  rest.remove_prefix(1);
  const bool isWord = !rest.empty() && rest.find(' ') == std::string_view::npos;
  if (!isWord || isDigit(rest.front())) return std::nullopt;
  return rest;
}

}  // namespace

std::optional<NumberWithUnit> numberWithUnit(std::string_view text) noexcept {
  const std::size_t length = numberLength(text);
  if (length == 0) return std::nullopt;
  const auto unit = unitIn(text.substr(length));
  std::string_view digits = text.substr(0, length);
  if (!unit || std::ranges::count_if(digits, isDigit) > kMostDigits) return std::nullopt;
  if (digits.front() == '+') digits.remove_prefix(1);
  NumberWithUnit result{.unit = *unit};
  std::from_chars(digits.data(), digits.data() + digits.size(), result.number,
                  std::chars_format::fixed);
  return result;
}

}  // namespace kestro
