// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/StyledLine.h"

#include "CommandLine/Formats/DisplayText.h"

namespace kestro {
namespace {

/// The attributes that a style is drawn with; "" for none.
std::string_view attributes(TextStyle style, bool colour) {
  switch (style) {
    case TextStyle::Plain:
      return "";
    case TextStyle::Key:
      return "\033[1m";
    case TextStyle::Section:
      return colour ? "\033[1;36m" : "\033[1m";
    case TextStyle::Changed:
    case TextStyle::Bar:
      return "\033[7m";
    case TextStyle::Faint:
      return "\033[2m";
  }
  return "";
}

constexpr std::string_view kResetAttributes = "\033[0m";

}  // namespace

StyledLine& StyledLine::append(std::string_view text, TextStyle style) {
  if (text.empty()) return *this;
  _width += textWidth(text);
  if (!_pieces.empty() && _pieces.back().style == style) {
    _pieces.back().text += text;
  } else {
    _pieces.push_back({std::string(text), style});
  }
  return *this;
}

StyledLine& StyledLine::append(const StyledLine& line) {
  for (const Piece& piece : line._pieces) append(piece.text, piece.style);
  return *this;
}

StyledLine& StyledLine::padTo(std::size_t width, TextStyle style) {
  if (_width < width) append(std::string(width - _width, ' '), style);
  return *this;
}

StyledLine StyledLine::fitted(std::size_t width) const {
  if (_width <= width) return *this;
  StyledLine result;
  for (const Piece& piece : _pieces) {
    const std::size_t left = width - result._width;
    const std::size_t needed = textWidth(piece.text);
    // A piece that fills the line to its end leaves no cell for the "…" of what follows.
    const bool last = needed >= left;
    result.append(last ? fitText(piece.text + " ", left) : piece.text, piece.style);
    if (last) break;
  }
  return result;
}

std::string StyledLine::plainText() const {
  std::string result;
  for (const Piece& piece : _pieces) result += piece.text;
  result.erase(result.find_last_not_of(' ') + 1);
  return result;
}

std::string StyledLine::terminalText(bool colour) const {
  std::string result;
  for (const Piece& piece : _pieces) {
    const std::string_view begin = attributes(piece.style, colour);
    result += begin;
    result += piece.text;
    if (!begin.empty()) result += kResetAttributes;
  }
  return result;
}

}  // namespace kestro
