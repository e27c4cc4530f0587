// SPDX-License-Identifier: MIT
// kestro-extcap: answers Wireshark's questions about its interfaces, and captures for it.
#pragma once

#include "Options/CommandRow.h"
#include "Platform/Bundle.h"

namespace kestro {

/// The program's rows. Wireshark starts it once for each question, and for each capture.
[[nodiscard]] CommandRow extcapProgram(const Bundle& bundle);

/// Does what the arguments ask for; the exit status.
[[nodiscard]] int runExtcap(int argumentCount, const char* const* arguments);

}  // namespace kestro
