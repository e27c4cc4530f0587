// SPDX-License-Identifier: MIT
// The window as a process: its platform, its demo, its signals and its end.
#pragma once

namespace kestro {

/// Runs the window until it is closed, the process is asked to end, or the picture that was asked
/// for is taken. The exit status: 0 done, 1 nothing could be done (with a line why), 2 wrong usage.
[[nodiscard]] int runProgram(int argumentCount, char** arguments);

}  // namespace kestro
