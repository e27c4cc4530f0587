// SPDX-License-Identifier: MIT
// The UTRAN radio-resource-control state packet, 0xD0E0.
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kUTRANRRCStatePacket = {
    .code = 0xD0E0, .name = "UTRAN RRC state", .minimumLength = 15};

extern const Section kRRCStateSection;

/// Shows the mode of the phone's radio-resource control, and also writes it to the console log. A
/// packet that is too short is reported and shown all the same: it has no known mode.
class RRC_State : public SectionDecoder {
 public:
  explicit RRC_State(const GeneratorServices& services)
      : SectionDecoder(services, kRRCStateSection) {}

 protected:
  void didRead(const PacketReading& reading, PacketView packet) override;
};

}  // namespace kestro
