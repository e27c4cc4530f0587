// SPDX-License-Identifier: MIT
// The program kestro-cli.
#pragma once

namespace kestro {

/// Does what the arguments ask for and returns the process's exit status, an ExitStatus.
[[nodiscard]] int runCommandLine(int argumentCount, const char* const* arguments);

}  // namespace kestro
