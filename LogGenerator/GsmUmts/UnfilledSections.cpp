// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/UnfilledSections.h"

namespace kestro {
namespace {

constexpr Section withoutPackets(std::string_view name, std::string_view logLine,
                                 SectionKind kind) {
  return {.name = name, .logLine = logLine, .kind = kind, .reportsUnknownCodes = false};
}

/// A packet that the section wants, though nobody has described it.
constexpr PacketReading undescribed(LogCode code) {
  return {.code = code, .packetName = {}, .minimumLength = 0};
}

constexpr PacketReading kGPRSInformationReadings[] = {
    undescribed(0x51F5), undescribed(0x7135), undescribed(0x51F6), undescribed(0x51FB),
    undescribed(0x51FD), undescribed(0x51F4), undescribed(0x5137),
};
constexpr auto kGPRSInformationCodes = codesOf(kGPRSInformationReadings);

constexpr PacketReading kUMTSRRInfoReadings[] = {
    undescribed(0x4125), undescribed(0x4031),           undescribed(0x4127),
    undescribed(0x4157), undescribed(kCellMonitorCode),
};
constexpr auto kUMTSRRInfoCodes = codesOf(kUMTSRRInfoReadings);

}  // namespace

constexpr Section kCodingSchemeSection =
    withoutPackets("Coding Scheme", "CodingScheme", SectionKind::Dictionary);
constexpr Section kUMTSRRMeasurementSection =
    withoutPackets("UMTS RR Measurement", "UMTSRRMeasurement", SectionKind::Dictionary);
constexpr Section kCellChangeCountersSection =
    withoutPackets("Cell Change Counters", "CellChangeCounters", SectionKind::Dictionary);
constexpr Section kNonRankedGSMSetSection =
    withoutPackets("Non-Ranked GSM Set", "NonRankedGSMSet", SectionKind::List);
constexpr Section kNonRankedUMTSSetSection =
    withoutPackets("Non-Ranked UMTS Set", "NonRankedUMTSSet", SectionKind::List);

constexpr Section kGPRSInformationSection = {
    .name = "GPRS Information",
    .logLine = "GPRSInformation",
    .kind = SectionKind::Dictionary,
    .readings = kGPRSInformationReadings,
    .codes = kGPRSInformationCodes,
};

constexpr Section kUMTSRRInfoSection = {
    .name = "UMTS RR Info",
    .logLine = "UMTSRRInfo",
    .kind = SectionKind::Dictionary,
    .readings = kUMTSRRInfoReadings,
    .codes = kUMTSRRInfoCodes,
};

}  // namespace kestro
