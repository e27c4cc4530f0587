// SPDX-License-Identifier: MIT
// One line of a display: pieces of text, each with a style.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace kestro {

enum class TextStyle {
  Plain,
  Key,      ///< the name of a value
  Section,  ///< the name of a group of values
  Changed,  ///< a value that differs from the last refresh
  Faint,    ///< remarks of the program's own
  Bar,      ///< the title line
};

/// Texts are given as `displayText` makes them; widths are in cells.
class StyledLine {
 public:
  struct Piece {
    std::string text;
    TextStyle style;
    bool operator==(const Piece&) const = default;
  };

  StyledLine& append(std::string_view text, TextStyle style = TextStyle::Plain);
  StyledLine& append(const StyledLine& line);
  /// Appends blanks until the line is `width` wide; a wider line stays as it is.
  StyledLine& padTo(std::size_t width, TextStyle style = TextStyle::Plain);

  [[nodiscard]] std::size_t width() const noexcept { return _width; }
  [[nodiscard]] const std::vector<Piece>& pieces() const noexcept { return _pieces; }

  /// The line, cut with "…" when it is wider than `width`.
  [[nodiscard]] StyledLine fitted(std::size_t width) const;

  /// The text alone, without blanks at its end.
  [[nodiscard]] std::string plainText() const;
  /// The text with terminal attributes, all reset at the end. Without `colour` only bold, faint and
  /// inverse are used.
  [[nodiscard]] std::string terminalText(bool colour) const;

 private:
  std::vector<Piece> _pieces;
  std::size_t _width = 0;
};

}  // namespace kestro
