// SPDX-License-Identifier: MIT
// The LTE serving cell as its system information (0xB0C2), its antennas (0xB0C1) and the
// cell-monitor list describe it.
#pragma once

#include "LogGenerator/Ondrel/CellMonitor.h"

namespace kestro {

inline constexpr PacketKind kLTESystemInformationPacket = {
    .code = 0xB0C2, .name = "LTE serving-cell system information", .minimumLength = 38};
inline constexpr PacketKind kLTEAntennasPacket = {
    .code = 0xB0C1, .name = "LTE transmit antennas", .minimumLength = 22};

extern const Section kLTEServingCellInfoSection;

/// Reports a decoded antenna packet as unknown all the same.
class LTEServingCellInfo : public CellMonitorDecoder {
 public:
  explicit LTEServingCellInfo(const GeneratorServices& services)
      : CellMonitorDecoder(services, kLTEServingCellInfoSection) {}

 protected:
  void didRead(const PacketReading& reading, PacketView packet) override;
};

}  // namespace kestro
