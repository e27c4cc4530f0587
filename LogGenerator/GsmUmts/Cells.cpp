// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/Cells.h"

#include <algorithm>

#include "LogGenerator/GsmUmts/CellSets.h"

namespace kestro {
namespace {

// --- 0x5134: GSM serving-cell identity, at least 26 bytes ----------------------------------------

// The display begins with the identity, which is the last of the three in the packet.
constexpr Field kServingCellIdentity[] = {
    {"Cell ID", u16(17), decimal()},
    {"ARFCN", u16(13), decimal()},
    {"BSIC", u16(15), decimal()},
};
static_assert(isLayout(kServingCellIdentity));

// --- 0x5137: GSM serving and neighbour measurements, at least 29 bytes ---------------------------

// The level is shown as it stands in the packet; of C1 and C2 the low halves.
constexpr Field kServingCellMeasurements[] = {
    {"RSSI", GSMMeasurements::kServingLevel, decimal("%d dBm")},
    {"C1 Value", GSMMeasurements::kServingQualityFull.bits(0, 15), decimal()},
    {"C2 Value", GSMMeasurements::kServingQualitySub.bits(0, 15), decimal()},
};
static_assert(isLayout(kServingCellMeasurements));

constexpr Field kNeighbourCount[] = {
    {"Neighbours", GSMMeasurements::kNeighbourCount, hidden()},
};
static_assert(isLayout(kNeighbourCount));

constexpr std::string_view kARFCN = "ARFCN";
constexpr std::string_view kBSIC = "BSIC";

constexpr Field kNeighbour[] = {
    {kARFCN, GSMMeasurements::kNeighbourARFCN, decimal()},
    {"RSSI", u8(2), decimal()},
    {"C1 Value", u32(3), decimal()},
    {kBSIC, supplied()},
};
static_assert(isLayout(kNeighbour));
constexpr auto kNeighbourIdentity = fieldsNamed(kNeighbour, kARFCN, kBSIC);

constexpr ListReading kMeasuredNeighbours[] = {{.table = {
                                                    .name = "neighbour",
                                                    .count = GSMMeasurements::kNeighbourCount,
                                                    .base = GSMMeasurements::kFirstNeighbour,
                                                    .stride = 14,
                                                    .fields = kNeighbour,
                                                    .identity = kNeighbourIdentity,
                                                }}};

// --- 0x51FF: neighbour BSIC list, at least 15 bytes ----------------------------------------------

constexpr Field kBSICCount[] = {{"Entries", u8(14), hidden()}};
static_assert(isLayout(kBSICCount));

constexpr Field kBSICEntry[] = {
    {kARFCN, GSMBSICList::kARFCN, decimal()},
    {kBSIC, GSMBSICList::kBSIC, decimal()},
};
static_assert(isLayout(kBSICEntry));

constexpr ListReading kBSICList[] = {{
    .table = {.name = "entry", .count = u8(14), .base = 15, .stride = 4, .fields = kBSICEntry},
    .use = RowsUse::Noted,
}};

// --- 0x5076: dedicated-mode channel, at least 17 bytes -------------------------------------------

constexpr Field kDedicatedChannel[] = {
    {"MA Dedicated ARFCN", u16(13).bits(0, 7), decimal()},
};
static_assert(isLayout(kDedicatedChannel));

// --- 0x4005: idle-mode cell ranking, at least 15 bytes -------------------------------------------

constexpr Field kRankedGSMCell[] = {
    {kARFCN, u16(0), decimal()},
    {kBSIC, u16(2), decimal()},
    {"RSSI", s8(4), decimal("%d dBm")},
    {"Ranking Value", s16(5), decimal()},
};
static_assert(isLayout(kRankedGSMCell));
constexpr auto kRankedGSMIdentity = fieldsNamed(kRankedGSMCell, kARFCN, kBSIC);

constexpr ListReading kRankedGSMCells[] = {{.table = {
                                                .name = "GSM cell",
                                                .count = IdleModeRanking::kGSMCellCount,
                                                .base = IdleModeRanking::kFirstCell,
                                                .stride = 7,
                                                .fields = kRankedGSMCell,
                                                .identity = kRankedGSMIdentity,
                                            }}};

// --- 0x51F8: mobile allocation, at least 15 bytes ------------------------------------------------

constexpr Field kMobileAllocation[] = {
    {"HSN", u8(13), decimal()},
    {"Frequencies", u8(14), hidden()},
};
static_assert(isLayout(kMobileAllocation));

constexpr Field kFrequency[] = {{"ARFCN", u16(0), decimal()}};
static_assert(isLayout(kFrequency));

constexpr ListReading kFrequencies[] = {{
    .table = {.name = "frequency", .count = u8(14), .base = 15, .stride = 2, .fields = kFrequency},
    .key = "ARFCNs",
    .isPlain = true,
}};

// --- The cell monitor's GSM cells ----------------------------------------------------------------

constexpr ListedValue kGSMServingCellValues[] = {
    {.listKey = kTqCellMonitorCellId,
     .key = "Cell ID",
     .text = decimal(),
     .failureLine = "GSMServingCell: Failed to retrieve Cell ID\n"},
    {.listKey = kTqCellMonitorARFCN,
     .key = "ARFCN",
     .text = decimal(),
     .failureLine = "GSMServingCell: Failed to retrieve ARFCN\n"},
};

constexpr PropertyListReading kListedServingCell = {
    .packet = kCellMonitorPacket,
    .part = ListedPart::FirstCell,
    .cells = {.technologies = {kTqCellMonitorRadioAccessTechnologyGSM},
              .type = kTqCellMonitorCellTypeServing},
    .values = kGSMServingCellValues,
    .missingListLine = kMissingCellArrayLine,
};

// The list has half the level.
constexpr ListedValue kGSMNeighbourValues[] = {
    {.listKey = kTqCellMonitorARFCN,
     .key = "ARFCN",
     .text = decimal(),
     .failureLine = "NeighboringCells: Failed to retrieve ARFCN\n"},
    {.listKey = kTqCellMonitorRSSI,
     .key = "RSSI",
     .text = decimal("%d dBm", 0, 2).absentAt(kCellMonitorNotMeasured, ""),
     .failureLine = "NeighboringCells: Failed to retrieve RSSI\n"},
};

constexpr std::string_view kListedNeighbourIdentity[] = {kARFCN};

constexpr PropertyListReading kListedNeighbours = {
    .packet = kCellMonitorPacket,
    .part = ListedPart::EachCell,
    .cells = {.technologies = {kTqCellMonitorRadioAccessTechnologyGSM},
              .type = kTqCellMonitorCellTypeNeighbor},
    .values = kGSMNeighbourValues,
    .missingListLine = kMissingCellArrayLine,
    .identity = kListedNeighbourIdentity,
};

// --- What the sections take ----------------------------------------------------------------------

constexpr PacketReading kGSMServingCellReadings[] = {
    {.packet = kGSMServingCellPacket, .fields = kServingCellIdentity},
    {.packet = kGSMMeasurementsPacket, .fields = kServingCellMeasurements},
    {.packet = kGSMDedicatedChannelPacket, .fields = kDedicatedChannel},
};

constexpr PacketReading kNeighboringCellsReadings[] = {
    {.packet = kGSMMeasurementsPacket, .fields = kNeighbourCount, .lists = kMeasuredNeighbours},
    {.packet = kGSMNeighbourBSICsPacket, .fields = kBSICCount, .lists = kBSICList},
};

constexpr PacketReading kGSMSetReadings[] = {
    {.packet = kIdleModeRankingPacket,
     .fields = IdleModeRanking::kCounts,
     .lists = kRankedGSMCells},
};

constexpr PacketReading kMobileAllocationReadings[] = {
    {.packet = kGSMMobileAllocationPacket, .fields = kMobileAllocation, .lists = kFrequencies},
};

}  // namespace

constexpr Section kGSMServingCellSection = {
    .name = "GSM Serving Cell",
    .logLine = "GSMServingCell",
    .kind = SectionKind::Dictionary,
    .readings = kGSMServingCellReadings,
    .propertyList = &kListedServingCell,
};

constexpr Section kNeighboringCellsSection = {
    .name = "Neighboring Cells",
    .logLine = "NeighboringCells",
    .kind = SectionKind::List,
    .readings = kNeighboringCellsReadings,
    .propertyList = &kListedNeighbours,
};

constexpr Section kGSMSetSection = {
    .name = "GSM Set",
    .logLine = "GSMSet",
    .kind = SectionKind::List,
    .readings = kGSMSetReadings,
};

constexpr Section kMobileAllocationSection = {
    .name = "Mobile Allocation",
    .logLine = "MobileAllocation",
    .kind = SectionKind::Dictionary,
    .readings = kMobileAllocationReadings,
};

// --- NeighboringCells ----------------------------------------------------------------------------

void NeighboringCells::willPublish(const ListReading& list, PacketView packet,
                                   std::vector<Value>& rows) {
  if (list.use != RowsUse::Noted) return;
  _arfcnToBsic.clear();
  for (std::size_t i = 0; i < rows.size(); ++i) {
    const RecordPosition entry = recordAt(list.table, packet, i);
    _arfcnToBsic.push_back(
        {readBits(GSMBSICList::kARFCN, packet, entry), rows[i].dictionary()[kBSIC]});
  }
}

Value NeighboringCells::supply(const Field& /*field*/, PacketView packet,
                               const RecordPosition& position) const {
  const std::uint32_t arfcn = readBits(GSMMeasurements::kNeighbourARFCN, packet, position);
  // Of several entries for one frequency the last counts.
  const auto known = std::find_if(_arfcnToBsic.rbegin(), _arfcnToBsic.rend(),
                                  [arfcn](const NotedCell& cell) { return cell.arfcn == arfcn; });
  return known == _arfcnToBsic.rend() ? Value() : known->bsic;
}

}  // namespace kestro
