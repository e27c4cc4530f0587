// SPDX-License-Identifier: MIT
// The GSM radio-resource layer: its state, discontinuous reception and transmission, and the
// serving cell's level and quality.
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kGSMRRStatePacket = {
    .code = 0x512C, .name = "RR state", .minimumLength = 17};
inline constexpr PacketKind kGSMDiscontinuousTransmissionPacket = {
    .code = 0x5072, .name = "Discontinuous transmission", .minimumLength = 20};
inline constexpr PacketKind kGSMDiscontinuousReceptionPacket = {
    .code = 0x51F6, .name = "Discontinuous reception", .minimumLength = 24};

extern const Section kGSMRRInfoSection;

/// What a packet does not carry stays.
using GSMRRInfo = TableDecoder<kGSMRRInfoSection>;

}  // namespace kestro
