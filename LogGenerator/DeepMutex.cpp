// SPDX-License-Identifier: MIT
#include "LogGenerator/DeepMutex.h"

namespace kestro {
namespace {

/// An address that no other thread has.
const void* thisThread() noexcept {
  static thread_local const char mark = 0;
  return &mark;
}

}  // namespace

void DeepMutex::lock(std::uint64_t levels) {
  if (_owner.load(std::memory_order_relaxed) != thisThread()) {
    _mutex.lock();
    _owner.store(thisThread(), std::memory_order_relaxed);
  }
  _levels += levels;
}

void DeepMutex::unlock(std::uint64_t levels) {
  _levels -= levels;
  if (_levels != 0) return;
  _owner.store(nullptr, std::memory_order_relaxed);
  _mutex.unlock();
}

}  // namespace kestro
