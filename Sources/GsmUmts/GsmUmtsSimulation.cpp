// SPDX-License-Identifier: MIT
#include "Sources/GsmUmts/GsmUmtsSimulation.h"

#include <algorithm>
#include <cmath>

#include "LogGenerator/GsmUmts/UnfilledSections.h"
#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Platform/TelephonyService.h"
#include "Sources/ExtraPackets.h"
#include "Sources/World/CellNumbers.h"

namespace kestro {
namespace {

// How often what changes rarely is said again, in steps.
constexpr unsigned kBroadcastSteps = 10;
constexpr unsigned kContextSteps = 4;

constexpr std::size_t kMostUMTSNeighbours = 6;
constexpr unsigned kUarfcn = 10613;

unsigned locationArea(const SimulatedCell& cell) {
  return cell.site < RingRoad::kSites / 2 ? 601 : 602;
}

GSMCellReport gsmReport(const SimulatedPhone& phone, const CellLevel& level) {
  const SimulatedCell& cell = phone.gsm().cells()[level.cell];
  constexpr double kAccessLevel = -104;
  return {.arfcn = 42 + (5 * cell.site + 7 * cell.sector) % 24,
          .bsic = 8 * (cell.site % 3 + 1) + (cell.site + 3 * cell.sector) % 8,
          .level = level.level,
          .c1 = static_cast<int>(std::lround(level.level - kAccessLevel))};
}

UMTSCellReport umtsReport(const SimulatedPhone& phone, const CellLevel& level) {
  return {.uarfcn = kUarfcn,
          .scramblingCode = scramblingCode(phone.umts().cells()[level.cell]),
          .rscp = level.level,
          .energyPerChip = std::max(phone.energyOverNoise(level.level), -24.0)};
}

std::vector<GSMCellReport> gsmNeighbours(const SimulatedPhone& phone) {
  const bool isServing = phone.access() == RadioAccess::GSM;
  std::vector<GSMCellReport> neighbours;
  for (const CellLevel& level : phone.gsmLevels()) {
    if (neighbours.size() == kMostUMTSNeighbours) break;
    if (isServing && level.cell == phone.servingCell()) continue;
    neighbours.push_back(gsmReport(phone, level));
  }
  return neighbours;
}

std::vector<UMTSCellReport> umtsNeighbours(const SimulatedPhone& phone) {
  const bool isServing = phone.access() == RadioAccess::UMTS;
  std::vector<UMTSCellReport> neighbours;
  for (const CellLevel& level : phone.umtsLevels()) {
    if (neighbours.size() == kMostUMTSNeighbours) break;
    if (isServing && level.cell == phone.servingCell()) continue;
    neighbours.push_back(umtsReport(phone, level));
  }
  return neighbours;
}

const SimulatedCell& servingCellOf(const SimulatedPhone& phone) {
  const bool isUMTS = phone.access() == RadioAccess::UMTS;
  return (isUMTS ? phone.umts() : phone.gsm()).cells()[phone.servingCell()];
}

NetworkArea areaOf(const SimulatedPhone& phone) {
  return {.locationArea = locationArea(servingCellOf(phone))};
}

Dictionary listedServingCell(const SimulatedPhone& phone) {
  const bool isUMTS = phone.access() == RadioAccess::UMTS;
  const SimulatedCell& place = servingCellOf(phone);
  const NetworkArea area = areaOf(phone);
  Dictionary cell = cellOfKind(
      isUMTS ? kTqCellMonitorRadioAccessTechnologyUMTS : kTqCellMonitorRadioAccessTechnologyGSM,
      kTqCellMonitorCellTypeServing);
  cell.set(kTqCellMonitorMCC, Value::integer(area.countryCode));
  cell.set(kTqCellMonitorMNC, Value::integer(area.networkCode));
  cell.set(kTqCellMonitorLAC, Value::integer(area.locationArea));
  cell.set(kTqCellMonitorCellId, Value::integer(isUMTS ? umtsCellId(place) : gsmCellId(place)));
  if (!isUMTS) {
    const CellLevel& level = levelOfCell(phone.gsmLevels(), phone.servingCell());
    cell.set(kTqCellMonitorARFCN, Value::integer(gsmReport(phone, level).arfcn));
  }
  return cell;
}

Value cellMonitorList(const SimulatedPhone& phone) {
  Array list{listedServingCell(phone)};
  for (const UMTSCellReport& report : umtsNeighbours(phone)) {
    Dictionary cell =
        cellOfKind(kTqCellMonitorRadioAccessTechnologyUMTS, kTqCellMonitorCellTypeNeighbor);
    cell.set(kTqCellMonitorUARFCN, Value::integer(report.uarfcn));
    cell.set(kTqCellMonitorSCN, Value::integer(report.scramblingCode));
    cell.set(kTqCellMonitorRSCP, Value::integer(std::lround(report.rscp)));
    cell.set(kTqCellMonitorECN0, Value::integer(std::lround(report.energyPerChip)));
    list.append(cell);
  }
  for (const GSMCellReport& report : gsmNeighbours(phone)) {
    Dictionary cell =
        cellOfKind(kTqCellMonitorRadioAccessTechnologyGSM, kTqCellMonitorCellTypeNeighbor);
    cell.set(kTqCellMonitorARFCN, Value::integer(report.arfcn));
    // The list has half the level.
    cell.set(kTqCellMonitorRSSI, Value::integer(std::lround(report.level / 2)));
    list.append(cell);
  }
  return list;
}

Value contexts(const SimulatedPhone& phone) {
  return Array{simulatedContext(
      {.accessPoint = "internet",
       .bearer = phone.access() == RadioAccess::UMTS ? "HSPA, interactive" : "EDGE, interactive",
       .isActive = true,
       .downlinkBytes = phone.downlinkBytes(),
       .uplinkBytes = phone.uplinkBytes()})};
}

}  // namespace

std::string_view GsmUmtsSimulation::technology() const {
  return kTqLogChannelTechnology_Ondrel_GSM;
}

std::vector<Bytes> GsmUmtsSimulation::step(std::chrono::milliseconds elapsed, Moment now) {
  if (elapsed.count() != 0) _phone.advance(elapsed);
  _mobility.advance(elapsed, areaOf(_phone).locationArea);
  PacketList packets;
  // A ranking and the cell-monitor list empty sections that the other fills.
  if (_phone.access() == RadioAccess::UMTS) {
    addUMTS(packets, now);
    addCellLists(packets, now);
  } else {
    addCellLists(packets, now);
    addGSM(packets, now);
  }
  packets.add(gsmRadioResource(radioResourceState(), _mobility.isInCall() ? 1 : 0, now));
  addMobility(packets, now);
  if (_steps % kContextSteps == 0) {
    packets.add(extraPacket(kPacketDataContextsPacket, contexts(_phone), _coding, now));
  }
  if (repeatsRareLists(_steps)) addRare(packets, now);
  _lastAccess = _phone.access();
  ++_steps;
  return packets.take();
}

void GsmUmtsSimulation::addCellLists(PacketList& packets, Moment now) {
  packets.add(extraPacket(kCellMonitorPacket, cellMonitorList(_phone), _coding, now));
}

void GsmUmtsSimulation::addUMTS(PacketList& packets, Moment now) {
  std::vector<UMTSCellReport> active;
  const bool isConnected = _phone.activity() != Activity::Idle || _mobility.isInCall();
  for (const CellLevel& level : _phone.umtsLevels()) {
    const bool isServing = level.cell == _phone.servingCell();
    const bool isMember = isConnected ? _phone.activeSet().contains(level.cell) : isServing;
    if (isMember) active.push_back(umtsReport(_phone, level));
  }
  packets.add(umtsSets(active, _phone.quality().total, now));
  // The ranking names the GSM cells only; the UMTS ones come with the cell-monitor list.
  packets.add(gsmRanking(gsmNeighbours(_phone), now));
  if (isConnected) addLinkQuality(packets, now);
}

void GsmUmtsSimulation::addLinkQuality(PacketList& packets, Moment now) {
  constexpr std::uint32_t kBlocksPerStep = 50;
  constexpr std::uint32_t kProcesses = 6;
  const double quality = _phone.quality().quality;
  const auto errors = static_cast<std::uint32_t>(std::clamp(-quality - 6, 0.0, 12.0) / 3);
  _blocks += kBlocksPerStep;
  _blockErrors += errors;
  const TransportChannelReport channels[] = {
      {.id = 1, .blocks = _blocks, .errors = _blockErrors},
      {.id = 32, .blocks = _blocks / 4, .errors = _blockErrors / 8}};
  packets.add(umtsBlockErrors(channels, now));
  const auto bits = static_cast<std::uint32_t>(_phone.downlinkRate() * 500 / kProcesses);
  std::vector<HarqProcessReport> processes;
  for (unsigned id = 0; id < kProcesses; ++id) {
    processes.push_back(
        {.id = id, .bits = bits, .transmissions = 41, .blockErrors = (errors + id) % 5});
  }
  packets.add(hsdpaStatistics(processes, 250, now));
}

void GsmUmtsSimulation::addGSM(PacketList& packets, Moment now) {
  const GSMCellReport serving =
      gsmReport(_phone, levelOfCell(_phone.gsmLevels(), _phone.servingCell()));
  const std::vector<GSMCellReport> neighbours = gsmNeighbours(_phone);
  packets.add(gsmServingCell(serving, gsmCellId(servingCellOf(_phone)), now));
  packets.add(gsmColourCodes(neighbours, now));
  packets.add(gsmMeasurements(serving, neighbours, now));
  packets.add(umtsRanking(umtsNeighbours(_phone), now));
  const bool isDedicated = _phone.activity() == Activity::Transfer || _mobility.isInCall();
  if (isDedicated) addGSMChannel(packets, now);
  if (_steps % kBroadcastSteps == 0) {
    packets.add(gsmDiscontinuousReception(isDedicated ? 0 : 2, now));
    packets.add(gsmDiscontinuousTransmission(_mobility.isInCall(), now));
  }
}

void GsmUmtsSimulation::addGSMChannel(PacketList& packets, Moment now) {
  const unsigned first = 70 + 2 * servingCellOf(_phone).sector;
  const unsigned hopping[] = {first, first + 6, first + 12, first + 18};
  packets.add(gsmMobileAllocation(11 + servingCellOf(_phone).site, hopping, now));
  packets.add(gsmDedicatedChannel(hopping[_steps % 4], now));
}

std::string_view GsmUmtsSimulation::radioResourceState() const {
  const bool isGSM = _phone.access() == RadioAccess::GSM;
  if (_phone.access() != _lastAccess) {
    return isGSM ? "RR_W2G_INTERRAT_RESELECTION_PROGRESS" : "RR_G2W_INTERRAT_RESELECTION_PROGRESS";
  }
  if (!isGSM) return "RR_INACTIVE";
  if (_mobility.procedure() == MobilityProcedure::CallSetup) return "RR_CONNECTION_PENDING";
  if (_mobility.isInCall()) return "RR_DATA_TRANSFER";
  return _phone.activity() == Activity::Transfer ? "RR_DATA_TRANSFER" : "RR_IDLE";
}

void GsmUmtsSimulation::addMobility(PacketList& packets, Moment now) {
  packets.add(mmState(_mobility.mmState(), _mobility.mmSubState(), _mobility.updateStatus(), now));
  packets.add(
      gmmState(_mobility.gmmState(), _mobility.gmmSubState(), _mobility.gmmUpdateStatus(), now));
  packets.add(registrationState(_mobility.registrationState(), "Automatic", now));
  packets.add(servingNetwork(areaOf(_phone), _mobility.serviceType(), now));
}

void GsmUmtsSimulation::addRare(PacketList& packets, Moment now) {
  packets.add(equivalentNetwork({.networkCode = 991}, now));
  const unsigned area = areaOf(_phone).locationArea;
  packets.add(extraPacket(kSimFilesPacket, simulatedSimFiles(area), _coding, now));
  for (const PacketKind& packet : kUndescribedGSMPackets) {
    packets.add(undescribedPacket(packet, now));
  }
  for (const PacketKind& packet : kUndescribedUMTSPackets) {
    packets.add(undescribedPacket(packet, now));
  }
}

}  // namespace kestro
