// SPDX-License-Identifier: MIT
// kestro-cli record: the log channel as a capture.
#pragma once

#include "CommandLine/Commands/Command.h"

namespace kestro {

[[nodiscard]] Command addRecordCommand(CLI::App& program);

}  // namespace kestro
