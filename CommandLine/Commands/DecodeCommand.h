// SPDX-License-Identifier: MIT
// kestro-cli decode: a recorded capture as displays.
#pragma once

#include "CommandLine/Commands/Command.h"

namespace kestro {

[[nodiscard]] Command addDecodeCommand(CLI::App& program);

}  // namespace kestro
