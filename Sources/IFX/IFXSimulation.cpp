// SPDX-License-Identifier: MIT
#include "Sources/IFX/IFXSimulation.h"

#include <fmt/format.h>

#include <algorithm>
#include <cmath>
#include <string>

#include "Platform/TelephonyService.h"
#include "Sources/PacketSimulation.h"
#include "Sources/World/CellNumbers.h"

namespace kestro {
namespace {

constexpr std::size_t kListedNeighbours = 6;
constexpr double kWeakestDetected = -24;  // Ec/N0, dB

// How the simulated network numbers its cells besides.
unsigned arfcn(const SimulatedCell& cell) { return 42 + (5 * cell.site + 7 * cell.sector) % 24; }
std::string baseStationCode(const SimulatedCell& cell) {
  return fmt::format("{}-{}", cell.site % 3 + 1, (cell.site + 3 * cell.sector) % 8);
}
unsigned areaCode(const SimulatedCell& cell) {
  return cell.site < RingRoad::kSites / 2 ? 601 : 602;
}

/// Without a "-0".
std::string rounded(double value) { return fmt::format("{}", std::lround(value)); }
std::string dBm(double level) { return rounded(level) + " dBm"; }
std::string halfdB(double value) { return fmt::format("{:.1f} dB", std::round(2 * value) / 2); }
std::string energyText(double value) { return halfdB(std::max(value, kWeakestDetected)); }

std::string_view umtsState(Activity activity) {
  switch (activity) {
    case Activity::Transfer:
      return "CELL_DCH";
    case Activity::Tail:
      return "CELL_FACH";
    case Activity::Idle:
      break;
  }
  return "Idle";
}

std::string_view gsmState(Activity activity) {
  switch (activity) {
    case Activity::Transfer:
      return "Packet Transfer";
    case Activity::Tail:
      return "Packet Access";
    case Activity::Idle:
      break;
  }
  return "Packet Idle";
}

void addMode(IFXMessage& message, const SimulatedPhone& phone) {
  const bool isUMTS = phone.access() == RadioAccess::UMTS;
  auto mode = message.addSection("Mode");
  mode.set("Radio Access", isUMTS ? "UMTS" : "GSM");
  mode.set("Band", isUMTS ? "2100 (I)" : "GSM 900");
  mode.set("State", isUMTS ? umtsState(phone.activity()) : gsmState(phone.activity()));
  mode.set("Bearer", isUMTS ? "HSPA+" : "EDGE");
}

void addServingCell(IFXMessage& message, const SimulatedPhone& phone) {
  const bool isUMTS = phone.access() == RadioAccess::UMTS;
  const auto& cell = (isUMTS ? phone.umts() : phone.gsm()).cells()[phone.servingCell()];
  auto section = message.addSection("Serving Cell");
  section.set("MCC", "001");
  section.set("MNC", "01");
  section.set("LAC", fmt::format("{}", areaCode(cell)));
  section.set("RAC", "1");
  if (isUMTS) {
    section.set("Cell ID", fmt::format("{}", umtsCellId(cell)));
    section.set("RNC ID", "12");
    section.set("UARFCN", "10613");
    section.set("PSC", fmt::format("{}", scramblingCode(cell)));
  } else {
    section.set("Cell ID", fmt::format("{}", gsmCellId(cell)));
    section.set("ARFCN", fmt::format("{}", arfcn(cell)));
    section.set("BSIC", baseStationCode(cell));
  }
  section.set("Time in Cell", rounded(std::floor(phone.secondsInCell())) + " s");
}

void addUMTSQuality(Dictionary& section, const SimulatedPhone& phone) {
  const auto& quality = phone.quality();
  section.set("RSCP", dBm(quality.level));
  section.set("Ec/N0", energyText(quality.quality));
  section.set("RSSI", dBm(quality.total));
  if (phone.activity() != Activity::Transfer) return;
  const double indicator = std::clamp(1.6 * quality.quality + 32, 1.0, 30.0);
  section.set("CQI", rounded(indicator));
  section.set("Tx Power", dBm(std::clamp(-quality.level - 88, -50.0, 24.0)));
}

void addGSMQuality(Dictionary& section, const SimulatedPhone& phone) {
  constexpr double kMetresPerStep = 553.5;
  const auto& quality = phone.quality();
  section.set("RxLev", dBm(quality.level));
  section.set("RxQual", rounded(std::clamp((19 - quality.quality) / 2, 0.0, 7.0)));
  section.set("C/I", halfdB(quality.quality));
  section.set("Timing Advance", rounded(std::floor(quality.distance / kMetresPerStep)));
  if (phone.activity() != Activity::Transfer) return;
  section.set("Coding Scheme", "MCS-" + rounded(std::clamp(quality.quality / 2.5, 1.0, 9.0)));
}

void addQuality(IFXMessage& message, const SimulatedPhone& phone) {
  auto section = message.addSection("Radio Quality");
  if (phone.access() == RadioAccess::UMTS) {
    addUMTSQuality(section, phone);
  } else {
    addGSMQuality(section, phone);
  }
}

Dictionary umtsCell(const SimulatedPhone& phone, const CellLevel& level) {
  const auto& cell = phone.umts().cells()[level.cell];
  return {{"PSC", fmt::format("{}", scramblingCode(cell))},
          {"RSCP", dBm(level.level)},
          {"Ec/N0", energyText(phone.energyOverNoise(level.level))}};
}

void addUMTSLists(IFXMessage& message, const SimulatedPhone& phone) {
  auto active = message.addList("Active Set", "cells that the phone is connected to");
  auto monitored = message.addList("Monitored Set", "cells that may join the active set");
  for (const auto& level : phone.umtsLevels()) {
    if (phone.activeSet().contains(level.cell)) {
      active.append(umtsCell(phone, level));
    } else if (phone.energyOverNoise(level.level) > kWeakestDetected &&
               monitored.size() <= kListedNeighbours) {
      monitored.append(umtsCell(phone, level));
    }
  }
}

void addGSMNeighbours(IFXMessage& message, const SimulatedPhone& phone) {
  constexpr double kWeakest = -108;
  auto list = message.addList("GSM Neighbours", "strongest first");
  for (const auto& level : phone.gsmLevels()) {
    const bool serves = phone.access() == RadioAccess::GSM && level.cell == phone.servingCell();
    if (serves || level.level < kWeakest) continue;
    if (list.size() > kListedNeighbours) break;
    const auto& cell = phone.gsm().cells()[level.cell];
    list.append(Dictionary{{"ARFCN", fmt::format("{}", arfcn(cell))},
                           {"BSIC", baseStationCode(cell)},
                           {"RxLev", dBm(level.level)}});
  }
}

void addThroughput(IFXMessage& message, const SimulatedPhone& phone) {
  constexpr double kMegabyte = 1e6;
  auto section = message.addSection("Throughput");
  section.set("Downlink", rounded(phone.downlinkRate()) + " kbit/s");
  section.set("Uplink", rounded(phone.uplinkRate()) + " kbit/s");
  section.set("Downlink Total", fmt::format("{:.1f} MB", phone.downlinkBytes() / kMegabyte));
  section.set("Uplink Total", fmt::format("{:.1f} MB", phone.uplinkBytes() / kMegabyte));
}

void addMobility(IFXMessage& message, const SimulatedPhone& phone) {
  auto section = message.addSection("Mobility");
  section.set("MM State", "IDLE / NORMAL SERVICE");
  section.set("GMM State", phone.activity() == Activity::Transfer ? "REGISTERED / READY"
                                                                  : "REGISTERED / STANDBY");
  section.set("Cell Changes", fmt::format("{}", phone.cellChanges()));
  section.set("Inter-RAT Changes", fmt::format("{}", phone.accessChanges()));
}

void addCar(IFXMessage& message, const SimulatedPhone& phone) {
  auto section = message.addSection("Drive");
  section.set("Speed", rounded(phone.drive().speed() * 3.6) + " km/h");
  section.set("Distance", fmt::format("{:.2f} km", phone.drive().travelled() / 1000));
  section.set("Distance to Mast", rounded(phone.quality().distance) + " m");
}

}  // namespace

IFXMessage ifxMessageOf(const SimulatedPhone& phone) {
  IFXMessage message;
  addMode(message, phone);
  addServingCell(message, phone);
  addQuality(message, phone);
  if (phone.access() == RadioAccess::UMTS) addUMTSLists(message, phone);
  addGSMNeighbours(message, phone);
  addThroughput(message, phone);
  addMobility(message, phone);
  addCar(message, phone);
  return message;
}

IFXSimulation::IFXSimulation(const PropertyListCoding& coding, std::uint64_t seed)
    : _coding(coding), _seed(seed), _phone(seed) {}

std::string_view IFXSimulation::technology() const { return kTqLogChannelTechnology_IFX; }

Result<SourceStep> IFXSimulation::next() {
  if (_hasBegun) {
    _phone.advance(kInterval);
    _time += kInterval;
  }
  _hasBegun = true;
  auto bytes = ifxMessageOf(_phone).bytes(_coding);
  if (!bytes) return failure("simulation: a message cannot be serialised");
  _message = std::move(*bytes);
  return SourceEvent{.time = _time,
                     .technology = technology(),
                     .message = _message,
                     .moment = kSimulationBegin + _time};
}

Result<void> IFXSimulation::restart() {
  _phone = SimulatedPhone(_seed);
  _time = {};
  _hasBegun = false;
  return {};
}

}  // namespace kestro
