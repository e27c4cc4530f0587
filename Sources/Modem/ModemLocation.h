// SPDX-License-Identifier: MIT
// What a modem answers to GetLocation.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/BusValue.h"
#include "Platform/PositionService.h"
#include "Sources/Modem/BusFaults.h"

namespace kestro {

/// The cell that serves, as far as it is known.
struct LocationCell {
  std::string countryCode;
  std::string networkCode;
  std::optional<std::uint64_t> locationArea;
  std::optional<std::uint64_t> cell;
  std::optional<std::uint64_t> trackingArea;
};

struct ModemLocation {
  std::optional<LocationCell> cell;
  std::optional<PositionFix> fix;
};

/// Takes the answer apart: "MCC,MNC,LAC,CI,TAC" in hexadecimal, positions as degrees, else as NMEA
/// sentences. An area or cell of 0 stands for one that the modem does not know.
[[nodiscard]] ModemLocation locationIn(const std::vector<BusValue>& answer, BusFaults& faults);

}  // namespace kestro
