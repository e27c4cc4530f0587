// SPDX-License-Identifier: MIT
// A display tree as lines of text.
#pragma once

#include <cstddef>
#include <limits>
#include <vector>

#include "CommandLine/Formats/StyledLine.h"
#include "Model/KestroModelNode.h"

namespace kestro {

/// Lines that belong together: a section with its heading, or neighbouring values without one.
using LineBlock = std::vector<StyledLine>;

/// A width that no line reaches.
inline constexpr std::size_t kUnlimitedWidth = std::numeric_limits<std::size_t>::max() / 2;

/// The root's children from top to bottom, one block for each section and for each run of values
/// between sections. Sections indent what they hold; the values of one section stand in a column;
/// an array of rows is a table when it fits. No line is wider than `width`: longer ones are cut
/// with "…".
///
/// Values that are not in `previous`, the tree of the last refresh, or were different there, have
/// the style Changed; without a previous tree nothing has.
[[nodiscard]] std::vector<LineBlock> layoutTree(const KestroModelNode& root,
                                                const KestroModelNode* previous,
                                                std::size_t width = kUnlimitedWidth);

}  // namespace kestro
