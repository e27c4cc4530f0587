// SPDX-License-Identifier: MIT
// How a number is shown: C's printf conversions, taken apart when the program is compiled.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace kestro {

/// One printf format with exactly one conversion: "%d dBm", "%4.2f dB", "0x%06x", "[Reserved %d]".
/// Known are the conversions d, u, x and f, the flags '+' and '0', a width and a precision. A
/// format that is not of this kind does not compile.
struct NumberFormat {
  std::string_view prefix;
  std::string_view suffix;
  char conversion = 'd';
  bool plus = false;
  bool zeroPadded = false;
  std::uint8_t width = 0;
  std::uint8_t precision = 6;

  // A format is written as its text wherever one is asked for.
  // NOLINTNEXTLINE(google-explicit-constructor)
  consteval NumberFormat(const char* format) {
    const std::string_view text(format);
    const std::size_t percent = text.find('%');
    if (percent == std::string_view::npos) throw "a format needs a conversion";
    prefix = text.substr(0, percent);
    std::size_t i = percent + 1;
    for (; text[i] == '+' || text[i] == '0'; ++i) (text[i] == '+' ? plus : zeroPadded) = true;
    for (; isDigit(text[i]); ++i) width = appendDigit(width, text[i]);
    if (text[i] == '.') {
      precision = 0;
      for (++i; isDigit(text[i]); ++i) precision = appendDigit(precision, text[i]);
    }
    conversion = text[i];
    if (std::string_view("duxf").find(conversion) == std::string_view::npos)
      throw "unknown conversion";
    suffix = text.substr(i + 1);
    if (suffix.starts_with("%%")) suffix.remove_prefix(1);
    if (suffix.find('%', 1) != std::string_view::npos) throw "a format has one conversion";
  }

  bool operator==(const NumberFormat&) const = default;

  /// Whether this is "%d" or "%u", the most frequent of all.
  [[nodiscard]] constexpr bool isPlainDecimal() const noexcept {
    return (conversion == 'd' || conversion == 'u') && width == 0 && !plus && prefix.empty() &&
           suffix.empty();
  }

 private:
  static constexpr bool isDigit(char c) { return c >= '0' && c <= '9'; }
  static constexpr std::uint8_t appendDigit(std::uint8_t number, char digit) {
    return static_cast<std::uint8_t>(10 * number + (digit - '0'));
  }
};

/// Room for the text of a number, or for a fixed text; reused from one value to the next.
class TextBuffer {
 public:
  static constexpr std::size_t kCapacity = 512;

  [[nodiscard]] std::string_view text() const noexcept { return {_characters, _size}; }
  void clear() noexcept { _size = 0; }

  /// Appends a text; what does not fit is cut off.
  void append(std::string_view text) noexcept;
  /// Appends what printf would print for an integer conversion of the number's low 32 bits (signed
  /// for 'd'), or for 'f' of the number as a double.
  void append(const NumberFormat& format, std::int64_t number) noexcept;
  /// Appends what printf would print in the C locale for 'f', whatever locale is set; an integer
  /// conversion takes the number without its fraction.
  void append(const NumberFormat& format, double number) noexcept;

 private:
  void appendPadded(const NumberFormat& format, char sign, std::string_view digits) noexcept;

  char _characters[kCapacity];
  std::size_t _size = 0;
};

}  // namespace kestro
