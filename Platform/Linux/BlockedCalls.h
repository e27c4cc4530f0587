// SPDX-License-Identifier: MIT
// Getting the main thread out of a system call that nobody else ends.
#pragma once

#include <ctime>

namespace kestro {

/// Once `begin` was called, interrupts the main thread again and again, 0.25 s later for the first
/// time and then every 50 ms, until this is destroyed: a write to a pipe that nobody reads, or the
/// opening of a named pipe without a reader, then fails with EINTR. Calls that are not blocked do
/// not notice. Make it on the main thread; at most one exists at a time.
class BlockedCalls {
 public:
  BlockedCalls() noexcept;
  ~BlockedCalls();
  BlockedCalls(const BlockedCalls&) = delete;
  BlockedCalls& operator=(const BlockedCalls&) = delete;

  /// May be called in a signal handler.
  void begin() noexcept;

 private:
  timer_t _timer{};
  bool _hasTimer = false;
};

}  // namespace kestro
