// SPDX-License-Identifier: MIT
#include "CommandLine/Terminal/TerminalView.h"

#include <iterator>
#include <utility>

#include "CommandLine/Formats/ColumnArrangement.h"
#include "CommandLine/Formats/DisplayText.h"
#include "CommandLine/Formats/TreeLayout.h"

namespace kestro {
namespace {

/// " title      status " over the whole width.
StyledLine titleLine(const TerminalViewContents& contents, std::size_t columns) {
  const std::string title = " " + displayText(contents.title);
  const std::string status = displayText(contents.status) + " ";
  StyledLine line;
  if (textWidth(title) + 2 + textWidth(status) <= columns) line.append(title, TextStyle::Bar);
  if (line.width() + textWidth(status) < columns) {
    line.padTo(columns - textWidth(status), TextStyle::Bar);
  }
  return line.append(status, TextStyle::Bar).fitted(columns);
}

}  // namespace

std::vector<StyledLine> terminalView(const TerminalViewContents& contents, TerminalSize size) {
  if (size.rows == 0 || size.columns == 0) return {};
  std::vector<StyledLine> lines{titleLine(contents, size.columns)};
  if (contents.tree == nullptr) return lines;
  const auto makeBlocks = [&](std::size_t width) {
    return layoutTree(*contents.tree, contents.previous, width);
  };
  std::vector<StyledLine> body = arrangeInColumns(makeBlocks, size.columns, size.rows - 1);
  std::move(body.begin(), body.end(), std::back_inserter(lines));
  return lines;
}

}  // namespace kestro
