// SPDX-License-Identifier: MIT
// How the simulated network of GSM and UMTS numbers its cells, whoever plays it.
#pragma once

#include "Sources/World/RadioWorld.h"

namespace kestro {

/// The number of a UMTS cell's primary scrambling code.
[[nodiscard]] inline unsigned scramblingCode(const SimulatedCell& cell) {
  return 24 * cell.site + 8 * cell.sector + 5;
}

[[nodiscard]] inline unsigned umtsCellId(const SimulatedCell& cell) {
  return 20'000 + 10 * cell.site + cell.sector;
}

[[nodiscard]] inline unsigned gsmCellId(const SimulatedCell& cell) {
  return 40'000 + 10 * cell.site + cell.sector;
}

}  // namespace kestro
