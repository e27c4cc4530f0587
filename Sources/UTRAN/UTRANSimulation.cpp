// SPDX-License-Identifier: MIT
#include "Sources/UTRAN/UTRANSimulation.h"

#include <cmath>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Platform/TelephonyService.h"
#include "Sources/ExtraPackets.h"

namespace kestro {
namespace {

// How often what changes rarely is said again, in steps.
constexpr unsigned kUTRANListSteps = 4;

constexpr unsigned kBand = 34;  // 2010 to 2025 MHz

Value cellMonitorList(const UTRANPhone& phone) {
  Array list;
  for (const UTRANCellReport& report : phone.cells()) {
    const bool isServing = report.set == UTRANSet::Active;
    Dictionary cell =
        cellOfKind(kTqCellMonitorRadioAccessTechnologyUTRAN2,
                   isServing ? kTqCellMonitorCellTypeServing : kTqCellMonitorCellTypeNeighbor);
    cell.set(kTqCellMonitorUARFCN, Value::integer(report.uarfcn));
    cell.set(kTqCellMonitorSCN, Value::integer(report.parameterId));
    cell.set(kTqCellMonitorRSCP, Value::integer(std::lround(report.rscp)));
    if (isServing) {
      const UTRANCell serving = phone.serving();
      cell.set(kTqCellMonitorLAC, Value::integer(serving.locationArea));
      cell.set(kTqCellMonitorCellId, Value::integer(serving.cellIdentity));
      cell.set(kTqCellMonitorBandInfo, Value::integer(kBand));
    }
    list.append(cell);
  }
  return list;
}

Value contexts(const UTRANPhone& phone) {
  return Array{simulatedContext({.accessPoint = "internet",
                                 .bearer = "DCH, interactive",
                                 .isActive = true,
                                 .downlinkBytes = phone.downlinkBytes(),
                                 .uplinkBytes = phone.uplinkBytes()})};
}

}  // namespace

std::string_view UTRANSimulation::technology() const {
  return kTqLogChannelTechnology_Ondrel_UTRAN2;
}

std::vector<Bytes> UTRANSimulation::step(std::chrono::milliseconds elapsed, Moment now) {
  if (elapsed.count() != 0) _phone.advance(elapsed);
  PacketList packets;
  packets.add(utranRrcState(_phone.mode(), now));
  packets.add(utranNeighbours(_phone.cells(), now));
  packets.add(utranChannels(_phone.transportChannels(), _phone.codedChannels(), now));
  addServingCell(packets, now);
  addLists(packets, now);
  ++_steps;
  return packets.take();
}

void UTRANSimulation::addServingCell(PacketList& packets, Moment now) {
  if (!_phone.hasNewCell() && _steps % kUTRANListSteps != 0) return;
  packets.add(utranSystemInformation(_phone.serving(), now));
  packets.add(extraPacket(kCellMonitorPacket, cellMonitorList(_phone), _coding, now));
}

void UTRANSimulation::addLists(PacketList& packets, Moment now) {
  if (_steps % kUTRANListSteps == 0) {
    packets.add(utranGSMNeighbours(_phone.gsmCells(), now));
    packets.add(extraPacket(kPacketDataContextsPacket, contexts(_phone), _coding, now));
  }
  if (repeatsRareLists(_steps)) {
    const unsigned area = _phone.serving().locationArea;
    packets.add(extraPacket(kSimFilesPacket, simulatedSimFiles(area), _coding, now));
  }
}

}  // namespace kestro
