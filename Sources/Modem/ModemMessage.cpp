// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemMessage.h"

#include <fmt/chrono.h>
#include <fmt/format.h>
#include <fmt/ranges.h>

#include <chrono>

#include "Sources/Modem/ModemCells.h"
#include "Sources/Modem/ModemSections.h"
#include "Sources/Modem/ModemStatus.h"

namespace kestro {
namespace {

// Receivers put the only value of a section in the section's place, without its name.
void keepNames(Dictionary section) {
  if (section.size() == 1) section.set("Other Values", "not reported");
}

/// The serving cell's values go to `serving`, those of all others to `neighbours`; a second serving
/// cell, of carriers that are used together, says so.
void addCells(const ModemFollower& follower, BusFaults& faults, Dictionary& serving,
              Array& neighbours) {
  if (follower.cells()) {
    bool hasServing = false;
    for (const BusProperties& cell : *follower.cells()) {
      Dictionary values = cellValues(cell, faults);
      if (values.empty()) continue;
      const bool isServing = isServingCell(cell, faults);
      if (isServing && !hasServing) {
        hasServing = true;
        for (const auto& [key, value] : values) serving.set(key, value);
        continue;
      }
      values.set("Role", isServing ? "serving, too" : "neighbour");
      neighbours.append(values);
    }
  }
  if (follower.location().cell) addLocation(*follower.location().cell, serving);
}

void addMode(const ModemFollower& follower, bool isPersonal, Moment now, Dictionary& mode) {
  const auto second = std::chrono::floor<std::chrono::seconds>(now);
  mode.set("Time", fmt::format("{:%Y-%m-%d %H:%M:%S}", fmt::gmtime(second)));
  const auto [state, help] = statusOf(follower);
  mode.set("State", state);
  if (!help.empty()) mode.set("Help", help);
  if (!follower.path().empty()) addModem(follower, isPersonal, mode);
  if (const auto missing = notReported(follower); !missing.empty()) {
    mode.set("Not Reported", missing);
  }
  const auto others = otherModems(follower);
  if (!others.empty()) mode.set("Other Modems", fmt::format("{}", fmt::join(others, "; ")));
}

void addPosition(const KnownPosition& known, Dictionary& position) {
  if (known.fix) {
    constexpr std::string_view kDegrees = "{:.6f}";
    position.set("Latitude", fmt::format(kDegrees, known.fix->latitude));
    position.set("Longitude", fmt::format(kDegrees, known.fix->longitude));
    if (known.fix->altitude) {
      position.set("Altitude", fmt::format("{:.1f} m", *known.fix->altitude));
    }
    if (known.fix->speed) position.set("Speed", fmt::format("{:.1f} km/h", *known.fix->speed));
    if (known.fix->course) position.set("Course", fmt::format("{:.1f}", *known.fix->course));
  }
  if (!known.origin.empty()) position.set("Source", known.origin);
}

}  // namespace

IFXMessage modemMessage(const ModemFollower& follower, const KnownPosition& position,
                        bool isPersonal, Moment now, BusFaults& faults) {
  IFXMessage message;
  Dictionary mode = message.addSection("Mode");
  Dictionary serving = message.addSection("Serving Cell");
  Dictionary quality = message.addSection("Radio Quality");
  Array neighbours = message.addList("Neighbour Cells", "what the modem measures besides");
  Dictionary registration = message.addSection("Registration");
  Dictionary sim = message.addSection("SIM");
  Array connections = message.addList("Data Connections", "the modem's bearers");
  Dictionary place = message.addSection("Position");
  addMode(follower, isPersonal, now, mode);
  if (!follower.path().empty()) {
    addCells(follower, faults, serving, neighbours);
    addQuality(follower, quality);
    addRegistration(follower, registration);
    addSim(follower, isPersonal, sim);
    addConnections(follower, isPersonal, connections);
  }
  addPosition(position, place);
  for (const Dictionary& section : {serving, quality, registration, sim, place}) keepNames(section);
  return message;
}

}  // namespace kestro
