// SPDX-License-Identifier: MIT
// kestro-cli explain: where every value of a recorded packet comes from.
#pragma once

#include "CommandLine/Commands/Command.h"

namespace kestro {

[[nodiscard]] Command addExplainCommand(CLI::App& program);

}  // namespace kestro
