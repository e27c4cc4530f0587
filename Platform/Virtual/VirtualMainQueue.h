// SPDX-License-Identifier: MIT
// A clock that stands still until it is moved, and a main queue that runs on it.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <utility>

#include "Platform/Clock.h"
#include "Platform/MainQueue.h"

namespace kestro {

/// A clock that shows what it was told.
class VirtualClock : public Clock {
 public:
  [[nodiscard]] Moment now() const override { return _now; }
  [[nodiscard]] std::chrono::seconds timeZoneOffset(Moment) const override { return _offset; }
  [[nodiscard]] bool isDaylightSaving(Moment) const override { return _daylightSaving; }

  void setNow(Moment now) noexcept { _now = now; }
  void setTimeZone(std::chrono::seconds offset, bool daylightSaving) noexcept {
    _offset = offset;
    _daylightSaving = daylightSaving;
  }

 private:
  Moment _now{};
  std::chrono::seconds _offset{0};
  bool _daylightSaving = false;
};

/// A main queue whose time passes only in `advance`, which moves the clock along. Blocks run in the
/// order of their due times, those of one time in the order in which they were posted.
class VirtualMainQueue : public MainQueue {
 public:
  explicit VirtualMainQueue(VirtualClock& clock) : _clock(clock) {}

  void post(std::function<void()> block) override;
  void postAfter(std::chrono::nanoseconds delay, std::function<void()> block) override;
  [[nodiscard]] std::unique_ptr<Timer> scheduleRepeating(std::chrono::nanoseconds interval,
                                                         std::function<void()> handler) override;

  /// Runs what is due now, also what that posts for now. More than a million blocks without time
  /// passing count as a loop: the rest stays queued and the call returns false.
  bool runReady();

  /// Lets `duration` pass, running everything that falls due on the way, at its time.
  void advance(std::chrono::nanoseconds duration);

  /// Lets `duration` pass and runs nothing, as while the thread waits for something else; what
  /// falls due meanwhile runs late.
  void wait(std::chrono::nanoseconds duration) { moveTo(_elapsed + duration); }

  /// The virtual time since the queue was made.
  [[nodiscard]] std::chrono::nanoseconds elapsed() const noexcept { return _elapsed; }
  /// Blocks and timer ticks that wait.
  [[nodiscard]] std::size_t pending() const noexcept { return _blocks.size(); }

 private:
  class VirtualTimer;
  struct TimerState {
    std::chrono::nanoseconds interval;
    std::function<void()> handler;
  };
  using DueTime = std::pair<std::chrono::nanoseconds, std::uint64_t>;

  void insert(std::chrono::nanoseconds due, std::function<void()> block);
  void scheduleTick(std::chrono::nanoseconds due, std::weak_ptr<TimerState> state);
  void runFirst();
  void moveTo(std::chrono::nanoseconds time);

  VirtualClock& _clock;
  std::chrono::nanoseconds _elapsed{0};
  std::uint64_t _order = 0;
  std::map<DueTime, std::function<void()>> _blocks;
};

}  // namespace kestro
