// SPDX-License-Identifier: MIT
// Blocks of lines in newspaper columns.
#pragma once

#include <cstddef>
#include <functional>
#include <vector>

#include "CommandLine/Formats/TreeLayout.h"

namespace kestro {

/// Makes the blocks for columns of a width; called at most once for each number of columns.
using BlockMaker = std::function<std::vector<LineBlock>(std::size_t width)>;

/// Arranges blocks within `width` cells and `height` lines, in as few columns of equal width as
/// hold them: with a line between blocks, else without, else with blocks broken at a column's end.
/// What still has no room is cut, and the last line says how many lines that were. Returns at most
/// `height` lines of at most `width` cells.
[[nodiscard]] std::vector<StyledLine> arrangeInColumns(const BlockMaker& makeBlocks,
                                                       std::size_t width, std::size_t height);

}  // namespace kestro
