// SPDX-License-Identifier: MIT
#include "Sources/LTE/LTEDriveTest.h"

#include <optional>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Platform/TelephonyService.h"
#include "Sources/DriveTestValues.h"
#include "Sources/ExtraPackets.h"

namespace kestro {
namespace {

constexpr unsigned kPhysicalCellIds = 504;

/// RSRQ is N times RSRP over RSSI; N, the resource blocks that RSSI is measured over, is 6 at
/// least: 10 lg 6 = 7.8 dB.
constexpr double kLeastBlocksDecibels = 7.8;

/// The log's RSSI, or what RSRP and RSRQ make of it before the log has had one.
double rssiIn(const DriveTestRow& row, double rsrp, double rsrq) {
  return numberIn(row, DriveTestColumn::TotalPower).value_or(rsrp - rsrq + kLeastBlocksDecibels);
}

/// The cell as far as the log knows it; absent without its identity.
std::optional<LTECell> cellIn(const DriveTestRow& row) {
  const auto identity = integerIn(row, DriveTestColumn::RawCellId, 10);
  if (!identity) return std::nullopt;
  return LTECell{.earfcn = 1300,
                 .uplinkEarfcn = 19300,
                 .band = 3,
                 .physicalCellId = *identity % kPhysicalCellIds,
                 .cellIdentity = *identity};
}

std::optional<LTEServing> servingIn(const DriveTestRow& row, const std::optional<LTECell>& cell) {
  const auto rsrp = numberIn(row, DriveTestColumn::Level);
  const auto rsrq = numberIn(row, DriveTestColumn::Quality);
  if (!cell || !rsrp || !rsrq) return std::nullopt;
  const LTELevel level{.rsrp = *rsrp, .rsrq = *rsrq, .rssi = rssiIn(row, *rsrp, *rsrq)};
  return LTEServing{.cell = *cell, .now = level, .average = level, .reselection = {.priority = 6}};
}

std::optional<LTENeighbour> neighbourIn(const DriveTestRow& row, const LTEServing& serving) {
  const auto rsrp = numberIn(row, DriveTestColumn::NeighbourLevel);
  const auto rsrq = numberIn(row, DriveTestColumn::NeighbourQuality);
  if (!rsrp || !rsrq) return std::nullopt;
  const LTELevel level{.rsrp = *rsrp, .rsrq = *rsrq, .rssi = serving.now.rssi};
  return LTENeighbour{.physicalCellId = (serving.cell.physicalCellId + 1) % kPhysicalCellIds,
                      .now = level,
                      .average = level};
}

Value cellMonitorList(const LTECell& cell) {
  Dictionary serving =
      cellOfKind(kTqCellMonitorRadioAccessTechnologyLTE, kTqCellMonitorCellTypeServing);
  serving.set(kTqCellMonitorTAC, Value::integer(cell.trackingAreaCode));
  serving.set(kTqCellMonitorCellId, Value::integer(cell.cellIdentity));
  serving.set(kTqCellMonitorPID, Value::integer(cell.physicalCellId));
  serving.set(kTqCellMonitorBandInfo, Value::integer(cell.band));
  serving.set(kTqCellMonitorUARFCN, Value::integer(cell.earfcn));
  return Array{serving};
}

}  // namespace

std::string_view LTEDriveTestEncoder::technology() const {
  return kTqLogChannelTechnology_Ondrel_LTE;
}

std::vector<Bytes> LTEDriveTestEncoder::messages(const DriveTestRow& row) {
  PacketList packets;
  if (row.family != DriveTestFamily::LTE) return packets.take();
  const Moment time = row.time;
  std::optional<LTECell> cell = cellIn(row);
  const auto area = integerIn(row, DriveTestColumn::Area, 16);
  if (cell && area) {
    cell->trackingAreaCode = *area;
    packets.add(lteSystemInformation(*cell, time));
    packets.add(lteAntennas(*cell, time));
    packets.add(extraPacket(kCellMonitorPacket, cellMonitorList(*cell), _coding, time));
  }
  addLists(packets, time);
  if (const auto serving = servingIn(row, cell)) addLevels(row, *serving, packets);
  _leftOutCount += packets.leftOutCount();
  return packets.take();
}

void LTEDriveTestEncoder::addLevels(const DriveTestRow& row, const LTEServing& serving,
                                    PacketList& packets) {
  const Moment time = row.time;
  packets.add(lteServingCell(serving, time));
  std::vector<LTENeighbour> neighbours;
  if (const auto neighbour = neighbourIn(row, serving)) neighbours.push_back(*neighbour);
  packets.add(lteIntraFrequency(serving, neighbours, {}, 0, time));
  if (!neighbours.empty()) packets.add(lteNeighbours(serving, neighbours, time));
}

void LTEDriveTestEncoder::addLists(PacketList& packets, Moment time) {
  if (_hasSentFiles) return;
  _hasSentFiles = true;
  packets.add(extraPacket(kSimFilesPacket, simulatedSimFiles(1), _coding, time));
  packets.add(extraPacket(
      kPacketDataContextsPacket,
      Array{
          simulatedContext({.accessPoint = "internet", .bearer = "EPS, QCI 9", .isActive = true})},
      _coding, time));
}

}  // namespace kestro
