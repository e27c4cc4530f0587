// SPDX-License-Identifier: MIT
// kestro-cli snapshot: snapshot files from captures, as text, and their packets.
#pragma once

#include "CommandLine/Commands/Command.h"

namespace kestro {

[[nodiscard]] Command addSnapshotCommand(CLI::App& program);

}  // namespace kestro
