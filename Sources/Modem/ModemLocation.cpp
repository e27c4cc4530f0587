// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemLocation.h"

#include <array>
#include <utility>

#include "Sources/Modem/BusFields.h"
#include "Sources/Modem/NmeaPosition.h"
#include "Sources/Modem/ShownText.h"

namespace kestro {
namespace {

/// The parts of the answer, by the bit that stands for each.
enum Part : std::uint64_t { kCell = 1, kDegrees = 2, kNmea = 4 };

constexpr double kMaximumLatitude = 90;
constexpr double kMaximumLongitude = 180;
constexpr double kLowest = -1'000;
constexpr double kHighest = 100'000;
constexpr int kLocationBase = 16;

bool isNetworkCode(std::string_view text, std::size_t least) {
  constexpr std::size_t kGreatest = 3;
  return text.size() >= least && text.size() <= kGreatest && numberIn(text, 10).has_value();
}

/// "1A0" as 416; 0 as nothing.
std::optional<std::uint64_t> knownNumber(std::string_view text, std::uint64_t greatest) {
  const auto number = numberIn(text, kLocationBase);
  return number && *number != 0 && *number <= greatest ? number : std::nullopt;
}

std::optional<LocationCell> cellIn(std::string_view text, BusFaults& faults) {
  constexpr std::uint64_t kGreatestLac = 0xFFFF;
  constexpr std::uint64_t kGreatestCell = 0xF'FFFF'FFFF;
  constexpr std::uint64_t kGreatestTac = 0xFF'FFFF;
  std::array<std::string_view, 5> fields;
  std::size_t count = 0;
  std::size_t begin = 0;
  while (count < fields.size() && begin <= text.size()) {
    const auto end = std::min(text.find(',', begin), text.size());
    fields[count++] = text.substr(begin, end - begin);
    begin = end + 1;
  }
  if (count < 4 || !isNetworkCode(fields[0], 3) || !isNetworkCode(fields[1], 2)) {
    faults.senseless("Modem.Location 3gpp-lac-ci", text);
    return std::nullopt;
  }
  return LocationCell{.countryCode = std::string(fields[0]),
                      .networkCode = std::string(fields[1]),
                      .locationArea = knownNumber(fields[2], kGreatestLac),
                      .cell = knownNumber(fields[3], kGreatestCell),
                      .trackingArea = knownNumber(fields[4], kGreatestTac)};
}

std::optional<PositionFix> degreesIn(const BusValue& value, BusFaults& faults) {
  constexpr std::string_view kName = "Modem.Location gps-raw";
  const BusFields fields(propertiesIn(value, kName, faults), std::string(kName), faults);
  const auto latitude = fields.real("latitude", -kMaximumLatitude, kMaximumLatitude);
  const auto longitude = fields.real("longitude", -kMaximumLongitude, kMaximumLongitude);
  if (!latitude || !longitude) return std::nullopt;
  return PositionFix{.latitude = *latitude,
                     .longitude = *longitude,
                     .altitude = fields.real("altitude", kLowest, kHighest)};
}

const std::string* textOf(const BusValue& value, std::string_view name, BusFaults& faults) {
  const auto* text = std::get_if<std::string>(&value.content);
  if (text != nullptr && value.signature == "s") return text;
  faults.wrongType(name, "s", value.signature);
  return nullptr;
}

}  // namespace

ModemLocation locationIn(const std::vector<BusValue>& answer, BusFaults& faults) {
  ModemLocation location;
  const auto* parts =
      answer.empty() ? nullptr : std::get_if<BusValue::Entries>(&answer.front().content);
  if (parts == nullptr || answer.front().signature != "a{uv}") {
    faults.wrongType("Modem.Location GetLocation", "a{uv}",
                     answer.empty() ? "" : answer.front().signature);
    return location;
  }
  std::optional<PositionFix> ofSentences;
  for (const auto& [key, value] : *parts) {
    const auto* part = std::get_if<std::uint64_t>(&key.content);
    if (part == nullptr) continue;
    if (*part == kCell) {
      const auto* text = textOf(value, "Modem.Location 3gpp-lac-ci", faults);
      if (text != nullptr && !text->empty()) location.cell = cellIn(*text, faults);
    } else if (*part == kDegrees) {
      location.fix = degreesIn(value, faults);
    } else if (*part == kNmea) {
      const auto* text = textOf(value, "Modem.Location gps-nmea", faults);
      if (text != nullptr) ofSentences = nmeaPosition(*text);
    }
  }
  if (!location.fix) location.fix = ofSentences;
  return location;
}

}  // namespace kestro
