// SPDX-License-Identifier: MIT
// The 1x system parameters packet, 0x134F.
#pragma once

#include "LogGenerator/C2K/C2KParser.h"

namespace kestro {

inline constexpr PacketKind kOneXSystemParametersPacket = {
    .code = 0x134F, .name = "1x system parameters", .minimumLength = 171};

extern const PacketReading kOneXSystemParametersReading;
extern const PacketRules kOneXSystemParametersRules;

/// Shows which system and base station serve the phone, and whether it roams. Packets of an early
/// version are rejected.
class OneXSystemParameters : public FieldParser {
 public:
  OneXSystemParameters();
};

}  // namespace kestro
