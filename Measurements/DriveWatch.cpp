// SPDX-License-Identifier: MIT
#include "Measurements/DriveWatch.h"

#include <utility>

namespace kestro {

DriveWatch::DriveWatch(std::vector<Rule> rules, const EventSink& sink)
    : _sink(sink), _alarms(std::move(rules), sink), _cells(sink), _states(sink) {}

void DriveWatch::take(const MeasuredMessage& message) {
  tellGap(message);
  _cells.take(message);
  _states.take(message);
  _alarms.take(message);
}

void DriveWatch::tellGap(const MeasuredMessage& message) {
  const auto before = std::exchange(_lastTime, message.time);
  const std::uint64_t number = std::exchange(_lastNumber, message.number);
  if (!before || message.time - *before < kMissingAfter) return;
  Event event{.kind = EventKind::MessagesMissing,
              .time = *before + kMissingAfter,
              .message = number,
              .technology = std::string(message.technology)};
  _sink(event);
  event.kind = EventKind::MessagesBack;
  event.time = message.time;
  event.message = message.number;
  event.duration = message.time - *before;
  _sink(event);
}

}  // namespace kestro
