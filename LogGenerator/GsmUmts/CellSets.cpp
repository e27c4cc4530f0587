// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/CellSets.h"

#include <algorithm>

namespace kestro {
namespace {

// --- 0x417A: UMTS set information, at least 16 bytes ---------------------------------------------

constexpr Place kReceiveLevel = s16(13);
constexpr Place kSetCellCount = u8(15);

constexpr Field kSetInformation[] = {
    {"Receive Level", kReceiveLevel, hidden()},
    {"Cells", kSetCellCount, hidden()},
};
static_assert(isLayout(kSetInformation));

/// The member cells' set type; other types are other sets.
constexpr std::int64_t kActiveSetType = 0;
constexpr Place kSetType = u8(8).bits(5, 7);

// Three candidates for the Ec/N0 index, in the energy record that belongs to the cell.
constexpr Place kFirstEnergy = u32(32).ofTwin().shared();
constexpr Place kSecondEnergy = u32(36).ofTwin().shared();
constexpr Place kThirdEnergy = u32(40).ofTwin().shared();

/// Whole dB of the first candidate that is not 0.
std::int64_t energyPerChip(std::span<const std::int64_t> candidates) {
  const auto index = std::ranges::find_if(candidates, [](std::int64_t word) { return word != 0; });
  return Base::lookUpECNO(index == candidates.end() ? 0 : static_cast<std::uint32_t>(*index));
}

/// The cell's share of the received level, which is in tenths of a dB. The division drops its
/// fraction towards 0, and the unit is dB: both are the display's convention.
std::int64_t receivedCodePower(std::span<const std::int64_t> raw) {
  return (raw[0] + 512) / 10 - 106 + energyPerChip(raw.subspan(1));
}

constexpr Field kSetCell[] = {
    {"Scrambling Code", u16(7).bits(0, 12), decimal()},
    {"Set Type", kSetType, hidden()},
    {"RSCP",
     {kReceiveLevel.ofPacket(), kFirstEnergy, kSecondEnergy, kThirdEnergy},
     decimal("%d dB").of(receivedCodePower, "receivedCodePower")},
    {"Energy Per Chip",
     {kFirstEnergy, kSecondEnergy, kThirdEnergy},
     decimal("%d dB").of(energyPerChip, "energyPerChip")},
};
static_assert(isLayout(kSetCell));
constexpr auto kSetCellIdentity = fieldsNamed(kSetCell, "Scrambling Code");

/// The energy records, 44 bytes each, stand behind all cell records.
constexpr RecordTable kActiveCells = {
    .name = "cell",
    .count = kSetCellCount,
    .base = 16,
    .stride = 15,
    .fields = kSetCell,
    .keep = equals(kSetType, kActiveSetType),
    .twinBase = 16,
    .twinPerCount = 15,
    .twinStride = 44,
    .identity = kSetCellIdentity,
};

constexpr RecordTable withoutRows(RecordTable table) {
  table.keepsNone = true;
  return table;
}

constexpr ListReading kActiveSetList[] = {{.table = kActiveCells}};
constexpr ListReading kEmptySetList[] = {{.table = withoutRows(kActiveCells)}};

constexpr PacketReading kActiveSetReadings[] = {
    {.packet = kUMTSSetInformationPacket, .fields = kSetInformation, .lists = kActiveSetList}};
constexpr PacketReading kEmptySetReadings[] = {
    {.packet = kUMTSSetInformationPacket, .fields = kSetInformation, .lists = kEmptySetList}};

// --- 0x4005: idle-mode cell ranking, at least 15 bytes -------------------------------------------

static_assert(isLayout(IdleModeRanking::kCounts));

constexpr Field kRankedUMTSCell[] = {
    {"Downlink Frequency", s16(0), decimal()},
    {"Scrambling Code", u16(2), decimal()},
    {"RSCP", s8(4), decimal("%d dB", -21)},
    {"Rank Cell RSCP", s16(5), decimal("%d dB")},
    {"Energy Per Chip", s8(7), scaled("%f dB", 0, 0.5)},
    {"Ranking Value", s16(8), decimal()},
};
static_assert(isLayout(kRankedUMTSCell));
constexpr auto kRankedUMTSIdentity =
    fieldsNamed(kRankedUMTSCell, "Downlink Frequency", "Scrambling Code");

constexpr ListReading kRankedUMTSCells[] = {{.table = {
                                                 .name = "UMTS cell",
                                                 .count = IdleModeRanking::kUMTSCellCount,
                                                 .base = IdleModeRanking::kFirstCell,
                                                 .stride = 10,
                                                 .fields = kRankedUMTSCell,
                                                 .identity = kRankedUMTSIdentity,
                                             }}};

constexpr PacketReading kUMTSSetReadings[] = {
    {.packet = kIdleModeRankingPacket,
     .fields = IdleModeRanking::kCounts,
     .lists = kRankedUMTSCells},
};

// --- The cell monitor's UMTS neighbours ----------------------------------------------------------

constexpr ListedValue kUMTSNeighbourValues[] = {
    {.listKey = kTqCellMonitorUARFCN,
     .key = "UARFCN",
     .text = decimal(),
     .failureLine = "UMTSSet: Failed to retrieve UARFCN\n"},
    {.listKey = kTqCellMonitorSCN,
     .key = "Scrambling Code",
     .text = decimal(),
     .failureLine = "UMTSSet: Failed to retrieve Scrambling Code\n"},
    {.listKey = kTqCellMonitorRSCP,
     .key = "RSCP",
     .text = decimal("%d dBm").absentAt(kCellMonitorNotMeasured, ""),
     .failureLine = "UMTSSet: Failed to retrieve RSCP\n"},
    {.listKey = kTqCellMonitorECN0,
     .key = "Energy Per Chip",
     .text = decimal("%d dB").absentAt(kCellMonitorNotMeasured, ""),
     .failureLine = "UMTSSet: Failed to retrieve Energy Per Chip\n"},
};

constexpr std::string_view kUMTSNeighbourIdentity[] = {"UARFCN", "Scrambling Code"};

constexpr PropertyListReading kNeighbours = {
    .packet = kCellMonitorPacket,
    .part = ListedPart::EachCell,
    .cells = {.technologies = {kTqCellMonitorRadioAccessTechnologyUMTS},
              .type = kTqCellMonitorCellTypeNeighbor},
    .values = kUMTSNeighbourValues,
    .missingListLine = kMissingCellArrayLine,
    .identity = kUMTSNeighbourIdentity,
};

}  // namespace

constexpr Section kActiveSetSection = {
    .name = "Active Set",
    .logLine = "ActiveSet",
    .kind = SectionKind::List,
    .readings = kActiveSetReadings,
};

constexpr Section kDetectedSetSection = {
    .name = "Detected Set",
    .logLine = "DetectedSet",
    .kind = SectionKind::List,
    .readings = kEmptySetReadings,
};

constexpr Section kMonitoredSetSection = {
    .name = "Monitored Set",
    .logLine = "MonitoredSet",
    .kind = SectionKind::List,
    .readings = kEmptySetReadings,
};

constexpr Section kVirtualActiveSetSection = {
    .name = "Virtual Active Set",
    .logLine = "VirtualActiveSet",
    .kind = SectionKind::List,
    .readings = kEmptySetReadings,
};

constexpr Section kUMTSSetSection = {
    .name = "UMTS Set",
    .logLine = "UMTSSet",
    .kind = SectionKind::List,
    .readings = kUMTSSetReadings,
    .propertyList = &kNeighbours,
};

}  // namespace kestro
