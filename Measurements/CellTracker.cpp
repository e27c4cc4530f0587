// SPDX-License-Identifier: MIT
#include "Measurements/CellTracker.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Measurements/PacketText.h"

namespace kestro {
namespace {

constexpr Radio kServingRadios[] = {Radio::LTE,     Radio::UMTS, Radio::GSM,
                                    Radio::UTRATDD, Radio::OneX, Radio::EVDO};

/// The radio under whose number areas and networks are kept: GSM and UMTS share them, and so do the
/// radios of CDMA2000.
Radio regionRadio(Radio radio) {
  if (radio == Radio::UMTS) return Radio::GSM;
  return radio == Radio::EVDO ? Radio::OneX : radio;
}

std::string_view areaName(Radio radio) {
  switch (regionRadio(radio)) {
    case Radio::LTE:
      return "tracking area";
    case Radio::OneX:
      return "packet zone";
    default:
      return "location area";
  }
}

/// Country and network as numbering plans write them; of CDMA2000 system and network identity.
std::string networkText(const CellObservation& observation) {
  const auto country = observation.number(CellField::CountryCode);
  const auto network = observation.number(CellField::NetworkCode);
  if (!country || !network) return {};
  return observation.radio == Radio::OneX ? fmt::format("{}-{}", *country, *network)
                                          : fmt::format("{:03}-{:02}", *country, *network);
}

bool isListOfOne(const CellObservation& first, const CellObservation& other) {
  return first.section == other.section;
}

}  // namespace

void CellTracker::take(const MeasuredMessage& message) {
  _values.clear();
  countServing(message.time);
  // The states of a log's messages are made up.
  if (!message.isFromDriveTest) _serving.noteConnectedMode(message);
  auto rest = _reader.read(message);
  while (!rest.empty()) {
    std::size_t count = 1;
    if (rest[0].section->use == CellUse::ActiveSet) {
      while (count < rest.size() && isListOfOne(rest[0], rest[count])) ++count;
      takeActiveSet(message, rest.first(count));
    } else {
      takeObservation(message, rest[0]);
    }
    rest = rest.subspan(count);
  }
}

void CellTracker::countServing(Moment time) {
  const auto before = std::exchange(_lastTime, time);
  if (!before || time < *before || time - *before >= kSilence) return;
  for (const Radio radio : kServingRadios) {
    const auto& serving = _serving.of(radio);
    if (serving && serving->cell) _cells.at(*serving->cell).served += time - *before;
  }
}

void CellTracker::takeObservation(const MeasuredMessage& message,
                                  const CellObservation& observation) {
  switch (observation.section->use) {
    case CellUse::Deciding:
      _lastDecided[static_cast<std::size_t>(observation.radio)] = message.time;
      decide(message, observation);
      return;
    case CellUse::Fallback:
      if (fallbackDecides(message, observation.radio)) return decide(message, observation);
      absorb(message, observation, servingSight(observation, message.time));
      return;
    case CellUse::Serving:
      absorb(message, observation, servingSight(observation, message.time));
      return;
    case CellUse::Network:
      for (const Radio radio : {Radio::GSM, Radio::UMTS}) {
        if (_serving.of(radio)) return takeRegion(message, observation, radio);
      }
      takeRegion(message, observation, observation.radio);
      return;
    case CellUse::ActiveSet:
    case CellUse::Neighbour:
      absorb(message, observation, sightOf(observation, message.time));
      return;
  }
}

void CellTracker::takeActiveSet(const MeasuredMessage& message,
                                std::span<const CellObservation> rows) {
  const auto& serving = _serving.of(rows[0].radio);
  const auto isServing = [&](const CellObservation& row) {
    if (!serving) return false;
    return row.logCode
               ? serving->name.logCode == row.logCode
               : serving->isPair(row.number(CellField::Channel), row.number(CellField::Physical));
  };
  const auto levelOf = [](const CellObservation& row) {
    return row.field(CellField::Level).value_or(-1'000);
  };
  auto chosen = std::ranges::find_if(rows, isServing);
  if (chosen == rows.end()) chosen = std::ranges::max_element(rows, {}, levelOf);
  decide(message, *chosen);
  for (auto row = rows.begin(); row != rows.end(); ++row) {
    if (row != chosen) absorb(message, *row, sightOf(*row, message.time));
  }
}

bool CellTracker::fallbackDecides(const MeasuredMessage& message, Radio radio) {
  auto& last = _lastDecided[static_cast<std::size_t>(radio)];
  if (!last || message.time < *last) last = message.time;
  return message.time - *last >= kFallbackAfter;
}

void CellTracker::decide(const MeasuredMessage& message, const CellObservation& observation) {
  Sight sight = sightOf(observation, message.time);
  if (sight.cell.name.isEmpty()) {
    absorb(message, observation, servingSight(observation, message.time));
    return;
  }
  sight.isServing = true;
  sight.cell.cell = _cells.see(sight.cell.name, message.time);
  absorb(message, observation, sight);
  _serving.decide(observation.radio, sight.cell, message);
  takeRegion(message, observation, observation.radio);
}

CellTracker::Sight CellTracker::sightOf(const CellObservation& observation, Moment time) const {
  const Radio radio = observation.radio;
  const auto& serving = _serving.of(radio);
  Sight sight{.cell = {.name = {.radio = radio}}};
  ServingCell& cell = sight.cell;
  cell.channel = observation.number(CellField::Channel);
  cell.physical = observation.number(CellField::Physical);
  cell.ownBand = observation.number(CellField::Band);
  if (!cell.channel && serving && observation.section->isOnServingChannel) {
    cell.channel = serving->channel;
    cell.ownBand = serving->ownBand;
  }
  if (const auto identity = observation.number(CellField::Identity)) {
    cell.name.identity = identity;
    sight.isServing = serving && serving->name == cell.name;
  } else if (observation.logCode) {
    cell.name.logCode = observation.logCode;
    sight.isServing = serving && serving->name == cell.name;
  } else if (serving && serving->isPair(cell.channel, cell.physical)) {
    sight = {.cell = *serving, .isServing = true};
  } else if (cell.physical) {
    if (cell.channel) {
      cell.name.identity = _identities.identityOf(radio, *cell.channel, *cell.physical, time);
    }
    cell.isAssumed = cell.name.identity.has_value();
    if (!cell.isAssumed) {
      cell.name.channel = cell.channel;
      cell.name.physical = cell.physical;
    }
  }
  return sight;
}

CellTracker::Sight CellTracker::servingSight(const CellObservation& observation,
                                             Moment time) const {
  Sight sight = sightOf(observation, time);
  const auto& serving = _serving.of(observation.radio);
  if (!sight.cell.name.isEmpty() || !serving) return sight;
  Sight own{.cell = *serving, .isServing = true};
  if (sight.cell.channel) own.cell.channel = sight.cell.channel;
  if (sight.cell.ownBand) own.cell.ownBand = sight.cell.ownBand;
  return own;
}

void CellTracker::absorb(const MeasuredMessage& message, const CellObservation& observation,
                         const Sight& sight) {
  const ServingCell& seen = sight.cell;
  if (seen.name.isEmpty()) return;
  const auto id = _cells.see(seen.name, message.time);
  if (seen.name.identity && !seen.isAssumed && seen.channel && seen.physical) {
    _identities.know(observation.radio, *seen.channel, *seen.physical, *seen.name.identity,
                     message.time);
  }
  if (auto& serving = _serving.of(observation.radio);
      sight.isServing && serving && serving->name == seen.name) {
    if (seen.channel) serving->channel = seen.channel;
    if (seen.physical) serving->physical = seen.physical;
    if (seen.ownBand) serving->ownBand = seen.ownBand;
    if (observation.section->use == CellUse::Serving) {
      takeRegion(message, observation, observation.radio);
    }
  }
  if (!id) return;
  Cell& cell = _cells.at(*id);
  if (seen.channel) cell.channel = seen.channel;
  if (seen.physical) cell.physical = seen.physical;
  if (seen.ownBand) cell.ownBand = seen.ownBand;
  cell.isAssumed = cell.isAssumed || seen.isAssumed;
  Sight kept = sight;
  kept.cell.cell = id;
  addLevels(observation, kept, message.time);
}

void CellTracker::addLevels(const CellObservation& observation, const Sight& sight, Moment time) {
  const CellId id = *sight.cell.cell;
  Cell& cell = _cells.at(id);
  const CellValue value{
      .cell = id, .isServing = sight.isServing, .isAssumed = sight.cell.isAssumed};
  if (const auto level = observation.field(CellField::Level)) {
    cell.level.add(*level);
    cell.lastLevel = time;
    _values.push_back(value);
    _values.back().at = *observation.levelAt;
  }
  if (const auto quality = observation.field(CellField::Quality)) {
    cell.quality.add(*quality);
    _values.push_back(value);
    _values.back().at = *observation.qualityAt;
    _values.back().isQuality = true;
  }
}

CellTracker::Region& CellTracker::regionOf(Radio radio) {
  return _regions[static_cast<std::size_t>(regionRadio(radio))];
}

void CellTracker::takeRegion(const MeasuredMessage& message, const CellObservation& observation,
                             Radio radio) {
  Region& region = regionOf(radio);
  if (std::string network = networkText(observation); !network.empty()) {
    const std::string before = std::exchange(region.network, std::move(network));
    if (!before.empty() && before != region.network) {
      tellRegion(EventKind::Network, message, radio, before, region.network);
    }
  }
  if (const auto area = observation.number(CellField::Area)) {
    const auto before = std::exchange(region.area, area);
    if (before && before != area) {
      tellRegion(EventKind::Area, message, radio, fmt::format("{}", *before),
                 fmt::format("{}", *area));
    }
  }
  // An area that is told before its cell is not the old cell's: only what decides gives a cell one.
  const auto& serving = _serving.of(radio);
  const CellUse use = observation.section->use;
  if (use == CellUse::Network || use == CellUse::Fallback || !serving || !serving->cell) return;
  Cell& cell = _cells.at(*serving->cell);
  cell.area = region.area;
  cell.network = region.network;
}

void CellTracker::tellRegion(EventKind kind, const MeasuredMessage& message, Radio radio,
                             std::string from, std::string to) const {
  _sink({.kind = kind,
         .time = message.time,
         .message = message.number,
         .technology = std::string(nameOfRadio(radio)),
         .subject = std::string(kind == EventKind::Area ? areaName(radio) : "network"),
         .from = std::move(from),
         .to = std::move(to),
         .toldBy = packetText(message.measured.code)});
}

}  // namespace kestro
