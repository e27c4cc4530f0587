// SPDX-License-Identifier: MIT
// What kestro-cli tells whoever started it.
#pragma once

namespace kestro {

enum ExitStatus : int {
  kExitDone = 0,
  kExitNothingDone = 1,  ///< one line on standard error says why
  kExitWrongUsage = 2,
  kExitPartlyDone = 3,  ///< some messages were not decoded; each has its line on standard error
};

}  // namespace kestro
