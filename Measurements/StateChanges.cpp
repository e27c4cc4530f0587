// SPDX-License-Identifier: MIT
#include "Measurements/StateChanges.h"

#include <algorithm>
#include <utility>

#include "Measurements/PacketText.h"
#include "Platform/TelephonyService.h"

namespace kestro {

StateChanges::StateChanges(EventSink sink) : _sink(std::move(sink)), _last(namedStates().size()) {}

std::optional<std::size_t> StateChanges::stateOf(const SeriesGroup& group) {
  const auto [known, isNew] = _states.try_emplace(&group);
  if (!isNew) return known->second;
  const auto state = std::ranges::find_if(namedStates(), [&](const NamedState& row) {
    return row.technology == group.technology && row.section == group.section &&
           row.key == group.key;
  });
  if (state != namedStates().end()) {
    known->second = static_cast<std::size_t>(state - namedStates().begin());
  }
  return known->second;
}

void StateChanges::take(const MeasuredMessage& message) {
  if (message.isFromDriveTest && message.technology != kTqLogChannelTechnology_IFX) return;
  for (const MeasuredValue& value : message.measured.values) {
    const auto state = stateOf(*value.series->group);
    if (state) takeValue(message, value, _last[*state]);
  }
}

void StateChanges::takeValue(const MeasuredMessage& message, const MeasuredValue& value,
                             std::optional<std::string>& last) {
  TextBuffer shown;
  writeShown(value, shown);
  if (last && *last == shown.text()) return;
  const auto before = std::exchange(last, std::string(shown.text()));
  if (!before) return;
  _sink({.kind = EventKind::State,
         .time = message.time,
         .message = message.number,
         .technology = value.series->group->technology,
         .subject = value.series->group->name(),
         .from = *before,
         .to = *last,
         .toldBy = packetText(message.measured.code)});
}

}  // namespace kestro
