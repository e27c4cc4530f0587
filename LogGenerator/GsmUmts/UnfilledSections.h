// SPDX-License-Identifier: MIT
// The sections that stay as the template has them.
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

// Packets that sections want, though nobody has described them.
inline constexpr PacketKind kUndescribedGSMPackets[] = {
    {.code = 0x51F5}, {.code = 0x51FB}, {.code = 0x51FD}, {.code = 0x51F4}};
inline constexpr PacketKind kUndescribedUMTSPackets[] = {
    {.code = 0x4125}, {.code = 0x4031}, {.code = 0x4127}, {.code = 0x4157}};

extern const Section kCodingSchemeSection;
extern const Section kUMTSRRMeasurementSection;
extern const Section kCellChangeCountersSection;
extern const Section kNonRankedGSMSetSection;
extern const Section kNonRankedUMTSSetSection;
extern const Section kGPRSInformationSection;
extern const Section kUMTSRRInfoSection;

// These want no packet. Given one they leave their name in the log, whatever its code.
using CodingScheme = TableDecoder<kCodingSchemeSection>;
using UMTSRRMeasurement = TableDecoder<kUMTSRRMeasurementSection>;
using CellChangeCounters = TableDecoder<kCellChangeCountersSection>;
using NonRankedGSMSet = TableDecoder<kNonRankedGSMSetSection>;
using NonRankedUMTSSet = TableDecoder<kNonRankedUMTSSetSection>;

// These want packets of which nothing is known but their codes.
using GPRSInformation = TableDecoder<kGPRSInformationSection>;
using UMTSRRInfo = TableDecoder<kUMTSRRInfoSection>;

}  // namespace kestro
