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

}  // namespace kestro
