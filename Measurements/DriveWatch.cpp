// SPDX-License-Identifier: MIT
#include "Measurements/DriveWatch.h"

#include <string>
#include <utility>

namespace kestro {

DriveWatch::DriveWatch(std::vector<Rule> rules, const EventSink& sink)
    : _sink(sink), _alarms(std::move(rules), sink), _cells(sink), _states(sink) {}

void DriveWatch::take(const MeasuredMessage& message) {
  passTime(message.time);
  if (_areMissing) tellBack(message);
  _lastTime = message.time;
  _lastNumber = message.number;
  _lastTechnology = message.technology;
  _cells.take(message);
  _states.take(message);
  _alarms.take(message);
}

void DriveWatch::passTime(Moment now) {
  if (!_areMissing && _lastTime && now - *_lastTime >= kMissingAfter) tellMissing();
}

void DriveWatch::tellMissing() {
  _areMissing = true;
  _sink({.kind = EventKind::MessagesMissing,
         .time = *_lastTime + kMissingAfter,
         .message = _lastNumber,
         .technology = std::string(_lastTechnology)});
}

void DriveWatch::tellBack(const MeasuredMessage& message) {
  _areMissing = false;
  _sink({.kind = EventKind::MessagesBack,
         .time = message.time,
         .message = message.number,
         .technology = std::string(message.technology),
         .duration = message.time - *_lastTime});
}

}  // namespace kestro
