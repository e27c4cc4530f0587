// SPDX-License-Identifier: MIT
#include "Platform/Virtual/VirtualMainQueue.h"

namespace kestro {
namespace {

constexpr std::size_t kMaximumBlocksWithoutTime = 1'000'000;

}  // namespace

class VirtualMainQueue::VirtualTimer : public Timer {
 public:
  explicit VirtualTimer(std::shared_ptr<TimerState> state) : _state(std::move(state)) {}
  void invalidate() override { _state.reset(); }

 private:
  std::shared_ptr<TimerState> _state;
};

void VirtualMainQueue::post(std::function<void()> block) { insert(_elapsed, std::move(block)); }

void VirtualMainQueue::postAfter(std::chrono::nanoseconds delay, std::function<void()> block) {
  insert(_elapsed + delay, std::move(block));
}

std::unique_ptr<Timer> VirtualMainQueue::scheduleRepeating(std::chrono::nanoseconds interval,
                                                           std::function<void()> handler) {
  auto state = std::make_shared<TimerState>(TimerState{interval, std::move(handler)});
  scheduleTick(_elapsed + interval, state);
  return std::make_unique<VirtualTimer>(std::move(state));
}

bool VirtualMainQueue::runReady() {
  for (std::size_t count = 0; !_blocks.empty() && _blocks.begin()->first.first <= _elapsed;
       ++count) {
    if (count == kMaximumBlocksWithoutTime) return false;
    runFirst();
  }
  return true;
}

void VirtualMainQueue::advance(std::chrono::nanoseconds duration) {
  const auto end = _elapsed + duration;
  while (!_blocks.empty() && _blocks.begin()->first.first <= end) {
    moveTo(_blocks.begin()->first.first);
    runFirst();
  }
  moveTo(end);
}

void VirtualMainQueue::insert(std::chrono::nanoseconds due, std::function<void()> block) {
  _blocks.emplace(DueTime{due, _order++}, std::move(block));
}

void VirtualMainQueue::scheduleTick(std::chrono::nanoseconds due, std::weak_ptr<TimerState> state) {
  insert(due, [this, due, weak = std::move(state)] {
    const std::shared_ptr<TimerState> timer = weak.lock();
    if (!timer) return;
    timer->handler();
    const auto next = due + timer->interval;
    scheduleTick(next < _elapsed ? _elapsed + timer->interval : next, timer);
  });
}

void VirtualMainQueue::runFirst() {
  const auto block = std::move(_blocks.extract(_blocks.begin()).mapped());
  block();
}

void VirtualMainQueue::moveTo(std::chrono::nanoseconds time) {
  if (time <= _elapsed) return;
  _clock.setNow(_clock.now() +
                std::chrono::duration_cast<std::chrono::microseconds>(time - _elapsed));
  _elapsed = time;
}

}  // namespace kestro
