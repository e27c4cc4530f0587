// SPDX-License-Identifier: MIT
#include "TelephonyServer/Sources/LteDriveTest.h"

#include <optional>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "Platform/TelephonyService.h"
#include "TelephonyServer/Sources/DriveTestValues.h"
#include "TelephonyServer/Sources/ExtraPackets.h"

namespace kestro {
namespace {

constexpr unsigned kPhysicalCellIds = 504;

/// The cell as far as the log knows it; absent without its identity.
std::optional<LteCell> cellIn(const DriveTestRow& row) {
  const auto identity = integerIn(row, DriveTestColumn::RawCellId, 10);
  if (!identity) return std::nullopt;
  return LteCell{.earfcn = 1300,
                 .uplinkEarfcn = 19300,
                 .band = 3,
                 .physicalCellId = *identity % kPhysicalCellIds,
                 .cellIdentity = *identity};
}

std::optional<LteServing> servingIn(const DriveTestRow& row, const std::optional<LteCell>& cell) {
  const auto rsrp = numberIn(row, DriveTestColumn::Level);
  const auto rsrq = numberIn(row, DriveTestColumn::Quality);
  const auto rssi = numberIn(row, DriveTestColumn::TotalPower);
  if (!cell || !rsrp || !rsrq || !rssi) return std::nullopt;
  const LteLevel level{.rsrp = *rsrp, .rsrq = *rsrq, .rssi = *rssi};
  return LteServing{.cell = *cell, .now = level, .average = level, .reselection = {.priority = 6}};
}

std::optional<LteNeighbour> neighbourIn(const DriveTestRow& row, const LteServing& serving) {
  const auto rsrp = numberIn(row, DriveTestColumn::NeighbourLevel);
  const auto rsrq = numberIn(row, DriveTestColumn::NeighbourQuality);
  if (!rsrp || !rsrq) return std::nullopt;
  const LteLevel level{.rsrp = *rsrp, .rsrq = *rsrq, .rssi = serving.now.rssi};
  return LteNeighbour{.physicalCellId = (serving.cell.physicalCellId + 1) % kPhysicalCellIds,
                      .now = level,
                      .average = level};
}

Value cellMonitorList(const LteCell& cell) {
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

std::string_view LteDriveTestEncoder::technology() const {
  return kTqLogChannelTechnology_Ondrel_LTE;
}

std::vector<Bytes> LteDriveTestEncoder::messages(const DriveTestRow& row) {
  PacketList packets;
  if (row.family != DriveTestFamily::Lte) return packets.take();
  const Moment time = row.time;
  std::optional<LteCell> cell = cellIn(row);
  const auto area = integerIn(row, DriveTestColumn::Area, 16);
  if (cell && area) {
    cell->trackingAreaCode = *area;
    packets.add(lteSystemInformation(*cell, time));
    packets.add(lteAntennas(*cell, time));
    packets.add(extraPacket(kCellMonitorCode, cellMonitorList(*cell), _coding, time));
  }
  addLists(packets, time);
  const auto serving = servingIn(row, cell);
  if (!serving) return packets.take();
  packets.add(lteServingCell(*serving, time));
  std::vector<LteNeighbour> neighbours;
  if (const auto neighbour = neighbourIn(row, *serving)) neighbours.push_back(*neighbour);
  packets.add(lteIntraFrequency(*serving, neighbours, {}, 0, time));
  if (!neighbours.empty()) packets.add(lteNeighbours(*serving, neighbours, time));
  return packets.take();
}

void LteDriveTestEncoder::addLists(PacketList& packets, Moment time) {
  if (_hasSentFiles) return;
  _hasSentFiles = true;
  packets.add(extraPacket(kSimFilesCode, simulatedSimFiles(1), _coding, time));
  packets.add(extraPacket(
      kPacketDataContextsCode,
      Array{
          simulatedContext({.accessPoint = "internet", .bearer = "EPS, QCI 9", .isActive = true})},
      _coding, time));
}

}  // namespace kestro
