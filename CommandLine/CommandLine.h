// SPDX-License-Identifier: MIT
// The program kestro-cli.
#pragma once

#include "Options/CommandRow.h"
#include "Platform/Bundle.h"

namespace kestro {

/// The program's rows; the version is the bundle's, which must live as long.
[[nodiscard]] CommandRow commandLineProgram(const Bundle& bundle);

/// Does what the arguments ask for and returns the process's exit status, an ExitStatus.
[[nodiscard]] int runCommandLine(int argumentCount, const char* const* arguments);

}  // namespace kestro
