// SPDX-License-Identifier: MIT
// The main thread's queue on Qt's event loop.
#pragma once

#include <QObject>
#include <chrono>
#include <deque>
#include <functional>
#include <memory>
#include <unordered_map>

#include "Platform/MainQueue.h"

namespace kestro {

/// Needs a QCoreApplication, made before and destroyed after it. Blocks that never ran are
/// destroyed with the queue. A block or handler that throws ends the process where it threw: an
/// exception never unwinds through Qt. Delays and intervals are rounded up to whole milliseconds.
class QtMainQueue final : public MainQueue, private QObject {
 public:
  QtMainQueue() = default;
  ~QtMainQueue() override;

  void post(std::function<void()> block) override;
  void postAfter(std::chrono::nanoseconds delay, std::function<void()> block) override;
  [[nodiscard]] std::unique_ptr<Timer> scheduleRepeating(std::chrono::nanoseconds interval,
                                                         std::function<void()> handler) override;

 private:
  friend class QtRepeatingTimer;
  /// Shared with the call that runs it, so that a handler may stop its own timer.
  using Handler = std::shared_ptr<const std::function<void()>>;
  struct Alarm {
    Handler handler;
    bool repeats = false;
  };

  void timerEvent(QTimerEvent* event) override;
  [[nodiscard]] int addAlarm(std::chrono::nanoseconds delay, std::function<void()> handler,
                             bool repeats);
  void removeAlarm(int id);
  void wake();
  void runPosted();

  std::deque<std::function<void()>> _posted;
  std::unordered_map<int, Alarm> _alarms;
  int _wakeId = 0;  ///< the timer that serves `_posted`; 0 when none runs
};

}  // namespace kestro
