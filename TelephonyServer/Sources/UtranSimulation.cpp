// SPDX-License-Identifier: MIT
#include "TelephonyServer/Sources/UtranSimulation.h"

#include <cmath>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "Platform/TelephonyService.h"
#include "TelephonyServer/Sources/ExtraPackets.h"

namespace kestro {
namespace {

// How often what changes rarely is said again, in steps.
constexpr unsigned kUtranListSteps = 4;

constexpr unsigned kBand = 34;  // 2010 to 2025 MHz

Value cellMonitorList(const UtranPhone& phone) {
  Array list;
  for (const UtranCellReport& report : phone.cells()) {
    const bool isServing = report.set == UtranSet::Active;
    Dictionary cell =
        cellOfKind(kTqCellMonitorRadioAccessTechnologyUTRAN2,
                   isServing ? kTqCellMonitorCellTypeServing : kTqCellMonitorCellTypeNeighbor);
    cell.set(kTqCellMonitorUARFCN, Value::integer(report.uarfcn));
    cell.set(kTqCellMonitorSCN, Value::integer(report.parameterId));
    cell.set(kTqCellMonitorRSCP, Value::integer(std::lround(report.rscp)));
    if (isServing) {
      const UtranCell serving = phone.serving();
      cell.set(kTqCellMonitorLAC, Value::integer(serving.locationArea));
      cell.set(kTqCellMonitorCellId, Value::integer(serving.cellIdentity));
      cell.set(kTqCellMonitorBandInfo, Value::integer(kBand));
    }
    list.append(cell);
  }
  return list;
}

Value contexts(const UtranPhone& phone) {
  return Array{simulatedContext({.accessPoint = "internet",
                                 .bearer = "DCH, interactive",
                                 .isActive = true,
                                 .downlinkBytes = phone.downlinkBytes(),
                                 .uplinkBytes = phone.uplinkBytes()})};
}

}  // namespace

std::string_view UtranSimulation::technology() const {
  return kTqLogChannelTechnology_Ondrel_UTRAN2;
}

std::vector<Bytes> UtranSimulation::step(std::chrono::milliseconds elapsed, Moment now) {
  if (elapsed.count() != 0) _phone.advance(elapsed);
  PacketList packets;
  packets.add(utranRrcState(utranModeName(_phone.mode()), now));
  packets.add(utranNeighbours(_phone.cells(), now));
  packets.add(utranChannels(_phone.transportChannels(), _phone.codedChannels(), now));
  addServingCell(packets, now);
  addLists(packets, now);
  ++_steps;
  return packets.take();
}

void UtranSimulation::addServingCell(PacketList& packets, Moment now) {
  if (!_phone.hasNewCell() && _steps % kUtranListSteps != 0) return;
  packets.add(utranSystemInformation(_phone.serving(), now));
  packets.add(extraPacket(kCellMonitorCode, cellMonitorList(_phone), _coding, now));
}

void UtranSimulation::addLists(PacketList& packets, Moment now) {
  if (_steps % kUtranListSteps == 0) {
    packets.add(utranGsmNeighbours(_phone.gsmCells(), now));
    packets.add(extraPacket(kPacketDataContextsCode, contexts(_phone), _coding, now));
  }
  if (repeatsRareLists(_steps)) {
    const unsigned area = _phone.serving().locationArea;
    packets.add(extraPacket(kSimFilesCode, simulatedSimFiles(area), _coding, now));
  }
}

}  // namespace kestro
