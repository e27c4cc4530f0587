// SPDX-License-Identifier: MIT
// One capture for Wireshark: what a log channel carries, into the pipe that Wireshark reads.
#pragma once

#include <string>

#include "Options/ProgramOptions.h"

namespace kestro {

/// Captures until asked to end, or until nobody reads the pipe any more; the exit status. What goes
/// wrong is told on standard error, which Wireshark shows.
[[nodiscard]] int captureForWireshark(const LiveOptions& options, const std::string& pipe);

}  // namespace kestro
