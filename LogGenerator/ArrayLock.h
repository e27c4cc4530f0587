// SPDX-License-Identifier: MIT
// The process-wide lock between whoever fills display arrays and whoever walks them.
#pragma once

#include <cstdint>

namespace kestro {

/// Never instantiated. Every `lockArray` acquires the recursive mutex once more and raises an 8-bit
/// nesting counter; `unlockArray` lowers the counter, and only the call that brings it back to 0
/// releases the mutex, exactly once. So after nested use the thread keeps the mutex for the extra
/// levels: decoding and display building share the one main thread, which it never blocks. However
/// many levels pile up, the mutex counts them. 256 nested acquisitions wrap the counter to 0.
class ArrayLock {
 public:
  ArrayLock() = delete;

  /// A new mutex, held by nobody, and a counter of 0. Happens by itself before the first use; only
  /// tests call it again.
  static void initialize();
  static void lockArray();
  /// Call it only on the thread that holds the lock.
  static void unlockArray();

  /// The nesting counter as it stands.
  [[nodiscard]] static std::uint8_t nesting() noexcept;
};

/// Holds the array lock during a scope.
class ArrayLockScope {
 public:
  ArrayLockScope() { ArrayLock::lockArray(); }
  ~ArrayLockScope() { ArrayLock::unlockArray(); }
  ArrayLockScope(const ArrayLockScope&) = delete;
  ArrayLockScope& operator=(const ArrayLockScope&) = delete;
};

}  // namespace kestro
