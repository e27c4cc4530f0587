// SPDX-License-Identifier: MIT
// Cells and events as rows.
#pragma once

#include <span>
#include <string_view>
#include <vector>

#include "CommandLine/Formats/RowWriter.h"
#include "Measurements/Cells.h"
#include "Measurements/Event.h"

namespace kestro {

/// The columns of a cell's row, and of an event's. `input` names the input it is of; empty: there
/// is only one.
[[nodiscard]] std::span<const RowColumn> cellColumns();
[[nodiscard]] std::vector<RowField> fieldsOfCell(const Cell& cell, std::string_view input);
[[nodiscard]] std::span<const RowColumn> eventColumns();
[[nodiscard]] std::vector<RowField> fieldsOfEvent(const Event& event, std::string_view input);

}  // namespace kestro
