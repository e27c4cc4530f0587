// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/RowTable.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "CommandLine/Formats/DisplayText.h"

namespace kestro {
namespace {

constexpr std::string_view kGap = "  ";

std::string shownField(const RowField& field) {
  if (const auto* text = std::get_if<std::string>(&field)) return displayText(*text);
  if (const auto* whole = std::get_if<std::int64_t>(&field)) return fmt::format("{}", *whole);
  // Levels have steps of a quarter and an eighth; more digits would not be read.
  if (const auto* real = std::get_if<double>(&field)) return fmt::format("{:.2f}", *real);
  return {};
}

bool isNumberField(const RowField& field) {
  return std::holds_alternative<std::int64_t>(field) || std::holds_alternative<double>(field);
}

}  // namespace

void RowTable::row(std::span<const RowField> fields) {
  TableRow row;
  for (const RowField& field : fields) row.push_back({shownField(field), isNumberField(field)});
  if (!_widths.empty()) return writeLine(row);
  _firstRows.push_back(std::move(row));
  if (_firstRows.size() == kRowsThatCount) writeFirstRows();
}

void RowTable::writeFirstRows() {
  if (!_widths.empty()) return;
  _widths.resize(_columns.size());
  _isNumeric.resize(_columns.size());
  TableRow headings;
  for (std::size_t i = 0; i < _columns.size(); ++i) {
    headings.push_back({std::string(_columns[i].heading)});
    for (const TableRow& row : _firstRows) {
      _widths[i] = std::max(_widths[i], textWidth(row[i].text));
      _isNumeric[i] = _isNumeric[i] || row[i].isNumber;
    }
    if (_columns[i].heading.empty()) _widths[i] = 0;
    if (_widths[i] > 0) _widths[i] = std::max(_widths[i], _columns[i].heading.size());
  }
  const std::vector<TableRow> rows = std::exchange(_firstRows, {});
  if (!rows.empty()) writeLine(headings);
  for (const TableRow& row : rows) writeLine(row);
}

void RowTable::writeLine(const TableRow& row) {
  std::string line;
  for (std::size_t i = 0; i < row.size(); ++i) {
    if (_widths[i] == 0) continue;
    if (!line.empty()) line += kGap;
    const std::size_t width = textWidth(row[i].text);
    const std::string padding(_widths[i] > width ? _widths[i] - width : 0, ' ');
    line += _isNumeric[i] ? padding + row[i].text : row[i].text + padding;
  }
  line.erase(line.find_last_not_of(' ') + 1);
  _output.write(line + "\n");
}

}  // namespace kestro
