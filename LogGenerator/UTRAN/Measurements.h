// SPDX-License-Identifier: MIT
// The UTRAN measurement packets: 0xD00A (UTRAN neighbours), 0xD00E (GSM neighbours) and 0xD00C
// (transport channels).
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr LogCode kUTRANNeighborsCode = 0xD00A;
inline constexpr LogCode kUTRANGSMNeighborsCode = 0xD00E;
inline constexpr LogCode kUTRANTransportChannelsCode = 0xD00C;

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
