// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/RowWriter.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>

#include "CommandLine/Formats/CsvField.h"
#include "CommandLine/Formats/JsonWriter.h"
#include "CommandLine/Formats/RowTable.h"

namespace kestro {
namespace {

template <class... Functions>
struct Overloaded : Functions... {
  using Functions::operator()...;
};
template <class... Functions>
Overloaded(Functions...) -> Overloaded<Functions...>;

class RowCsv : public RowWriter {
 public:
  explicit RowCsv(Output& output) : _output(output) {}

  void begin(std::span<const RowColumn> columns) override {
    _line.clear();
    for (const RowColumn& column : columns) appendField(RowField(std::string(column.name)));
    endLine();
  }
  void row(std::span<const RowField> fields) override {
    _line.clear();
    for (const RowField& field : fields) appendField(field);
    endLine();
  }
  void finish() override {}

 private:
  void appendField(const RowField& field) {
    if (!_isFirst) _line += ',';
    _isFirst = false;
    std::visit(
        Overloaded{[](std::monostate) {},
                   [&](const std::string& text) { appendCsvField(_line, text); },
                   [&](auto number) { fmt::format_to(std::back_inserter(_line), "{}", number); }},
        field);
  }
  void endLine() {
    _line += '\n';
    _isFirst = true;
    _output.write(_line);
  }

  Output& _output;
  std::string _line;
  bool _isFirst = true;
};

void appendMember(JsonWriter& writer, const RowColumn& column, const RowField& field) {
  if (std::holds_alternative<std::monostate>(field)) return;
  writer.key(column.name);
  std::visit(Overloaded{[](std::monostate) {}, [&](const std::string& text) { writer.text(text); },
                        [&](std::int64_t number) { writer.integer(number); },
                        [&](double number) { writer.real(number); }},
             field);
}

void appendObject(std::string& text, std::span<const RowColumn> columns,
                  std::span<const RowField> fields) {
  JsonWriter writer(text);
  writer.beginObject();
  for (std::size_t i = 0; i < fields.size(); ++i) appendMember(writer, columns[i], fields[i]);
  writer.endObject();
}

class RowJson : public RowWriter {
 public:
  explicit RowJson(Output& output) : _output(output) {}

  void begin(std::span<const RowColumn> columns) override { _columns = columns; }
  void row(std::span<const RowField> fields) override {
    std::string text = _isFirst ? "[\n" : ",\n";
    _isFirst = false;
    appendObject(text, _columns, fields);
    _output.write(text);
  }
  void finish() override { _output.write(_isFirst ? "[]\n" : "\n]\n"); }

 private:
  Output& _output;
  std::span<const RowColumn> _columns;
  bool _isFirst = true;
};

template <class Writer>
std::unique_ptr<RowWriter> makeRows(Output& output) {
  return std::make_unique<Writer>(output);
}

}  // namespace

std::string jsonLineOf(std::span<const RowColumn> columns, std::span<const RowField> fields) {
  std::string line;
  appendObject(line, columns, fields);
  line += '\n';
  return line;
}

const std::vector<RowFormat>& rowFormats() {
  static const std::vector<RowFormat> formats = {
      {"table", "for people", makeRows<RowTable>},
      {"csv", "all columns, their names in the first line; no value is an empty field",
       makeRows<RowCsv>},
      {"json", "an array with an object a row; no value is no member", makeRows<RowJson>},
  };
  return formats;
}

std::unique_ptr<RowWriter> makeRowWriter(std::string_view format, Output& output) {
  return std::ranges::find(rowFormats(), format, &RowFormat::name)->makeWriter(output);
}

}  // namespace kestro
