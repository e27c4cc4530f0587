// SPDX-License-Identifier: MIT
// What is known of a modem as a message of the IFX channel.
#pragma once

#include <optional>
#include <string>

#include "Platform/Clock.h"
#include "Platform/PositionService.h"
#include "Sources/IFX/IFXMessage.h"
#include "Sources/Modem/ModemFollower.h"

namespace kestro {

/// Where the machine is, and who says so.
struct KnownPosition {
  std::optional<PositionFix> fix;
  std::string origin;  ///< "gpsd localhost:2947", or why there is no position
};

/// The whole display: Mode, Serving Cell, Radio Quality, Neighbour Cells, Registration, SIM, Data
/// Connections and Position. What the modem does not say is absent; what a user can do about it,
/// and which parts this modem does not report, stands in Mode. `isPersonal` shows identities whole.
[[nodiscard]] IFXMessage modemMessage(const ModemFollower& follower, const KnownPosition& position,
                                      bool isPersonal, Moment now, BusFaults& faults);

}  // namespace kestro
