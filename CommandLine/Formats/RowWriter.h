// SPDX-License-Identifier: MIT
// Rows of the same columns, as a table or for programs, one class a format.
#pragma once

#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "CommandLine/Output.h"

namespace kestro {

struct RowColumn {
  std::string_view name;     ///< for programs: "level_median"
  std::string_view heading;  ///< of the table; empty: the table leaves the column out
};

/// A text, a finite number, or nothing.
using RowField = std::variant<std::monostate, std::string, std::int64_t, double>;

/// Writes the columns once, then row after row. A row that is taken is written before long: the
/// output's length costs no memory.
class RowWriter {
 public:
  RowWriter() = default;
  virtual ~RowWriter() = default;
  RowWriter(const RowWriter&) = delete;
  RowWriter& operator=(const RowWriter&) = delete;

  /// The columns must be constants.
  virtual void begin(std::span<const RowColumn> columns) = 0;
  /// As many fields as there are columns.
  virtual void row(std::span<const RowField> fields) = 0;
  virtual void finish() = 0;
};

/// A format's name on the command line, what the help says of it, and its writer.
struct RowFormat {
  std::string_view name;
  std::string_view help;
  std::unique_ptr<RowWriter> (*makeWriter)(Output& output);
};

/// One row as an object on a line of its own.
[[nodiscard]] std::string jsonLineOf(std::span<const RowColumn> columns,
                                     std::span<const RowField> fields);

/// All formats, the default first: table, csv, json.
[[nodiscard]] const std::vector<RowFormat>& rowFormats();

/// The writer of a format in that list.
[[nodiscard]] std::unique_ptr<RowWriter> makeRowWriter(std::string_view format, Output& output);

}  // namespace kestro
