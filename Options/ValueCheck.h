// SPDX-License-Identifier: MIT
// How arguments give values to options, seen before they are read: a parser takes what stands next
// for a value that is missing.
#pragma once

#include <span>
#include <string>

#include "Options/CommandRow.h"

namespace kestro {

/// The first thing that is wrong, as one line: an option without the value that it needs ("--name",
/// with nothing or another option behind it, or "--name="), or a flag with one. Empty when nothing
/// is. `arguments` are those behind the program's name.
[[nodiscard]] std::string valueProblem(const CommandRow& program,
                                       std::span<const char* const> arguments);

}  // namespace kestro
