// SPDX-License-Identifier: MIT
// The sections of a modem's messages that are read from its properties.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "Platform/PropertyList.h"
#include "Sources/Modem/ModemFollower.h"

namespace kestro {

/// What a modem is and does now. `isPersonal` shows identities whole, here and below.
void addModem(const ModemFollower& follower, bool isPersonal, Dictionary& mode);

/// The radios' measurements, the newest radio's first; a name that two radios have is that of the
/// first one alone, the others' have the radio before it.
void addQuality(const ModemFollower& follower, Dictionary& quality);

void addRegistration(const ModemFollower& follower, Dictionary& registration);
void addSim(const ModemFollower& follower, bool isPersonal, Dictionary& sim);

/// One dictionary a bearer.
void addConnections(const ModemFollower& follower, bool isPersonal, Array& connections);

/// "1: Example Model X, disabled" for every modem but the one that is followed.
[[nodiscard]] std::vector<std::string> otherModems(const ModemFollower& follower);

/// A modem's maker and model, as far as it says them.
[[nodiscard]] std::string modelText(const ModemObjects& objects, const std::string& path);

}  // namespace kestro
