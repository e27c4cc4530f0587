// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/JsonWriter.h"

#include <fmt/format.h>

#include <iterator>

#include "CommandLine/Formats/DisplayText.h"

namespace kestro {
namespace {

constexpr std::size_t kJsonIndentation = 2;

bool needsEscape(char character) noexcept {
  return static_cast<unsigned char>(character) < 0x20 || character == '"' || character == '\\';
}

void appendEscape(std::string& output, char character) {
  switch (character) {
    case '\n':
      output += "\\n";
      break;
    case '\r':
      output += "\\r";
      break;
    case '\t':
      output += "\\t";
      break;
    case '"':
    case '\\':
      output += '\\';
      output += character;
      break;
    default:
      fmt::format_to(std::back_inserter(output), "\\u{:04x}", static_cast<unsigned>(character));
  }
}

}  // namespace

void JsonWriter::key(std::string_view name) {
  separate();
  appendQuoted(name);
  _output += _form == Form::Indented ? ": " : ":";
  _afterKey = true;
}

void JsonWriter::text(std::string_view value) {
  separate();
  appendQuoted(value);
}

void JsonWriter::number(std::uint64_t value) { word(fmt::format_int(value).c_str()); }
void JsonWriter::integer(std::int64_t value) { word(fmt::format_int(value).c_str()); }
void JsonWriter::real(double value) { word(fmt::format("{}", value)); }
void JsonWriter::boolean(bool value) { word(value ? "true" : "false"); }

void JsonWriter::word(std::string_view text) {
  separate();
  _output += text;
}

void JsonWriter::begin(char bracket) {
  separate();
  _output += bracket;
  ++_depth;
  _isFirst = true;
}

void JsonWriter::end(char bracket) {
  --_depth;
  if (!_isFirst) breakLine();
  _output += bracket;
  _isFirst = false;
}

void JsonWriter::separate() {
  if (_afterKey) {
    _afterKey = false;
    return;
  }
  if (_depth == 0) return;
  if (!_isFirst) _output += ',';
  _isFirst = false;
  breakLine();
}

void JsonWriter::breakLine() {
  if (_form == Form::Compact) return;
  _output += '\n';
  _output.append(kJsonIndentation * _depth, ' ');
}

void JsonWriter::appendQuoted(std::string_view value) {
  if (validUtf8Prefix(value) != value.size()) return appendQuoted(validUtf8(value));
  _output += '"';
  std::size_t done = 0;
  for (std::size_t i = 0; i < value.size(); ++i) {
    if (!needsEscape(value[i])) continue;
    _output += value.substr(done, i - done);
    appendEscape(_output, value[i]);
    done = i + 1;
  }
  _output += value.substr(done);
  _output += '"';
}

}  // namespace kestro
