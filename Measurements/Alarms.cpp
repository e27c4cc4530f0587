// SPDX-License-Identifier: MIT
#include "Measurements/Alarms.h"

#include <fmt/format.h>

#include <utility>

#include "Measurements/DriveTestSeries.h"
#include "Measurements/PacketText.h"

namespace kestro {
namespace {

bool means(const Rule& rule, const SeriesGroup& group) {
  if (group.kind == SeriesKind::Text) return false;
  if (!rule.unit.empty() && rule.unit != group.unit) return false;
  return rule.series == group.key || rule.series == group.name();
}

}  // namespace

Alarms::Alarms(std::vector<Rule> rules, EventSink sink)
    : _rules(std::move(rules)), _sink(std::move(sink)), _hasMet(_rules.size()) {}

std::vector<Alarms::Watched>& Alarms::watchedOf(const Series& series) {
  const auto known = _watched.find(&series);
  if (known != _watched.end()) return known->second;
  auto [rules, isNew] = _rulesOfGroup.try_emplace(series.group);
  for (std::uint32_t i = 0; isNew && i < _rules.size(); ++i) {
    if (means(_rules[i], *series.group)) rules->second.push_back(i);
  }
  std::vector<Watched>& watched = _watched[&series];
  for (const std::uint32_t rule : rules->second) {
    if (_watchedCount == kMaximumWatched) {
      ++_notWatched;
    } else {
      watched.push_back({.rule = rule, .isOfLog = isOfDriveTestLog(*series.group)});
      ++_watchedCount;
    }
  }
  return watched;
}

void Alarms::take(const MeasuredMessage& message) {
  if (_rules.empty()) return;
  for (const MeasuredValue& value : message.measured.values) {
    for (Watched& watched : watchedOf(*value.series)) takeValue(message, value, watched);
  }
}

void Alarms::takeValue(const MeasuredMessage& message, const MeasuredValue& value,
                       Watched& watched) {
  if (message.isFromDriveTest && !watched.isOfLog) return;
  _hasMet[watched.rule] = true;
  const Rule& rule = _rules[watched.rule];
  if (!compares(value.number, rule.comparison, rule.limit)) {
    if (!watched.broken) return;
    if (watched.broken->isAlarm) tell(EventKind::AlarmOver, message, value, watched);
    watched.broken.reset();
    return;
  }
  if (!watched.broken) watched.broken = Broken{.since = message.time};
  // A clock that was set back: what was before it says nothing of how long.
  if (message.time < watched.broken->since) watched.broken->since = message.time;
  if (watched.broken->isAlarm || message.time - watched.broken->since < rule.duration) return;
  watched.broken->isAlarm = true;
  tell(EventKind::Alarm, message, value, watched);
}

void Alarms::tell(EventKind kind, const MeasuredMessage& message, const MeasuredValue& value,
                  const Watched& watched) const {
  const SeriesGroup& group = *value.series->group;
  const std::string_view item = value.series->itemText();
  _sink({.kind = kind,
         .time = message.time,
         .message = message.number,
         .technology = group.technology,
         .subject = item.empty() ? group.name() : fmt::format("{} [{}]", group.name(), item),
         .to = _rules[watched.rule].text,
         .toLevel = value.number,
         .toldBy = packetText(message.measured.code),
         .duration = message.time - watched.broken->since});
}

}  // namespace kestro
