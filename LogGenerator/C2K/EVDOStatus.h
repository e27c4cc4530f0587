// SPDX-License-Identifier: MIT
// The EV-DO status packet, 0x1183.
#pragma once

#include "LogGenerator/C2K/C2KParser.h"

namespace kestro {

inline constexpr PacketKind kEVDOStatusPacket = {
    .code = 0x1183, .name = "EV-DO status", .minimumLength = 50};

extern const PacketReading kEVDOStatusReading;
extern const PacketRules kEVDOStatusRules;

/// Shows where the phone's EV-DO receiver is tuned to and what state it is in.
class EVDOStatus : public FieldParser {
 public:
  EVDOStatus();
};

}  // namespace kestro
