// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/TableLayout.h"

#include <algorithm>
#include <string>
#include <vector>

#include "CommandLine/Formats/DisplayText.h"

namespace kestro {
namespace {

constexpr std::size_t kColumnGap = 2;

/// More different names than this make no readable table, and cost rows times names to look up.
constexpr std::size_t kMaximumColumns = 64;

struct Column {
  const std::string* name;  ///< the values' display name, which the tree owns
  std::string heading;
  std::size_t width;
  bool isFlushRight = true;
  std::size_t lastRow = 0;  ///< the number, from 1, of the last row with a value
};

bool isDigit(char character) noexcept { return character >= '0' && character <= '9'; }

/// Whether a value begins as a number does: "-71 dBm".
bool looksNumeric(std::string_view text) noexcept {
  if (!text.empty() && (text[0] == '-' || text[0] == '+')) text.remove_prefix(1);
  return !text.empty() && isDigit(text[0]);
}

bool isRow(const KestroModelNode& node) {
  return node.childNodes() != nullptr && !node.childNodes()->empty() &&
         std::ranges::all_of(*node.childNodes(), [](const NodePointer& child) {
           return child->childNodes() == nullptr;
         });
}

/// Where the column of this name stands, looking at `hint` first; the count when there is none.
std::size_t findColumn(const std::vector<Column>& columns, const std::string& name,
                       std::size_t hint) {
  if (hint < columns.size() && *columns[hint].name == name) return hint;
  const auto found =
      std::ranges::find_if(columns, [&](const Column& column) { return *column.name == name; });
  return static_cast<std::size_t>(found - columns.begin());
}

/// Enters row number `row` (from 1) into the columns; false when it does not fit into a table.
bool measureRow(std::vector<Column>& columns, const KestroModelNode& node, std::size_t row) {
  for (std::size_t i = 0; i < node.childNodes()->size(); ++i) {
    const KestroModelNode& value = *(*node.childNodes())[i];
    const std::size_t index = findColumn(columns, value.displayName(), i);
    if (index == columns.size()) {
      if (index == kMaximumColumns) return false;
      const std::string heading = displayText(value.displayName());
      columns.push_back({&value.displayName(), heading, textWidth(heading)});
    }
    Column& column = columns[index];
    if (column.lastRow == row) return false;  // two values of one name cannot share a cell
    const std::string text = displayText(*value.value());
    column.width = std::max(column.width, textWidth(text));
    column.isFlushRight = column.isFlushRight && (text.empty() || looksNumeric(text));
    column.lastRow = row;
  }
  return true;
}

/// The columns of a table with these rows; empty when they make none.
std::vector<Column> measureTable(const std::vector<NodePointer>& rows) {
  std::vector<Column> columns;
  for (std::size_t i = 0; i < rows.size(); ++i) {
    if (!isRow(*rows[i]) || !measureRow(columns, *rows[i], i + 1)) return {};
  }
  return columns;
}

void appendCell(StyledLine& line, std::string_view text, TextStyle style, std::size_t width,
                bool isFlushRight) {
  const std::size_t end = line.width() + width;
  if (isFlushRight) line.padTo(end - textWidth(text));
  line.append(text, style).padTo(end);
}

class Table {
 public:
  Table(const NodePair& array, std::vector<Column> columns, std::size_t indent)
      : _array(array),
        _columns(std::move(columns)),
        _indent(indent),
        _numberWidth(std::to_string(array.childCount() - 1).size()) {}

  [[nodiscard]] std::size_t width() const {
    std::size_t result = _indent + _numberWidth;
    for (const Column& column : _columns) result += kColumnGap + column.width;
    return result;
  }

  [[nodiscard]] LineBlock lines() const {
    LineBlock result{heading()};
    for (std::size_t i = 0; i < _array.childCount(); ++i) result.push_back(row(_array.child(i)));
    return result;
  }

 private:
  [[nodiscard]] StyledLine heading() const {
    StyledLine line = begin("#");
    for (const Column& column : _columns) {
      line.padTo(line.width() + kColumnGap);
      appendCell(line, column.heading, TextStyle::Key, column.width, column.isFlushRight);
    }
    return line;
  }

  [[nodiscard]] StyledLine row(const NodePair& node) const {
    std::vector<std::size_t> values(_columns.size(), node.childCount());
    for (std::size_t i = 0; i < node.childCount(); ++i) {
      values[findColumn(_columns, (*node.node().childNodes())[i]->displayName(), i)] = i;
    }
    StyledLine line = begin(displayText(node.node().displayName()));
    for (std::size_t i = 0; i < _columns.size(); ++i) {
      line.padTo(line.width() + kColumnGap);
      appendValue(line, node, values[i], _columns[i]);
    }
    return line;
  }

  static void appendValue(StyledLine& line, const NodePair& row, std::size_t index,
                          const Column& column) {
    if (index == row.childCount()) {
      line.padTo(line.width() + column.width);
      return;
    }
    const NodePair value = row.child(index);
    appendCell(line, displayText(*value.node().value()),
               value.isNewOrChanged() ? TextStyle::Changed : TextStyle::Plain, column.width,
               column.isFlushRight);
  }

  [[nodiscard]] StyledLine begin(std::string_view number) const {
    StyledLine line;
    line.padTo(_indent);
    appendCell(line, number, TextStyle::Faint, _numberWidth, true);
    return line;
  }

  const NodePair& _array;
  std::vector<Column> _columns;
  std::size_t _indent;
  std::size_t _numberWidth;
};

}  // namespace

std::optional<LineBlock> layoutTable(const NodePair& array, std::size_t indent, std::size_t width) {
  if (!array.node().isArray() || array.childCount() == 0) return std::nullopt;
  std::vector<Column> columns = measureTable(*array.node().childNodes());
  if (columns.empty()) return std::nullopt;
  const Table table(array, std::move(columns), indent);
  if (table.width() > width) return std::nullopt;
  return table.lines();
}

}  // namespace kestro
