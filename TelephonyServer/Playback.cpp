// SPDX-License-Identifier: MIT
#include "TelephonyServer/Playback.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>
#include <variant>

namespace kestro {
namespace {

using std::chrono::nanoseconds;
using std::chrono::seconds;

// Nobody waits longer than this at a time, so that a clock set back costs no more.
constexpr nanoseconds kLongestWait = seconds(1);
// What a wait may take longer than asked before the clock, not the machine, is to blame.
constexpr nanoseconds kLongestDelay = seconds(10);
// Between the end of a source and its new beginning.
constexpr nanoseconds kLoopPause = seconds(1);
constexpr nanoseconds kShortestWait = std::chrono::milliseconds(1);
// Longer pauses are announced: somebody may take the display for dead.
constexpr std::chrono::duration<double> kQuietPause = seconds(60);

}  // namespace

Playback::Playback(std::unique_ptr<LogSource> source, const PlaybackOptions& options,
                   MainQueue& queue, const Clock& clock, PlaybackListener& listener,
                   SourceReporter report)
    : _source(std::move(source)),
      _options(options),
      _queue(queue),
      _clock(clock),
      _listener(listener),
      _report(std::move(report)),
      _technology(_source->technology()) {}

void Playback::start() {
  _looked = _clock.now();
  _source->setReadyHandler([this] {
    if (!_isInTurn) turn();
  });
  wakeAfter(nanoseconds(0));
}

void Playback::turn() {
  if (_isStopped) return;
  _isInTurn = true;
  passTime();
  if (std::exchange(_isRestarting, false)) restart();
  std::size_t bytes = 0;
  for (std::size_t count = 0; fetch(); ++count) {
    const bool isLive = !_event->time;
    if (!isLive && *_event->time > _position) {
      wakeWhenDue();
      break;
    }
    if (!isLive && (count >= kMessagesPerTurn || bytes >= kBytesPerTurn)) {
      wakeAfter(kShortestWait);
      break;
    }
    bytes += _event->message.size();
    handOver();
  }
  _isInTurn = false;
}

void Playback::passTime() {
  const auto now = _clock.now();
  const auto elapsed =
      std::clamp<nanoseconds>(now - _looked, nanoseconds(0), _asked + kLongestDelay);
  _looked = now;
  _position += elapsed * _options.speed;
}

bool Playback::fetch() {
  if (_event) return true;
  if (_isStopped || _isRestarting) return false;
  auto step = _source->next();
  if (!step) {
    finishPass(step.error().message);
    return false;
  }
  if (std::holds_alternative<SourceEnded>(*step)) {
    finishPass("");
    return false;
  }
  const auto* event = std::get_if<SourceEvent>(&*step);
  if (event == nullptr) return false;
  _event = *event;
  ++_eventsOfPass;
  return true;
}

void Playback::handOver() {
  const SourceEvent event = *std::exchange(_event, std::nullopt);
  _isPauseAnnounced = false;
  if (event.technology != _technology) {
    _technology = event.technology;
    _listener.technologyChanged(_technology);
  }
  if (event.message.empty()) return;
  ++_messages;
  _listener.messageDue(event.message, event.moment.value_or(_clock.now()));
}

void Playback::finishPass(std::string_view error) {
  if (!error.empty()) _report(error);
  if (_options.loop && _eventsOfPass > 0) {
    _isRestarting = true;
    wakeAfter(kLoopPause);
    return;
  }
  _report(fmt::format("the source has ended after {} messages; clients stay connected", _messages));
  stop();
}

void Playback::stop() {
  _isStopped = true;
  _listener.sourceEnded();
}

void Playback::restart() {
  if (const auto restarted = _source->restart(); !restarted) {
    _report(restarted.error().message);
    return stop();
  }
  _position = Microseconds(0);
  _eventsOfPass = 0;
}

void Playback::wakeWhenDue() {
  const std::chrono::duration<double> wait = (*_event->time - _position) / _options.speed;
  if (wait > kQuietPause && !std::exchange(_isPauseAnnounced, true)) {
    _report(fmt::format("the source pauses: its next message is due in {:.0f} s", wait.count()));
  }
  const std::chrono::duration<double> longest = kLongestWait;
  wakeAfter(std::max(kShortestWait, std::chrono::ceil<nanoseconds>(std::min(wait, longest))));
}

void Playback::wakeAfter(nanoseconds delay) {
  _asked = delay;
  _queue.postAfter(delay, [this, alive = std::weak_ptr<bool>(_alive), wake = ++_wakes] {
    if (!alive.expired() && wake == _wakes) turn();
  });
}

}  // namespace kestro
