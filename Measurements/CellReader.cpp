// SPDX-License-Identifier: MIT
#include "Measurements/CellReader.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <string>

#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

constexpr double kGreatestNumber = 4'294'967'295.0;

std::optional<double> hexadecimal(std::string_view text) {
  std::uint32_t number = 0;
  const char* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number, 16);
  if (error != std::errc() || stop != end) return std::nullopt;
  return number;
}

/// "2-5": 8 × the network's colour + the base station's.
std::optional<double> colours(std::string_view text) {
  const auto isColour = [](char c) { return c >= '0' && c <= '7'; };
  if (text.size() != 3 || text[1] != '-' || !isColour(text[0]) || !isColour(text[2])) {
    return std::nullopt;
  }
  return 8 * (text[0] - '0') + (text[2] - '0');
}

std::string shownText(const MeasuredValue& value) {
  TextBuffer text;
  writeShown(value, text);
  return std::string(text.text());
}

std::optional<double> readValue(const CellKey& key, const MeasuredValue& value) {
  switch (key.reading) {
    case CellReading::Number:
      if (!value.hasNumber()) return std::nullopt;
      return value.number + key.offset;
    case CellReading::Hexadecimal:
      return hexadecimal(shownText(value));
    case CellReading::Colours:
      return colours(shownText(value));
  }
  return std::nullopt;
}

/// A log of a drive knows neither channels nor networks; the encoder made them up.
constexpr CellField kMadeUp[] = {CellField::Channel, CellField::Physical, CellField::Band,
                                 CellField::CountryCode, CellField::NetworkCode};

void removeMadeUp(CellObservation& observation) {
  // A scrambling code is what is left of the log's identity.
  if (observation.radio == Radio::UMTS) {
    observation.logCode = observation.number(CellField::Physical);
  }
  for (const CellField field : kMadeUp) observation.field(field).reset();
}

}  // namespace

std::optional<std::uint32_t> CellObservation::number(CellField field) const {
  const auto value = fields[static_cast<std::size_t>(field)];
  if (!value || *value < 0 || *value > kGreatestNumber || *value != std::floor(*value)) {
    return std::nullopt;
  }
  return static_cast<std::uint32_t>(*value);
}

std::span<const CellObservation> CellReader::read(const MeasuredMessage& message) {
  _observations.clear();
  _keys.clear();
  _open.clear();
  _namedRadio.reset();
  for (std::size_t at = 0; at < message.measured.values.size(); ++at) takeValue(message, at);
  finish(message);
  return _observations;
}

const CellReader::Roles& CellReader::rolesOf(const SeriesGroup& group) {
  const auto [place, isNew] = _roles.try_emplace(&group);
  Roles& roles = place->second;
  if (!isNew) return roles;
  for (const CellSection& section : cellSections()) {
    if (section.technology != group.technology || section.section != group.section) continue;
    for (std::size_t i = 0; i < section.keys.size(); ++i) {
      if (section.keys[i].key == group.key) roles.roles.push_back({&section, i});
    }
  }
  roles.namesRadio = std::ranges::any_of(radioNameKeys(), [&](const RadioNameKey& row) {
    return row.technology == group.technology && row.section == group.section &&
           row.key == group.key;
  });
  return roles;
}

void CellReader::takeValue(const MeasuredMessage& message, std::size_t at) {
  const MeasuredValue& value = message.measured.values[at];
  const Roles& roles = rolesOf(*value.series->group);
  if (roles.namesRadio) _namedRadio = radioNamed(shownText(value));
  for (const Role& role : roles.roles) {
    if (role.section->code != 0 && role.section->code != message.measured.code) continue;
    set(observationOf(*role.section, value), role, value, at);
  }
}

CellObservation& CellReader::observationOf(const CellSection& section, const MeasuredValue& value) {
  const auto [place, isNew] = _open.try_emplace(&section);
  if (!isNew && place->second.row == value.row) return _observations[place->second.observation];
  place->second = {.row = value.row, .observation = _observations.size()};
  CellObservation& observation = _observations.emplace_back();
  _keys.emplace_back();
  observation.section = &section;
  observation.radio = section.radio;
  const Item* item = value.series->item;
  if (item == nullptr) return observation;
  // What identifies a row may stand in the packet's head.
  for (const CellKey& key : section.keys) {
    const auto part = std::ranges::find(item->parts, key.key, &ItemPart::key);
    if (part != item->parts.end() && part->text.empty() == false &&
        key.reading == CellReading::Number) {
      observation.field(key.field) = static_cast<double>(part->number) + key.offset;
    }
  }
  return observation;
}

void CellReader::set(CellObservation& observation, const Role& role, const MeasuredValue& value,
                     std::size_t at) {
  const CellKey& key = role.section->keys[role.key];
  const auto index = static_cast<std::size_t>(key.field);
  const auto read = readValue(key, value);
  // Of two keys for one field the one that stands later in the table counts.
  std::size_t& setBy = _keys[static_cast<std::size_t>(&observation - _observations.data())][index];
  if (!read || role.key < setBy) return;
  setBy = role.key;
  observation.fields[index] = read;
  if (key.field == CellField::Level) observation.levelAt = at;
  if (key.field == CellField::Quality) observation.qualityAt = at;
}

void CellReader::finish(const MeasuredMessage& message) {
  // In a message of IFX nothing is made up.
  const bool hasMadeUp =
      message.isFromDriveTest && message.technology != kTqLogChannelTechnology_IFX;
  for (CellObservation& observation : _observations) {
    if (observation.section->isOfNamedRadio && _namedRadio) observation.radio = *_namedRadio;
    if (hasMadeUp) removeMadeUp(observation);
  }
  std::ranges::stable_sort(_observations, {}, [](const CellObservation& observation) {
    return observation.section->use;
  });
}

}  // namespace kestro
