// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/ServingCellInfo.h"

namespace kestro {
namespace {

// By the number of resource blocks.
constexpr NamedValue kBandwidths[] = {
    {6, "1.4 MHz"}, {15, "3 MHz"}, {25, "5 MHz"}, {50, "10 MHz"}, {75, "15 MHz"}, {100, "20 MHz"},
};

constexpr Field kLTESystemInformation[] = {
    {"Physical Cell ID", u16(14), decimal()},
    {"Download Frequency", u16(16), decimal()},
    {"Upload Frequency", u16(18), decimal()},
    {"UARFCN", removed()},
    {"Download Bandwidth", u8(20), named(kBandwidths, "Unknown")},
    {"Upload Bandwidth", u8(21), named(kBandwidths, "Unknown")},
    {"Cell Identity", u32(22), decimal()},
    {"Tracking Area Code", u16(26), decimal()},
    {"Freq Band Indicator", u32(28), decimal()},
};
static_assert(isLayout(kLTESystemInformation));

constexpr Field kAntennas[] = {
    {"Num Tx Antennas", u8(20), decimal()},
};
static_assert(isLayout(kAntennas));

constexpr ListedValue kLTEServingCellValues[] = {
    {kTqCellMonitorTAC, "Tracking Area Code", decimal(),
     "Serving Cell Info: Failed to retrieve TAC\n"},
    {kTqCellMonitorCellId, "Cell Identity", decimal(),
     "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {kTqCellMonitorPID, "Physical Cell ID", decimal(),
     "Serving Cell Info: Failed to retrieve Physical Cell ID\n"},
    {kTqCellMonitorBandInfo, "Freq Band Indicator", decimal(),
     "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {kTqCellMonitorUARFCN, "UARFCN", decimal(), "Serving Cell Info: Failed to retrieve UARFCN\n"},
};

constexpr PropertyListReading kCellMonitor = {
    .packet = kCellMonitorPacket,
    .part = ListedPart::FirstCell,
    .cells = {{kTqCellMonitorRadioAccessTechnologyLTE}, kTqCellMonitorCellTypeServing},
    .values = kLTEServingCellValues,
    .missingListLine = kMissingCellArrayLine,
};

constexpr PacketReading kLTEReadings[] = {
    {.packet = kLTESystemInformationPacket, .fields = kLTESystemInformation},
    {.packet = kLTEAntennasPacket, .fields = kAntennas},
};

}  // namespace

constexpr Section kLTEServingCellInfoSection = {
    .name = "Serving Cell Info",
    .logLine = "LTE Serving Cell Info",
    .kind = SectionKind::Dictionary,
    .readings = kLTEReadings,
    .propertyList = &kCellMonitor,
};

void LTEServingCellInfo::didRead(const PacketReading& reading, PacketView /*packet*/) {
  if (&reading.packet == &kLTEAntennasPacket) reportUnknownCode(reading.packet.code);
}

}  // namespace kestro
