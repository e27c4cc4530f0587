// SPDX-License-Identifier: MIT
// Rows as a table for people.
#pragma once

#include <span>
#include <string>
#include <vector>

#include "CommandLine/Formats/RowWriter.h"

namespace kestro {

/// The first rows say how wide the columns are, and which of them are empty and left out; a later
/// text that is longer moves what follows it on its line.
class RowTable : public RowWriter {
 public:
  static constexpr std::size_t kRowsThatCount = 1'000;

  explicit RowTable(Output& output) : _output(output) {}

  void begin(std::span<const RowColumn> columns) override { _columns = columns; }
  void row(std::span<const RowField> fields) override;
  void finish() override { writeFirstRows(); }

 private:
  struct TableCell {
    std::string text;
    bool isNumber = false;
  };
  using TableRow = std::vector<TableCell>;

  void writeFirstRows();
  void writeLine(const TableRow& row);

  Output& _output;
  std::span<const RowColumn> _columns;
  std::vector<TableRow> _firstRows;
  std::vector<std::size_t> _widths;  ///< 0: left out; empty before the first line
  std::vector<bool> _isNumeric;
};

}  // namespace kestro
