// SPDX-License-Identifier: MIT
#include "Model/Replay.h"

#include <exception>
#include <utility>

#include "Model/FailureText.h"

namespace kestro {

Replay::Replay(LogGenerator& generator, ReplayClock& clock, const ReplayOptions& options,
               RefreshHandler refreshed)
    : _generator(generator), _clock(clock), _options(options), _refreshed(std::move(refreshed)) {}

Result<void> Replay::feed(const ReplayMessage& message) {
  passTimeTo(message.time);
  _clock.setNow(message.time);
  try {
    _generator.updateStateWithData(_state, message.bytes);
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
  _display = _generator.generateLogUsingState(_state);
  _updated = false;
  _bytesSinceRefresh = 0;
  _refreshed({.time = time, .message = _lastMessage, .display = _display});
}

}  // namespace kestro
