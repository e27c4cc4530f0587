// SPDX-License-Identifier: MIT
// Whole dB of a linear Ec/N0 as the baseband reports it. A table, not a formula: its irregular
// steps, the two rows of -31 and the 0 for very small values are the table's own.
#pragma once

#include <array>
#include <cstdint>

namespace kestro {

/// The values above `above`, up to the row before.
struct EcnoRow {
  std::uint32_t above;
  std::int16_t decibels;
};

/// From here on: 0 dB. So are the values that no row is below.
inline constexpr std::uint32_t kEcnoCeiling = 524288;

inline constexpr std::array kEcnoTable = {
    EcnoRow{417647, -1}, EcnoRow{331808, -2}, EcnoRow{263624, -3}, EcnoRow{209463, -4},
    EcnoRow{166441, -5}, EcnoRow{132268, -6}, EcnoRow{105123, -7}, EcnoRow{83562, -8},
    EcnoRow{66435, -9},  EcnoRow{52830, -10}, EcnoRow{42023, -11}, EcnoRow{33440, -12},
    EcnoRow{26621, -13}, EcnoRow{21205, -14}, EcnoRow{16903, -15}, EcnoRow{13486, -16},
    EcnoRow{10771, -17}, EcnoRow{8615, -18},  EcnoRow{6902, -19},  EcnoRow{5542, -20},
    EcnoRow{4461, -21},  EcnoRow{3603, -22},  EcnoRow{2921, -23},  EcnoRow{2240, -24},
    EcnoRow{1949, -25},  EcnoRow{1607, -26},  EcnoRow{1336, -27},  EcnoRow{1120, -28},
    EcnoRow{949, -29},   EcnoRow{813, -30},   EcnoRow{756, -31},   EcnoRow{705, -31},
};

}  // namespace kestro
