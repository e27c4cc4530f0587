// SPDX-License-Identifier: MIT
// LTE packets by hand, for drives.
#pragma once

#include "Tests/Support/PacketBytes.h"

namespace kestro::testing {

inline constexpr unsigned kDriveChannel = 1300;

/// System information: this cell serves.
inline PacketBytes lteCell(unsigned identity, unsigned physical, unsigned area = 601) {
  return packet(0xB0C2)
      .u16(14, physical)
      .u16(16, kDriveChannel)
      .u32(22, identity)
      .u16(26, area)
      .u32(28, 3)
      .length(38);
}

/// A measurement of the serving cell: dBm in quarters above -140, dB in quarters above -30.
inline PacketBytes lteServing(unsigned physical, int rsrp, int rsrq = -10) {
  return packet(0xB17F)
      .u16(17, kDriveChannel)
      .u16(19, physical)
      .u32(21, static_cast<unsigned>(4 * (rsrp + 140)) | static_cast<unsigned>(4 * (rsrq + 30))
                                                             << 18U)
      .length(33);
}

/// The connected mode's measurement, with one neighbour: dB in eighths above -20.
inline PacketBytes lteConnected(unsigned physical, int rsrp, unsigned neighbour,
                                int neighbourRsrp) {
  return packet(0xB179)
      .u16(17, kDriveChannel)
      .u16(19, physical)
      .u16(23, static_cast<unsigned>(4 * (rsrp + 140)))
      .u16(25, 80)
      .u8(27, 1)
      .u16(29, neighbour)
      .u16(31, static_cast<unsigned>(4 * (neighbourRsrp + 140)))
      .u16(33, 64)
      .length(35);
}

/// One neighbour, in halves above -140 dBm.
inline PacketBytes lteNeighbour(unsigned physical, int rsrp) {
  return packet(0xB180)
      .u16(17, kDriveChannel)
      .u32(21, physical | static_cast<unsigned>(2 * (rsrp + 140)) << 17U)
      .length(41);
}

}  // namespace kestro::testing
