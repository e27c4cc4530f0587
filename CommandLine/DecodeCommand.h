// SPDX-License-Identifier: MIT
// kestro-cli decode: a recorded capture as displays.
#pragma once

#include "CommandLine/Command.h"

namespace kestro {

[[nodiscard]] Command addDecodeCommand(CLI::App& program);

}  // namespace kestro
