// SPDX-License-Identifier: MIT
// What the server says at its start.
#pragma once

#include <string>
#include <string_view>

#include "Platform/LogSourceState.h"

namespace kestro {

/// What it plays, under which name, and how to watch that: "playing simulation as LTE, under the
/// name TelephonyServer; watch it with `kestro` or `kestro-cli watch`".
[[nodiscard]] std::string announcement(const LogSourceState& source, std::string_view technology,
                                       std::string_view portName);

}  // namespace kestro
