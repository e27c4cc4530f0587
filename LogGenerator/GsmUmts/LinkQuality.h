// SPDX-License-Identifier: MIT
// How well the UMTS downlink is received: block errors of its transport channels, and HSDPA
// decoding.
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kUMTSBlockErrorsPacket = {
    .code = 0x4116, .name = "Downlink transport-channel BLER", .minimumLength = 16};
inline constexpr PacketKind kHSDPAStatisticsPacket = {
    .code = 0x4221, .name = "HSDPA decoding statistics", .minimumLength = 18};

extern const Section kBLERSection;
extern const Section kHSDPAInformationSection;

/// Block counts of each transport channel over a window.
using BLER = TableDecoder<kBLERSection>;

/// Decoding statistics of each HARQ process. A packet without processes of one kind leaves the list
/// of that kind as it was.
using HSDPAInformation = TableDecoder<kHSDPAInformationSection>;

}  // namespace kestro
