// SPDX-License-Identifier: MIT
#include "CommandLine/Terminal/TerminalView.h"

#include <algorithm>
#include <initializer_list>
#include <iterator>
#include <string_view>
#include <utility>

#include "CommandLine/Formats/ColumnArrangement.h"
#include "CommandLine/Formats/DisplayText.h"
#include "CommandLine/Formats/TreeLayout.h"

namespace kestro {
namespace {

constexpr std::string_view kName = "Kestro";

std::string joined(std::initializer_list<std::string_view> parts) {
  std::string text;
  for (const std::string_view part : parts) {
    if (part.empty()) continue;
    text += text.empty() ? " " : " · ";
    text += displayText(part);
  }
  return text;
}

/// The longest title that leaves the status its room; empty when none does.
std::string titleWithin(const TerminalViewContents& contents, std::size_t columns) {
  const std::string_view technology = contents.technology;
  const std::string_view source = contents.source;
  for (std::string& title : std::vector<std::string>{
           joined({kName, technology, source, contents.place}), joined({kName, technology, source}),
           joined({technology, source}), joined({kName, technology}), joined({kName})}) {
    if (textWidth(title) <= columns) return std::move(title);
  }
  return "";
}

/// " title      status " over the whole width.
StyledLine titleLine(const TerminalViewContents& contents, std::size_t columns) {
  const std::string status = displayText(contents.status) + " ";
  const std::size_t needed = textWidth(status) + 2;
  StyledLine line;
  if (needed <= columns) line.append(titleWithin(contents, columns - needed), TextStyle::Bar);
  if (line.width() + textWidth(status) < columns) {
    line.padTo(columns - textWidth(status), TextStyle::Bar);
  }
  return line.append(status, TextStyle::Bar).fitted(columns);
}

/// The same text, faint.
StyledLine faint(const StyledLine& line) {
  StyledLine result;
  for (const StyledLine::Piece& piece : line.pieces()) {
    result.append(piece.text, TextStyle::Faint);
  }
  return result;
}

/// The notice in as many lines as it takes, cut between words.
std::vector<StyledLine> noticeLines(std::string_view notice, std::size_t columns) {
  std::vector<StyledLine> lines;
  StyledLine line;
  const std::string text = displayText(notice);
  for (std::size_t begin = 0; begin < text.size();) {
    const std::size_t end = std::min(text.find(' ', begin), text.size());
    const std::string word = " " + text.substr(begin, end - begin);
    if (line.width() > 0 && line.width() + textWidth(word) > columns) {
      lines.push_back(std::exchange(line, {}));
    }
    line.append(word, TextStyle::Key);
    begin = end + 1;
  }
  if (line.width() > 0) lines.push_back(line.fitted(columns));
  return lines;
}

}  // namespace

std::vector<StyledLine> terminalView(const TerminalViewContents& contents, TerminalSize size) {
  if (size.rows == 0 || size.columns == 0) return {};
  std::vector<StyledLine> lines{titleLine(contents, size.columns)};
  for (StyledLine& line : noticeLines(contents.notice, size.columns)) {
    if (lines.size() < size.rows) lines.push_back(std::move(line));
  }
  if (contents.tree == nullptr || lines.size() >= size.rows) return lines;
  const auto makeBlocks = [&](std::size_t width) {
    return layoutTree(*contents.tree, contents.previous, width);
  };
  std::vector<StyledLine> body =
      arrangeInColumns(makeBlocks, size.columns, size.rows - lines.size());
  if (!contents.isRenewed) std::ranges::transform(body, body.begin(), faint);
  std::move(body.begin(), body.end(), std::back_inserter(lines));
  return lines;
}

}  // namespace kestro
