// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/ColumnArrangement.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <optional>
#include <string_view>

namespace kestro {
namespace {

constexpr std::string_view kColumnSeparator = " │ ";
constexpr std::size_t kSeparatorWidth = 3;

/// Narrower columns would cut more than they show.
constexpr std::size_t kMinimumColumnWidth = 38;

using Columns = std::vector<LineBlock>;

std::size_t maximumColumnCount(std::size_t width) {
  return std::max<std::size_t>(1,
                               (width + kSeparatorWidth) / (kMinimumColumnWidth + kSeparatorWidth));
}

std::size_t columnWidth(std::size_t width, std::size_t count) {
  return (width + kSeparatorWidth) / count - kSeparatorWidth;
}

/// Whole blocks with `gap` empty lines between them; absent when they need more columns.
std::optional<Columns> packBlocks(const std::vector<LineBlock>& blocks, std::size_t count,
                                  std::size_t height, std::size_t gap) {
  Columns columns(1);
  for (const LineBlock& block : blocks) {
    if (block.size() > height) return std::nullopt;
    const std::size_t before = columns.back().empty() ? 0 : gap;
    if (columns.back().size() + before + block.size() > height) {
      if (columns.size() == count) return std::nullopt;
      columns.emplace_back();
    } else {
      columns.back().resize(columns.back().size() + before);
    }
    std::ranges::copy(block, std::back_inserter(columns.back()));
  }
  return columns;
}

std::size_t countLines(const std::vector<LineBlock>& blocks) {
  std::size_t result = 0;
  for (const LineBlock& block : blocks) result += block.size();
  return result;
}

/// All lines in order, broken wherever a column ends; what exceeds the columns is counted instead.
Columns flowBlocks(const std::vector<LineBlock>& blocks, std::size_t count, std::size_t height) {
  Columns columns;
  for (const LineBlock& block : blocks) {
    for (const StyledLine& line : block) {
      if (columns.empty() || columns.back().size() == height) {
        if (columns.size() == count) break;
        columns.emplace_back();
      }
      columns.back().push_back(line);
    }
  }
  if (const std::size_t total = countLines(blocks); total > count * height) {
    const std::size_t hidden = total - count * height + 1;
    columns.back().back() = StyledLine().append(
        fmt::format("… {} more {}", hidden, hidden == 1 ? "line" : "lines"), TextStyle::Faint);
  }
  return columns;
}

std::vector<StyledLine> joinColumns(const Columns& columns, std::size_t width) {
  std::size_t height = 0;
  for (const LineBlock& column : columns) height = std::max(height, column.size());
  std::vector<StyledLine> result(height);
  for (std::size_t row = 0; row < height; ++row) {
    for (std::size_t i = 0; i < columns.size(); ++i) {
      if (i > 0) result[row].append(kColumnSeparator, TextStyle::Faint);
      if (row < columns[i].size()) result[row].append(columns[i][row].fitted(width));
      if (i + 1 < columns.size()) result[row].padTo(i * (width + kSeparatorWidth) + width);
    }
  }
  return result;
}

}  // namespace

std::vector<StyledLine> arrangeInColumns(const BlockMaker& makeBlocks, std::size_t width,
                                         std::size_t height) {
  if (height == 0) return {};
  const std::size_t maximum = maximumColumnCount(width);
  std::vector<std::vector<LineBlock>> layouts;
  for (std::size_t count = 1; count <= maximum; ++count) {
    layouts.push_back(makeBlocks(columnWidth(width, count)));
    if (const auto columns = packBlocks(layouts.back(), count, height, 1)) {
      return joinColumns(*columns, columnWidth(width, count));
    }
  }
  for (std::size_t count = 1; count <= maximum; ++count) {
    if (const auto columns = packBlocks(layouts[count - 1], count, height, 0)) {
      return joinColumns(*columns, columnWidth(width, count));
    }
  }
  std::size_t best = 1;
  const auto hidden = [&](std::size_t count) {
    const std::size_t total = countLines(layouts[count - 1]);
    return total - std::min(total, count * height);
  };
  for (std::size_t count = 2; count <= maximum; ++count) {
    if (hidden(count) < hidden(best)) best = count;
  }
  return joinColumns(flowBlocks(layouts[best - 1], best, height), columnWidth(width, best));
}

}  // namespace kestro
