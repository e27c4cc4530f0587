// SPDX-License-Identifier: MIT
// The session bus's signal for changed preferences.
#pragma once

#include <string>

#include "Platform/Result.h"

namespace kestro {

/// Emits org.kestro.Preferences1.Changed(domain, key) from /org/kestro/Preferences on the session
/// bus and waits, for at most a second, until the bus has it. Fails when there is no session bus or
/// it does not answer; starts none.
[[nodiscard]] Result<void> sendPreferenceChanged(const std::string& domain, const std::string& key);

}  // namespace kestro
