// SPDX-License-Identifier: MIT
// Positions in the sentences of GNSS receivers.
#pragma once

#include <optional>
#include <string_view>

#include "Platform/PositionService.h"

namespace kestro {

/// The position of the last valid RMC sentence (with speed and course), else of the last valid GGA
/// sentence (with the altitude), among sentences that are separated by line ends. One with a wrong
/// checksum is passed over.
[[nodiscard]] std::optional<PositionFix> nmeaPosition(std::string_view sentences);

}  // namespace kestro
