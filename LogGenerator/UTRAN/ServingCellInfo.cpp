// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/ServingCellInfo.h"

namespace kestro {
namespace {

// --- 0xD0E2: system information, at least 26 bytes -----------------------------------------------

constexpr NamedValue kAccessNames[] = {{0, "All Calls"}, {1, "Emergency Calls Only"}};

constexpr Field kUTRANSystemInformation[] = {
    {"Cell Access Restrictions", u8(14), decimal()},
    {"Cell ID", u32(21), decimal()},
    {"Downlink UARFCN", u16(19), decimal()},
    {"Uplink UARFCN", u16(17), decimal()},
    {"URA ID", u8(15), decimal()},
    {"Allowed Access", u8(25).bit(0), named(kAccessNames, "All Calls")},
};
static_assert(isLayout(kUTRANSystemInformation));

// --- The cell monitor's serving cells ------------------------------------------------------------

constexpr ListedValue kUTRANServingCellValues[] = {
    {kTqCellMonitorLAC, "Local Area Code", decimal(),
     "Serving Cell Info: Failed to retrieve LAC\n"},
    {kTqCellMonitorCellId, "Cell ID", decimal(), "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {kTqCellMonitorBandInfo, "Freq Band Indicator", decimal(),
     "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {kTqCellMonitorSCN, "Cell Scrambling Code", decimal(),
     "Serving Cell Info: Failed to retrieve Cell Scrambling Code\n"},
    // Both directions show the one number that the list has; its absence is reported once.
    {kTqCellMonitorUARFCN, "Uplink UARFCN", decimal()},
    {kTqCellMonitorUARFCN, "Downlink UARFCN", decimal(),
     "Serving Cell Info: Failed to retrieve UARFCN\n"},
};

constexpr PropertyListReading kServingCells = {
    .packet = kCellMonitorPacket,
    .part = ListedPart::EachCell,
    .cells = {.technologies = {kTqCellMonitorRadioAccessTechnologyUTRAN2},
              .type = kTqCellMonitorCellTypeServing},
    .values = kUTRANServingCellValues,
};

constexpr PacketReading kUTRANReadings[] = {
    {.packet = kUTRANSystemInformationPacket, .fields = kUTRANSystemInformation}};

}  // namespace

constexpr Section kUTRANServingCellInfoSection = {
    .name = "Serving Cell Info",
    .kind = SectionKind::Dictionary,
    .readings = kUTRANReadings,
    .reportsUnknownCodes = false,
    .propertyList = &kServingCells,
};

}  // namespace kestro
