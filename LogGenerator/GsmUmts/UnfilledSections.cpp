// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/UnfilledSections.h"

#include "LogGenerator/GsmUmts/Cells.h"
#include "LogGenerator/GsmUmts/MobilityManagement.h"
#include "LogGenerator/GsmUmts/RadioResource.h"
#include "LogGenerator/Ondrel/CellMonitor.h"

namespace kestro {
namespace {

// Wanted, and not read: some are read by other sections.
constexpr PacketReading kGPRSInformationReadings[] = {
    {.packet = kUndescribedGSMPackets[0]},        {.packet = kServingPLMNPacket},
    {.packet = kGSMDiscontinuousReceptionPacket}, {.packet = kUndescribedGSMPackets[1]},
    {.packet = kUndescribedGSMPackets[2]},        {.packet = kUndescribedGSMPackets[3]},
    {.packet = kGSMMeasurementsPacket},
};

constexpr PacketReading kUMTSRRInfoReadings[] = {
    {.packet = kUndescribedUMTSPackets[0]}, {.packet = kUndescribedUMTSPackets[1]},
    {.packet = kUndescribedUMTSPackets[2]}, {.packet = kUndescribedUMTSPackets[3]},
    {.packet = kCellMonitorPacket},
};

}  // namespace

constexpr Section kCodingSchemeSection = {
    .name = "Coding Scheme",
    .logLine = "CodingScheme",
    .kind = SectionKind::Dictionary,
    .reportsUnknownCodes = false,
};

constexpr Section kUMTSRRMeasurementSection = {
    .name = "UMTS RR Measurement",
    .logLine = "UMTSRRMeasurement",
    .kind = SectionKind::Dictionary,
    .reportsUnknownCodes = false,
};

constexpr Section kCellChangeCountersSection = {
    .name = "Cell Change Counters",
    .logLine = "CellChangeCounters",
    .kind = SectionKind::Dictionary,
    .reportsUnknownCodes = false,
};

constexpr Section kNonRankedGSMSetSection = {
    .name = "Non-Ranked GSM Set",
    .logLine = "NonRankedGSMSet",
    .kind = SectionKind::List,
    .reportsUnknownCodes = false,
};

constexpr Section kNonRankedUMTSSetSection = {
    .name = "Non-Ranked UMTS Set",
    .logLine = "NonRankedUMTSSet",
    .kind = SectionKind::List,
    .reportsUnknownCodes = false,
};

constexpr Section kGPRSInformationSection = {
    .name = "GPRS Information",
    .logLine = "GPRSInformation",
    .kind = SectionKind::Dictionary,
    .readings = kGPRSInformationReadings,
};

constexpr Section kUMTSRRInfoSection = {
    .name = "UMTS RR Info",
    .logLine = "UMTSRRInfo",
    .kind = SectionKind::Dictionary,
    .readings = kUMTSRRInfoReadings,
};

}  // namespace kestro
