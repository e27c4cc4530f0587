// SPDX-License-Identifier: MIT
#include "LogGenerator/LogGenerator.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMLogGenerator.h"
#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"
#include "Platform/Clock.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

struct TechnologyRow {
  std::string_view technology;
  std::unique_ptr<LogGenerator> (*generator)(const GeneratorServices& services);
};

template <class Generator>
std::unique_ptr<LogGenerator> makeGenerator(const GeneratorServices& services) {
  return Generator::generator(services);
}

/// Tested in this order; a technology whose generator does not exist has no row.
constexpr std::array kTechnologies = {
    TechnologyRow{kTqLogChannelTechnology_IFX, makeGenerator<GSMLogGenerator>},
    TechnologyRow{kTqLogChannelTechnology_Ondrel_GSM, makeGenerator<Ondrel_GSMLogGenerator>},
    TechnologyRow{kTqLogChannelTechnology_Ondrel_CDMA, makeGenerator<C2KLogGenerator>},
    TechnologyRow{kTqLogChannelTechnology_Ondrel_LTE, makeGenerator<LTELogGenerator>},
    TechnologyRow{kTqLogChannelTechnology_Ondrel_UTRAN2, makeGenerator<UTRANLogGenerator>},
};

constexpr auto kTechnologyNames = [] {
  std::array<std::string_view, kTechnologies.size()> names;
  for (std::size_t i = 0; i < names.size(); ++i) names[i] = kTechnologies[i].technology;
  return names;
}();

/// The entry for the state as it is now, up to the first value that the state lacks.
Dictionary makeHistoryEntry(const Dictionary& state, const Clock& clock) {
  Dictionary entry;
  for (const std::string_view key : {kStateDisplayState, kStateDisplay, kStateExtraInfo}) {
    const Value& value = state[key];
    if (value.isNull()) return entry;
    entry.set(key, value.deepCopy());
  }
  const std::string date = dateText(clock, clock.now());
  entry.set(kHistoryDate, date);
  entry.set(kHistoryDescription, fmt::format("Snapshot ({})", date));
  return entry;
}

}  // namespace

void LogGenerator::init() {
  _services.systemLog.log(LogPriority::Warning, "Creating Log object: {}", addressText(this));
}

std::span<const std::string_view> LogGenerator::stateKeys() const {
  static constexpr std::array kKeys = {kStateDisplay, kStateExtraInfo};
  return kKeys;
}

void LogGenerator::explainMessage(ByteView /*message*/, const ExplainVisitor& /*visit*/) const {}

void LogGenerator::catalogue(const CatalogueVisitor& /*visit*/) const {}

void LogGenerator::outline(const OutlineVisitor& /*visit*/) const {}

std::span<const std::string_view> LogGenerator::technologies() { return kTechnologyNames; }

std::unique_ptr<LogGenerator> LogGenerator::generatorFromTechnology(
    const GeneratorServices& services, std::string_view technology) {
  const auto row = std::ranges::find(kTechnologies, technology, &TechnologyRow::technology);
  return row == kTechnologies.end() ? nullptr : row->generator(services);
}

void LogGenerator::updateHistoryInState(Dictionary& state, const Clock& clock) {
  appendToHistory(state, makeHistoryEntry(state, clock));
}

void LogGenerator::appendToHistory(Dictionary& state, const Dictionary& entry) {
  if (!state[kStateHistory].isArray()) state.set(kStateHistory, Array());
  Array history = state[kStateHistory].array();
  if (history.size() >= kMaximumHistoryEntries) {
    history.removeFirst(history.size() - (kMaximumHistoryEntries - 1));
  }
  history.append(entry);
}

Array LogGenerator::historyOfState(const Dictionary& state) {
  return state[kStateHistory].array().copy();
}

}  // namespace kestro
