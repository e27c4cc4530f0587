// SPDX-License-Identifier: MIT
// The numbers in a drive-test row.
#pragma once

#include <cstdint>
#include <optional>

#include "Sources/DriveTestLog.h"

namespace kestro {

/// The column's number; absent when the log has not had one yet, or has no number there.
[[nodiscard]] std::optional<double> numberIn(const DriveTestRow& row, DriveTestColumn column);

/// The column's whole number in base 10 or 16; absent likewise, and when 32 bits cannot hold it.
[[nodiscard]] std::optional<std::uint32_t> integerIn(const DriveTestRow& row,
                                                     DriveTestColumn column, int base);

}  // namespace kestro
