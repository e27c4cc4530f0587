// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/NumberFormat.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstring>
#include <iterator>

namespace kestro {
namespace {

/// The longest "%f" of a double: 309 digits, a point and a precision of up to 99.
constexpr std::size_t kLongestNumber = 420;

// How rounding to a few decimals takes but a product: it is off by less than a tenth of the doubt.
constexpr double kPowersOfTen[] = {1, 1e1, 1e2, 1e3, 1e4, 1e5, 1e6};
constexpr double kLargestProduct = 1 << 30;
constexpr double kDoubt = 1e-6;

/// The digits of a number that is not negative, correctly rounded, in the room before `end`. Empty
/// when the number is too large, or so close to a half that a product cannot tell where it goes.
std::string_view quickDigits(double number, unsigned precision, char* end) noexcept {
  if (precision >= std::size(kPowersOfTen)) return {};
  const double product = number * kPowersOfTen[precision];
  if (!(product < kLargestProduct)) return {};  // nor infinity, nor what is no number
  auto rounded = static_cast<std::uint32_t>(product);
  const double fraction = product - rounded;
  if (std::abs(fraction - 0.5) < kDoubt) return {};
  if (fraction > 0.5) ++rounded;
  char* begin = end;
  const auto putDigit = [&] {
    *--begin = static_cast<char>('0' + rounded % 10);
    rounded /= 10;
  };
  for (unsigned i = 0; i < precision; ++i) putDigit();
  if (precision != 0) *--begin = '.';
  do {
    putDigit();
  } while (rounded != 0);
  return {begin, end};
}

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
  char room[kLongestNumber];
  std::string_view digits = quickDigits(std::abs(number), format.precision, room + sizeof(room));
  if (digits.empty()) {
    const auto end = std::to_chars(room, room + sizeof(room), std::abs(number),
                                   std::chars_format::fixed, format.precision);
    digits = {room, end.ptr};
  }
  appendPadded(format, signOf(std::signbit(number), format.plus), digits);
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
  if (sign != '\0' && _size < kCapacity) _characters[_size++] = sign;
  if (zeros) {
    for (std::size_t i = 0; i < padding; ++i) append("0");
  }
  append(digits);
  append(format.suffix);
}

}  // namespace kestro
