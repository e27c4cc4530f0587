// SPDX-License-Identifier: MIT
// kestro-cli codes: every log code with its sections and keys.
#pragma once

#include "CommandLine/Commands/Command.h"

namespace kestro {

[[nodiscard]] Command addCodesCommand(CLI::App& program);

}  // namespace kestro
