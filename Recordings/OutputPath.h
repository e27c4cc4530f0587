// SPDX-License-Identifier: MIT
// Where a recording or what is made of one may be written.
#pragma once

#include <span>
#include <string>

#include "Platform/Result.h"

namespace kestro {

/// Refuses an output that is one of the inputs: the same regular file, whatever their names and
/// links. The input "-" is standard input. Inputs that do not exist are none. Ask before the output
/// is created, as that empties it.
[[nodiscard]] Result<void> checkOutputIsNoInput(const std::string& output,
                                                std::span<const std::string> inputs);

/// The path that means standard output.
inline constexpr const char* kStandardOutputPath = "-";

/// What messages call an output.
[[nodiscard]] std::string outputName(const std::string& path);

/// Refuses an output that could not be created now: its folder is missing or may not be written to,
/// it is a folder, or an existing file may not be written to. Creates nothing.
[[nodiscard]] Result<void> checkOutputCanBeCreated(const std::string& path);

}  // namespace kestro
