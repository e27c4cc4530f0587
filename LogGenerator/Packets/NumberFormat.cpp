// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/NumberFormat.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstring>

namespace kestro {
namespace {

/// The longest "%f" of a double: 309 digits, a point and a precision of up to 99.
constexpr std::size_t kLongestNumber = 420;

char signOf(bool negative, bool plus) noexcept {
  if (negative) return '-';
  return plus ? '+' : '\0';
}

}  // namespace

void TextBuffer::append(std::string_view text) noexcept {
  const std::size_t count = std::min(text.size(), kCapacity - _size);
  if (count != 0) std::memcpy(_characters + _size, text.data(), count);
  _size += count;
}

void TextBuffer::append(const NumberFormat& format, std::int64_t number) noexcept {
  if (format.conversion == 'f') {
    append(format, static_cast<double>(number));
    return;
  }
  const auto word = static_cast<std::uint32_t>(number);
  const bool negative = format.conversion == 'd' && static_cast<std::int32_t>(word) < 0;
  char digits[16];
  char* begin = digits + 1;
  const auto end = std::to_chars(begin, digits + sizeof(digits), negative ? 0U - word : word,
                                 format.conversion == 'x' ? 16 : 10);
  const bool plus = format.plus && format.conversion == 'd';
  if (format.width != 0 || plus) {
    appendPadded(format, signOf(negative, plus), {begin, end.ptr});
    return;
  }
  if (negative) *--begin = '-';
  append(format.prefix);
  append({begin, end.ptr});
  append(format.suffix);
}

void TextBuffer::append(const NumberFormat& format, double number) noexcept {
  if (format.conversion != 'f') {
    append(format, static_cast<std::int64_t>(number));
    return;
  }
  char digits[kLongestNumber];
  const auto end = std::to_chars(digits, digits + sizeof(digits), std::abs(number),
                                 std::chars_format::fixed, format.precision);
  appendPadded(format, signOf(std::signbit(number), format.plus), {digits, end.ptr});
}

void TextBuffer::appendPadded(const NumberFormat& format, char sign,
                              std::string_view digits) noexcept {
  append(format.prefix);
  const std::size_t length = digits.size() + (sign == '\0' ? 0 : 1);
  const std::size_t padding = format.width > length ? format.width - length : 0;
  const bool zeros = format.zeroPadded && std::ranges::none_of(digits, [](char c) {
                       return c == 'n';  // "inf" and "nan" are padded with blanks
                     });
  if (!zeros) {
    for (std::size_t i = 0; i < padding; ++i) append(" ");
  }
  if (sign != '\0') append({&sign, 1});
  if (zeros) {
    for (std::size_t i = 0; i < padding; ++i) append("0");
  }
  append(digits);
  append(format.suffix);
}

}  // namespace kestro
