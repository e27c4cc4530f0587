// SPDX-License-Identifier: MIT
// kestro-cli watch: the live display.
#pragma once

#include "CommandLine/Commands/Command.h"

namespace kestro {

[[nodiscard]] Command addWatchCommand(CLI::App& program);

}  // namespace kestro
