// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/LuaWriter.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>

namespace kestro {
namespace {

// Words of the language are no names of members.
constexpr std::string_view kWords[] = {"and",   "break", "do",       "else", "elseif", "end",
                                       "false", "for",   "function", "goto", "if",     "in",
                                       "local", "nil",   "not",      "or",   "repeat", "return",
                                       "then",  "true",  "until",    "while"};

}  // namespace

void LuaWriter::key(std::string_view name) {
  separate();
  const bool isWord = std::ranges::find(kWords, name) != std::end(kWords);
  auto end = std::back_inserter(_output);
  isWord ? fmt::format_to(end, R"(["{}"]=)", name) : fmt::format_to(end, "{}=", name);
  _afterKey = true;
}

void LuaWriter::text(std::string_view value) {
  separate();
  appendQuoted(value);
}

void LuaWriter::number(std::uint64_t value) { word(fmt::format_int(value).c_str()); }
void LuaWriter::integer(std::int64_t value) { word(fmt::format_int(value).c_str()); }
void LuaWriter::real(double value) { word(fmt::format("{}", value)); }
void LuaWriter::boolean(bool value) { word(value ? "true" : "false"); }

void LuaWriter::word(std::string_view text) {
  separate();
  _output += text;
}

void LuaWriter::begin() {
  const bool isElement = !_afterKey && _depth > 0;
  separate();
  if (isElement && _depth <= kBrokenDepth) _output += '\n';
  _output += '{';
  ++_depth;
  _isFirst = true;
}

void LuaWriter::end() {
  --_depth;
  _output += '}';
  _isFirst = false;
}

void LuaWriter::separate() {
  if (_afterKey) {
    _afterKey = false;
    return;
  }
  if (_depth == 0) return;
  if (!_isFirst) _output += ',';
  _isFirst = false;
}

void LuaWriter::appendQuoted(std::string_view value) {
  _output += '"';
  for (const char character : value) {
    if (static_cast<unsigned char>(character) < 0x20) {
      fmt::format_to(std::back_inserter(_output), "\\{:03}", static_cast<unsigned>(character));
      continue;
    }
    if (character == '"' || character == '\\') _output += '\\';
    _output += character;
  }
  _output += '"';
}

}  // namespace kestro
