// SPDX-License-Identifier: MIT
// The exit status of kestro-cli.
#pragma once

namespace kestro {

enum ExitStatus : int {
  kExitDone = 0,
  kExitNothingDone = 1,  ///< one line on standard error says why
  kExitWrongUsage = 2,
  kExitPartlyDone = 3,  ///< some messages were not decoded, or not recorded; standard error says so
};

}  // namespace kestro
