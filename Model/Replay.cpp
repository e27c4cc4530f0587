// SPDX-License-Identifier: MIT
#include "Model/Replay.h"

#include <fmt/format.h>

#include <exception>
#include <utility>

#include "Model/FailureText.h"

namespace kestro {

Replay::Replay(GeneratorFactory makeGenerator, ReplayClock& clock, const ReplayOptions& options,
               RefreshHandler refreshed)
    : _makeGenerator(std::move(makeGenerator)),
      _clock(clock),
      _options(options),
      _refreshed(std::move(refreshed)) {}

bool Replay::begin(std::string_view technology) { return follow(technology); }

Result<void> Replay::feed(const ReplayMessage& message) {
  if (message.technology != _stateOwner.technology()) {
    if (_nextTick) passTimeTo(message.time);
    _clock.setNow(message.time);
    if (!follow(message.technology)) {
      return failure(fmt::format("nothing here decodes the technology {}", message.technology));
    }
  }
  passTimeTo(message.time);
  _clock.setNow(message.time);
  try {
    _generator->updateStateWithData(_state, message.bytes);
  } catch (...) {
    return failure(failureText(std::current_exception()));
  }
  _updated = true;
  _lastMessage = message.number;
  _bytesSinceRefresh += message.bytes.size();
  if (_options.refreshInterval.count() == 0 || _bytesSinceRefresh >= _options.refreshBytes) {
    refreshAt(message.time);
  }
  return {};
}

bool Replay::follow(std::string_view technology) {
  auto generator = _makeGenerator(technology);
  if (!generator) return false;
  _generator = std::move(generator);
  if (_stateOwner.handTo(*_generator, technology, _state)) _updated = false;
  _nextTick.reset();
  _bytesSinceRefresh = 0;
  return true;
}

void Replay::finish() {
  if (_updated) refreshAt(_clock.now());
}

void Replay::passTimeTo(Moment time) {
  const auto interval = _options.refreshInterval;
  if (interval.count() == 0) return;
  if (!_nextTick || time < *_nextTick - interval) _nextTick = time + interval;
  if (time < *_nextTick) return;
  if (_updated) refreshAt(*_nextTick);
  // Ticks that pass without a message between them have nothing to refresh.
  *_nextTick += ((time - *_nextTick) / interval + 1) * interval;
}

void Replay::refreshAt(Moment time) {
  _clock.setNow(time);
  _display = _generator->generateLogUsingState(_state);
  _updated = false;
  _bytesSinceRefresh = 0;
  _refreshed({.time = time,
              .message = _lastMessage,
              .technology = _stateOwner.technology(),
              .display = _display});
}

}  // namespace kestro
