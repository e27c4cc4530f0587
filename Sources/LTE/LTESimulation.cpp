// SPDX-License-Identifier: MIT
#include "Sources/LTE/LTESimulation.h"

#include <algorithm>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Platform/TelephonyService.h"
#include "Sources/ExtraPackets.h"
#include "Sources/LTE/LTEPackets.h"

namespace kestro {
namespace {

// How often what changes rarely is said again, in steps.
constexpr unsigned kListSteps = 4;
constexpr unsigned kTechnologySteps = 20;

constexpr std::size_t kReportedNeighbours = 4;  // with their levels; the others are only detected

Value cellMonitorList(const LTEPhone& phone) {
  const LTEServing serving = phone.serving();
  Dictionary cell =
      cellOfKind(kTqCellMonitorRadioAccessTechnologyLTE, kTqCellMonitorCellTypeServing);
  cell.set(kTqCellMonitorTAC, Value::integer(serving.cell.trackingAreaCode));
  cell.set(kTqCellMonitorCellId, Value::integer(serving.cell.cellIdentity));
  cell.set(kTqCellMonitorPID, Value::integer(serving.cell.physicalCellId));
  cell.set(kTqCellMonitorBandInfo, Value::integer(serving.cell.band));
  cell.set(kTqCellMonitorUARFCN, Value::integer(serving.cell.earfcn));
  Array list{cell};
  for (const LTENeighbour& neighbour : phone.neighbours()) {
    Dictionary other =
        cellOfKind(kTqCellMonitorRadioAccessTechnologyLTE, kTqCellMonitorCellTypeNeighbor);
    other.set(kTqCellMonitorPID, Value::integer(neighbour.physicalCellId));
    other.set(kTqCellMonitorUARFCN, Value::integer(serving.cell.earfcn));
    list.append(other);
  }
  return list;
}

Value contexts(const LTEPhone& phone) {
  return Array{simulatedContext({.accessPoint = "internet",
                                 .bearer = "EPS, QCI 9",
                                 .isActive = true,
                                 .downlinkBytes = phone.downlinkBytes(),
                                 .uplinkBytes = phone.uplinkBytes()}),
               simulatedContext({.accessPoint = "ims", .bearer = "EPS, QCI 5", .isActive = true})};
}

/// The candidates take turns: the other LTE frequency, and the older networks beside it.
LTECandidate candidateInTurn(const LTEPhone& phone, unsigned turn) {
  const LTECarrier& other = phone.otherCarrier();
  const LTECell cell = other.cell(phone.otherCell());
  const auto code = static_cast<std::int64_t>(cell.physicalCellId);
  switch (turn % 4) {
    case 1:
      return {.technology = "UTRAN",
              .priority = 2,
              .fields = {{"U ARFCN", 10613}, {"PSC", 24 + code % 400}}};
    case 3:
      return {.technology = "GERAN",
              .priority = 1,
              .fields = {{"ARFCN", 42 + code % 24}, {"Band", 8}, {"BSIC ID", code % 64}}};
    default:
      return {.technology = "LTE",
              .priority = other.reselection().priority,
              .fields = {{"E ARFCN", cell.earfcn}, {"Cell ID", code}}};
  }
}

}  // namespace

std::string_view LTESimulation::technology() const { return kTqLogChannelTechnology_Ondrel_LTE; }

std::vector<Bytes> LTESimulation::step(std::chrono::milliseconds elapsed, Moment now) {
  if (elapsed.count() != 0) _phone.advance(elapsed);
  PacketList packets;
  addBroadcast(packets, now);
  addMeasurements(packets, now);
  addReselection(packets, now);
  addLists(packets, now);
  ++_steps;
  return packets.take();
}

void LTESimulation::addBroadcast(PacketList& packets, Moment now) {
  if (!_phone.hasNewCell() && _steps % kListSteps != 0) return;
  const LTECell cell = _phone.serving().cell;
  packets.add(lteSystemInformation(cell, now));
  packets.add(lteAntennas(cell, now));
}

void LTESimulation::addMeasurements(PacketList& packets, Moment now) {
  const LTEServing serving = _phone.serving();
  const std::vector<LTENeighbour> neighbours = _phone.neighbours();
  const std::size_t reported = std::min(neighbours.size(), kReportedNeighbours);
  std::vector<unsigned> detected;
  for (std::size_t i = reported; i < neighbours.size(); ++i) {
    detected.push_back(neighbours[i].physicalCellId);
  }
  const auto measured = std::span(neighbours).first(reported);
  const unsigned subframe = _steps * 500 % 10'240;  // milliseconds within 1,024 frames
  packets.add(lteServingCell(serving, now));
  packets.add(lteIntraFrequency(serving, measured, detected, subframe, now));
  packets.add(lteNeighbours(serving, measured, now));
}

void LTESimulation::addReselection(PacketList& packets, Moment now) {
  if (!_phone.hasNewCell() && _steps % kListSteps != 0) return;
  packets.add(
      lteReselection(_phone.serving(), candidateInTurn(_phone, _steps / kTechnologySteps), now));
}

void LTESimulation::addLists(PacketList& packets, Moment now) {
  if (repeatsRareLists(_steps)) {
    const unsigned area = _phone.serving().cell.trackingAreaCode;
    packets.add(extraPacket(kSimFilesPacket, simulatedSimFiles(area), _coding, now));
  }
  // What cells broadcast takes the channel out of the section that this list puts it into.
  if (_phone.hasNewCell() || _steps % kListSteps == 0) {
    packets.add(extraPacket(kCellMonitorPacket, cellMonitorList(_phone), _coding, now));
  }
  if (_steps % kListSteps == 0) {
    packets.add(extraPacket(kPacketDataContextsPacket, contexts(_phone), _coding, now));
  }
}

}  // namespace kestro
