// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/Measurements.h"

#include "LogGenerator/Packets/Texts.h"
#include "Platform/SystemLog.h"

namespace kestro {
namespace {

constexpr std::string_view kPhysicalCellId = "Physical Cell ID";
constexpr std::string_view kEARFCN = "E-ARFCN";
constexpr std::string_view kNotPresent = "Not Present";

constexpr NamedValue kTrueFalse[] = {{0, "False"}, {1, "True"}};

// Levels come in steps of 1/4 or 1/2 dB, qualities in steps of 1/8 or 1/4 dB.
constexpr TextRule quarterDbm() { return scaled("%4.2f dBm", -140, 0.25); }
constexpr TextRule halfDbm() { return scaled("%4.2f dBm", -140, 0.5); }
constexpr TextRule eighthDb() { return scaled("%4.2f dB", -20, 0.125); }
constexpr TextRule quarterDb() { return scaled("%4.2f dB", -30, 0.25); }

// --- 0xB179: intra-frequency measurement: a header, the measured neighbours, the detected cells --

constexpr Field kIntraFrequency[] = {
    {kEARFCN, u16(17), decimal()},
    {"Serving Physical Cell ID", u16(19), decimal()},
    {"Subframe Number", u16(21), decimal()},
    {"Serving Filtered RSRP", u16(23), quarterDbm()},
    {"Serving Filtered RSRQ", u16(25), eighthDb()},
};
static_assert(isLayout(kIntraFrequency));

constexpr Place kMeasuredCount = u8(27);
constexpr Place kDetectedCount = u8(28);

constexpr Field kMeasuredNeighbor[] = {
    {kPhysicalCellId, u16(0), decimal()},
    {"Filtered RSRP", u16(2), quarterDbm()},
    {"Filtered RSRQ", u16(4), eighthDb()},
};
static_assert(isLayout(kMeasuredNeighbor));
constexpr unsigned kMeasuredNeighborSize = 6;
constexpr Field kMeasuredIdentity[] = {
    packetFieldNamed(kIntraFrequency, kEARFCN),
    fieldNamed(kMeasuredNeighbor, kPhysicalCellId),
};

constexpr Field kDetectedCell[] = {
    {kPhysicalCellId, u16(0), decimal()},
};
static_assert(isLayout(kDetectedCell));
constexpr unsigned kDetectedCellSize = 2;
constexpr Field kDetectedIdentity[] = {
    packetFieldNamed(kIntraFrequency, kEARFCN),
    fieldNamed(kDetectedCell, kPhysicalCellId),
};

constexpr ListReading kMeasuredNeighbors[] = {{.table = {
                                                   .name = "measured neighbour",
                                                   .count = kMeasuredCount,
                                                   .base = kLTEIntraFrequencyPacket.minimumLength,
                                                   .stride = kMeasuredNeighborSize,
                                                   .fields = kMeasuredNeighbor,
                                                   .identity = kMeasuredIdentity,
                                               }}};

/// The detected cells stand behind all measured neighbours.
constexpr ListReading kDetectedCells[] = {{.table = {
                                               .name = "detected cell",
                                               .count = kDetectedCount,
                                               .base = kLTEIntraFrequencyPacket.minimumLength,
                                               .perCount = kMeasuredNeighborSize,
                                               .counted = kMeasuredCount,
                                               .stride = kDetectedCellSize,
                                               .fields = kDetectedCell,
                                               .identity = kDetectedIdentity,
                                           }}};

constexpr PacketReading kIntraFrequencyReadings[] = {
    {.packet = kLTEIntraFrequencyPacket, .fields = kIntraFrequency}};
constexpr PacketReading kMeasuredNeighborsReadings[] = {
    {.packet = kLTEIntraFrequencyPacket, .lists = kMeasuredNeighbors}};
constexpr PacketReading kDetectedCellsReadings[] = {
    {.packet = kLTEIntraFrequencyPacket, .lists = kDetectedCells}};

// --- 0xB17F: serving-cell measurement ------------------------------------------------------------

constexpr Field kServingCellMeasurement[] = {
    {"Version", u8(13), decimal()},
    {kEARFCN, u16(17), decimal()},
    {kPhysicalCellId, u16(19).bits(0, 8), decimal()},
    {"Serving Layer Priority", u16(19).bits(9, 12), decimal()},
    {"Measured RSRP", u32(21).bits(0, 8), quarterDbm()},
    {"Average RSRP", u32(21).bits(9, 17), quarterDbm()},
    {"Measured RSRQ", u32(21).bits(18, 24), quarterDb()},
    {"Average RSRQ", u32(21).bits(25, 31), quarterDb()},
    {"Measured RSSI", u32(25).bits(0, 8), halfDbm()},
    {"Qrxlevmin", u32(25).bits(9, 14), decimal("%d dBm", -140, 2)},
    {"P_Max", u32(25).bits(15, 21), decimal("%d dBm", -30).absentAt(64, kNotPresent)},
    // Six bits never hold 64; the comparison is the packet's own all the same.
    {"Max UE Tx Power", u32(25).bits(22, 27), decimal("%d dBm", -30).absentAt(64, kNotPresent)},
    {"Srxlev", u32(29).bits(0, 6), decimal("%d dBm", -30)},
    {"Num of Consecutive DRX Cycles of S < 0", u32(29).bits(7, 12), decimal()},
    {"S Intra Search", u32(29).bits(13, 18), decimal("%d dB", 0, 2).absentAt(32, kNotPresent)},
    {"S Non Intra Search", u32(29).bits(19, 24), decimal("%d dBm", 0, 2).absentAt(32, kNotPresent)},
    {"Measurement Rules Updated", u32(29).bit(25), named(kTrueFalse, "True")},
    {"Measurement Rules", u32(29).bits(26, 29), decimal()},
};
static_assert(isLayout(kServingCellMeasurement));

constexpr PacketReading kServingCellReadings[] = {
    {.packet = kLTEServingCellPacket, .fields = kServingCellMeasurement}};

// --- 0xB180: neighbour measurements: a header and 1 to 32 records --------------------------------

constexpr Field kNeighborHeader[] = {
    {"Version", u8(13), decimal()},
    {kEARFCN, u16(17), decimal()},
    {"Qrxlevmin", u8(19).bits(0, 5), decimal("%d dBm", -140, 2)},
};
static_assert(isLayout(kNeighborHeader));

// The second antenna's offsets are shown from the first one's bits.
constexpr Field kNeighborCell[] = {
    {kPhysicalCellId, u16(0).bits(0, 8), decimal()},
    {"Measured RSSI", u32(0).bits(9, 16), halfDbm()},
    {"Measured RSRP", u32(0).bits(17, 25), halfDbm()},
    {"Average RSRP", u16(4).bits(0, 8), halfDbm()},
    {"Measured RSRQ", u16(4).bits(9, 15), quarterDb()},
    {"Average RSRQ", u8(6).bits(0, 6), quarterDb()},
    {"Srxlev", u16(6).bits(7, 13), decimal("%d dBm", -30)},
    {"Frequency Offset", u16(8), decimal()},
    {"Ant 0 Frame Offset", u16(12).bits(0, 10), decimal()},
    {"Ant 0 Sample Offset", u32(12).bits(11, 29), decimal()},
    {"Ant 1 Frame Offset", u16(12).bits(0, 10).shared(), decimal()},
    {"Ant 1 Sample Offset", u32(12).bits(11, 29).shared(), decimal()},
};
static_assert(isLayout(kNeighborCell));
constexpr Field kNeighborIdentity[] = {
    packetFieldNamed(kNeighborHeader, kEARFCN),
    fieldNamed(kNeighborCell, kPhysicalCellId),
};

constexpr ListReading kNeighborCells[] = {{.table = {
                                               .name = "neighbour",
                                               .count = u16(19).bits(6, 10),
                                               .countAddend = 1,
                                               .base = kLTENeighborPacket.minimumLength,
                                               .stride = 20,
                                               .fields = kNeighborCell,
                                               .identity = kNeighborIdentity,
                                           }}};

constexpr PacketReading kNeighborHeaderReadings[] = {
    {.packet = kLTENeighborPacket, .fields = kNeighborHeader}};
constexpr PacketReading kNeighborCellsReadings[] = {
    {.packet = kLTENeighborPacket, .lists = kNeighborCells}};

void logField(SystemLog& log, const Field& field, std::int64_t raw) {
  if (field.key == kPhysicalCellId) {
    log.log(LogPriority::Warning, "Physical Cell ID: {}\n", raw);
  } else if (field.text.kind == TextRule::Kind::Scaled) {
    // The line calls every level and quality so.
    log.log(LogPriority::Warning, "Measured RSSI: {:f}\n", scaledNumber(field.text, raw));
  }
}

}  // namespace

constexpr Section kConnectedModeMeasurementSection = {
    .name = "Connected mode LTE Intra-frequency Measurement",
    .kind = SectionKind::Dictionary,
    .readings = kIntraFrequencyReadings,
};

constexpr Section kMeasuredNeighborCellsSection = {
    .name = "Measured Neighbor Cells",
    .kind = SectionKind::List,
    .readings = kMeasuredNeighborsReadings,
};

constexpr Section kDetectedCellsSection = {
    .name = "Detected Cells",
    .kind = SectionKind::List,
    .readings = kDetectedCellsReadings,
};

constexpr Section kServingCellMeasurementSection = {
    .name = "Serving Cell Measurements",
    .kind = SectionKind::Dictionary,
    .readings = kServingCellReadings,
};

constexpr Section kNeighborMeasurementSection = {
    .name = "Neighbor Measurements",
    .kind = SectionKind::Dictionary,
    .readings = kNeighborHeaderReadings,
};

constexpr Section kNeighborCellsListSection = {
    .name = "Neighbor Cells List",
    .kind = SectionKind::List,
    .readings = kNeighborCellsReadings,
};

void NeighborCellsList::willPublish(const ListReading& list, PacketView packet,
                                    std::vector<Value>& rows) {
  if (!systemLog().accepts(LogPriority::Warning)) return;
  systemLog().log(LogPriority::Warning, "Number of neighboring cells being reported: {}\n",
                  rows.size());
  forEachRecord(list.table, packet, [&](std::size_t, const RecordPosition& position) {
    for (const Field& field : list.table.fields) {
      logField(systemLog(), field, readNumber(field.places[0], packet, position));
    }
  });
}

}  // namespace kestro
