// SPDX-License-Identifier: MIT
// The main thread's work: posted blocks and repeating timers.
#pragma once

#include <chrono>
#include <functional>
#include <memory>

namespace kestro {

/// A repeating timer. It fires on the main thread until it is invalidated or destroyed.
class Timer {
 public:
  Timer() = default;
  virtual ~Timer() = default;
  Timer(const Timer&) = delete;
  Timer& operator=(const Timer&) = delete;

  /// Stops the timer for good. May be called from within its own handler, and more than once; the
  /// timer may be destroyed there too.
  virtual void invalidate() = 0;
};

/// The main thread's queue and run loop. Everything here is called on, and calls back on, the main
/// thread; nothing runs inside the call that posts it.
class MainQueue {
 public:
  MainQueue() = default;
  virtual ~MainQueue() = default;
  MainQueue(const MainQueue&) = delete;
  MainQueue& operator=(const MainQueue&) = delete;

  /// Runs `block` once, after all blocks posted before it.
  virtual void post(std::function<void()> block) = 0;

  /// Runs `block` once, `delay` from now. The block, and whatever it holds, lives until it has run
  /// or the queue is destroyed.
  virtual void postAfter(std::chrono::nanoseconds delay, std::function<void()> block) = 0;

  /// Calls `handler` every `interval`, the first time one interval from now. Ticks that could not
  /// be served in time are not made up for. The caller owns the timer; destroying it stops it.
  [[nodiscard]] virtual std::unique_ptr<Timer> scheduleRepeating(std::chrono::nanoseconds interval,
                                                                 std::function<void()> handler) = 0;
};

}  // namespace kestro
