// SPDX-License-Identifier: MIT
// An array of rows as a table.
#pragma once

#include <cstddef>
#include <optional>

#include "CommandLine/Formats/TreeLayout.h"
#include "Model/NodePair.h"

namespace kestro {

/// The array as a heading line and one line a row, indented by `indent` cells: the row's number,
/// then its values under their names, which stand in the order of their first appearance. Columns
/// of numbers are aligned at the right. Absent when the node is no array of dictionaries that hold
/// nothing but values, or when the table is wider than `width`.
[[nodiscard]] std::optional<LineBlock> layoutTable(const NodePair& array, std::size_t indent,
                                                   std::size_t width);

}  // namespace kestro
