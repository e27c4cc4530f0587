// SPDX-License-Identifier: MIT
// How it stands with a modem, and what would help.
#pragma once

#include <string>

#include "Sources/Modem/ModemFollower.h"

namespace kestro {

struct ModemStatus {
  std::string state;  ///< "registered", "ModemManager is not running"
  std::string help;   ///< what a user can do; empty where nothing is wrong
};

[[nodiscard]] ModemStatus statusOf(const ModemFollower& follower);

/// What this modem, or this user, does not get: "neighbour cells (the modem does not report them)";
/// empty when nothing is missing.
[[nodiscard]] std::string notReported(const ModemFollower& follower);

}  // namespace kestro
