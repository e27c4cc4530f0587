// SPDX-License-Identifier: MIT
// The UTRAN measurement packets: 0xD00A (UTRAN neighbours), 0xD00E (GSM neighbours) and 0xD00C
// (transport channels).
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kUTRANNeighborsPacket = {
    .code = 0xD00A, .name = "UTRAN neighbours", .minimumLength = 21};
inline constexpr PacketKind kUTRANGSMNeighborsPacket = {
    .code = 0xD00E, .name = "GSM neighbours of UTRAN", .minimumLength = 17};
inline constexpr PacketKind kUTRANTransportChannelsPacket = {
    .code = 0xD00C, .name = "UTRAN transport channels", .minimumLength = 17};

extern const Section kUTRANNeighborsSection;
extern const Section kUTRANGSMNeighborsSection;
extern const Section kTRCHBLERSection;
extern const Section kCCTRCHSIRSection;

// "Neighbhor" is how these classes are called.
using UTRANNeighbhorMeasurements = TableDecoder<kUTRANNeighborsSection>;
/// Empties its section: the GSM neighbours are read, and then not shown.
using GSMNeighbhorMeasurements = TableDecoder<kUTRANGSMNeighborsSection>;
using TRCHBLERMeasurement = TableDecoder<kTRCHBLERSection>;
using CCTRCHSIRMeasurement = TableDecoder<kCCTRCHSIRSection>;

}  // namespace kestro
