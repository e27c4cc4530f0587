// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/ExplainTable.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>

#include "CommandLine/Formats/DisplayText.h"
#include "CommandLine/Formats/LayoutText.h"
#include "CommandLine/Formats/TimeText.h"
#include "Platform/PropertyListDescription.h"

namespace kestro {
namespace {

constexpr std::string_view kKeyIndentation = "  ";
constexpr std::string_view kPlaceColumnGap = "  ";
constexpr std::string_view kPastEnd = "(past the end)";

/// "cell 3", "cell", "3" or "".
std::string rowText(const ExplainedValue& value) {
  std::string text = displayText(value.list);
  if (value.row)
    fmt::format_to(std::back_inserter(text), "{}{}", text.empty() ? "" : " ", *value.row);
  return text;
}

/// The bytes in the packet's order; "--" for those past its end.
void appendBytes(std::string& text, ByteView packet, const ExplainedSource& source) {
  for (std::size_t i = source.offset; i < source.offset + source.width; ++i) {
    if (!text.empty()) text += ' ';
    if (i < packet.size()) {
      fmt::format_to(std::back_inserter(text), "{:02x}", packet[i]);
    } else {
      text += "--";
    }
  }
}

/// Which bits of the integer; "" for all of a little-endian one.
std::string bitsText(const ExplainedSource& source) {
  std::string text = source.isBigEndian ? "BE" : "";
  if (source.bitCount == 8 * source.width) return text;
  if (!text.empty()) text += ' ';
  fmt::format_to(std::back_inserter(text), "{}", source.firstBit);
  if (source.bitCount > 1) {
    fmt::format_to(std::back_inserter(text), "-{}", source.firstBit + source.bitCount - 1);
  }
  return text;
}

std::string shownText(const Value& value) {
  if (value.isNull()) return {};
  return displayText(value.isText() ? value.text() : describe(value));
}

}  // namespace

void ExplainTable::beginPacket(const PacketHead& head) {
  _packet = head.packet;
  _lineCount = 0;
  _section.clear();
  _row.clear();
  _text.clear();
  if (!_isFirst && !_style.isList) _text += '\n';
  _isFirst = false;
  auto end = std::back_inserter(_text);
  fmt::format_to(end, "Message {}  {}", head.message, isoTimeText(head.time));
  if (_style.hasTechnology) fmt::format_to(end, "  {}", head.technology);
  if (head.code) fmt::format_to(end, "  {}", logCodeText(*head.code));
  if (!head.name.empty()) fmt::format_to(end, " {}", head.name);
  fmt::format_to(end, "{} {} {}", head.name.empty() ? " " : ",", head.packet.size(),
                 head.packet.size() == 1 ? "byte" : "bytes");
  if (head.prefixLength > 0) fmt::format_to(end, " after a prefix of {}", head.prefixLength);
  _text += '\n';
}

void ExplainTable::value(const ExplainedValue& value) {
  Line& first = addLine();
  std::string section = displayText(value.section);
  std::string row = rowText(value);
  const bool isSameSection = section == _section;
  if (!isSameSection) first[kSection] = section;
  if (!isSameSection || row != _row) first[kRow] = row;
  _section = std::move(section);
  _row = std::move(row);
  first[kKey] = displayText(value.key);
  first[kText] = shownText(value.text);
  bool isPastEnd = false;
  for (std::size_t i = 0; i < value.sources.size(); ++i) {
    describePlace(value.sources[i], i == 0 ? _lines[_lineCount - 1] : addLine());
    isPastEnd = value.sources[i].isPastEnd;
    if (!isPastEnd) continue;
    std::string& text = _lines[_lineCount - 1][kText];
    if (!text.empty()) text += ' ';
    text += kPastEnd;
  }
}

ExplainTable::Line& ExplainTable::addLine() {
  if (_lineCount == _lines.size()) _lines.emplace_back();
  Line& line = _lines[_lineCount++];
  for (std::string& text : line) text.clear();
  return line;
}

void ExplainTable::describePlace(const ExplainedSource& source, Line& line) const {
  if (source.listKey.empty()) {
    line[kOffset] = fmt::to_string(source.offset);
    appendBytes(line[kBytes], _packet, source);
    line[kBits] = bitsText(source);
  } else {
    line[kBytes] = displayText(source.listKey);
  }
  if (source.isNumber) line[kRaw] = fmt::to_string(source.raw);
}

void ExplainTable::endPacket(std::string_view remark) {
  if (_lineCount > 0) appendTable();
  if (!remark.empty()) fmt::format_to(std::back_inserter(_text), "{}{}\n", kKeyIndentation, remark);
  _output.write(_text);
}

void ExplainTable::appendTable() {
  static const Line kHeadings = {"Section", "Row", "Key", "At", "Bytes", "Bits", "Raw", "Text"};
  std::array<std::size_t, kColumnCount> widths{};
  for (std::size_t line = 0; line < _lineCount; ++line) {
    for (std::size_t i = 0; i < kColumnCount; ++i) {
      widths[i] = std::max(widths[i], textWidth(_lines[line][i]));
    }
  }
  for (std::size_t i = 0; i < kColumnCount; ++i) {
    if (widths[i] > 0) widths[i] = std::max(widths[i], kHeadings[i].size());
  }
  appendLine(kHeadings, widths);
  for (std::size_t line = 0; line < _lineCount; ++line) appendLine(_lines[line], widths);
}

/// Columns that are empty in the whole table have no width, and are left out.
void ExplainTable::appendLine(const Line& line,
                              const std::array<std::size_t, kColumnCount>& widths) {
  std::string_view gap = kKeyIndentation;
  for (std::size_t i = 0; i < kColumnCount; ++i) {
    if (widths[i] == 0) continue;
    _text += gap;
    gap = kPlaceColumnGap;
    const std::size_t padding = widths[i] - textWidth(line[i]);
    const bool isNumber = i == kOffset || i == kRaw;
    if (isNumber) _text.append(padding, ' ');
    _text += line[i];
    if (!isNumber) _text.append(padding, ' ');
  }
  _text.erase(_text.find_last_not_of(' ') + 1);
  _text += '\n';
}

}  // namespace kestro
