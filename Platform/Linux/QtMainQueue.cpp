// SPDX-License-Identifier: MIT
#include "Platform/Linux/QtMainQueue.h"

#include <QTimerEvent>
#include <algorithm>
#include <limits>
#include <utility>

namespace kestro {
namespace {

/// Qt counts a timer's interval in an int of milliseconds.
std::chrono::milliseconds qtInterval(std::chrono::nanoseconds interval) {
  constexpr std::chrono::milliseconds kLongest{std::numeric_limits<int>::max()};
  constexpr std::chrono::milliseconds kShortest{0};
  return std::clamp(std::chrono::ceil<std::chrono::milliseconds>(interval), kShortest, kLongest);
}

void runOrTerminate(const std::function<void()>& block) noexcept { block(); }

}  // namespace

class QtRepeatingTimer final : public Timer {
 public:
  QtRepeatingTimer(QtMainQueue& queue, int id) : _queue(queue), _id(id) {}
  ~QtRepeatingTimer() override { invalidate(); }
  void invalidate() override {
    if (_id != 0) _queue.removeAlarm(std::exchange(_id, 0));
  }

 private:
  QtMainQueue& _queue;
  int _id;
};

QtMainQueue::~QtMainQueue() {
  // What a block holds may post again while it is destroyed.
  while (!_posted.empty() || !_alarms.empty()) {
    const auto posted = std::exchange(_posted, {});
    const auto alarms = std::exchange(_alarms, {});
  }
}

void QtMainQueue::post(std::function<void()> block) {
  _posted.push_back(std::move(block));
  wake();
}

void QtMainQueue::postAfter(std::chrono::nanoseconds delay, std::function<void()> block) {
  static_cast<void>(addAlarm(delay, std::move(block), false));
}

std::unique_ptr<Timer> QtMainQueue::scheduleRepeating(std::chrono::nanoseconds interval,
                                                      std::function<void()> handler) {
  return std::make_unique<QtRepeatingTimer>(*this, addAlarm(interval, std::move(handler), true));
}

int QtMainQueue::addAlarm(std::chrono::nanoseconds delay, std::function<void()> handler,
                          bool repeats) {
  const int id = startTimer(qtInterval(delay), Qt::PreciseTimer);
  _alarms[id] = {std::make_shared<const std::function<void()>>(std::move(handler)), repeats};
  return id;
}

void QtMainQueue::removeAlarm(int id) {
  killTimer(id);
  // Taken out before it is destroyed: what the handler holds may change the table again.
  const auto removed = _alarms.extract(id);
}

void QtMainQueue::timerEvent(QTimerEvent* event) {
  const int id = event->timerId();
  if (id == _wakeId) {
    runPosted();
    return;
  }
  const auto found = _alarms.find(id);
  if (found == _alarms.end()) return;
  const Handler handler = found->second.handler;
  if (!found->second.repeats) removeAlarm(id);
  runOrTerminate(*handler);
}

// A timer of no length rather than an event posted to Qt: sockets and timers get their turn between
// two rounds even when every block posts another.
void QtMainQueue::wake() {
  if (_wakeId == 0) _wakeId = startTimer(std::chrono::milliseconds(0), Qt::PreciseTimer);
}

void QtMainQueue::runPosted() {
  killTimer(std::exchange(_wakeId, 0));
  for (std::size_t count = _posted.size(); count > 0 && !_posted.empty(); --count) {
    const std::function<void()> block = std::move(_posted.front());
    _posted.pop_front();
    if (!_posted.empty()) wake();  // a block may run an event loop of its own, as a dialog does
    runOrTerminate(block);
  }
}

}  // namespace kestro
