// SPDX-License-Identifier: MIT
// A recursive mutex whose levels never run out.
#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>

namespace kestro {

/// As std::recursive_mutex, but with 64 bits of levels. The standard library's has 32, and throws
/// when they are used up: after 2^32 - 2 levels that nobody gives back, which a display with many
/// nested arrays reaches within a day.
class DeepMutex {
 public:
  /// Waits until no other thread holds the mutex, then takes it `levels` times; at least once.
  void lock(std::uint64_t levels = 1);

  /// Gives `levels` back; other threads may enter after the last. Call it only on the thread that
  /// holds as many.
  void unlock(std::uint64_t levels = 1);

 private:
  std::mutex _mutex;
  /// The thread that holds the mutex, known by an address of its own; null for none. A thread can
  /// find its own address here only if it has put it here itself.
  std::atomic<const void*> _owner = nullptr;
  std::uint64_t _levels = 0;  ///< read and written by the owner only
};

}  // namespace kestro
