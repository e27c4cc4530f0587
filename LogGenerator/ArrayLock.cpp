// SPDX-License-Identifier: MIT
#include "LogGenerator/ArrayLock.h"

#include <list>
#include <mutex>

namespace kestro {
namespace {

struct LockState {
  // Replaced mutexes stay: destroying one that a thread holds is not allowed, and by the nesting
  // rule the main thread usually holds it.
  std::list<std::recursive_mutex> mutexes{1};
  std::uint8_t nesting = 0;
};

LockState& lockState() {
  static LockState state;
  return state;
}

}  // namespace

void ArrayLock::initialize() {
  lockState().mutexes.emplace_back();
  lockState().nesting = 0;
}

void ArrayLock::lockArray() {
  LockState& state = lockState();
  state.mutexes.back().lock();
  ++state.nesting;
}

void ArrayLock::unlockArray() {
  LockState& state = lockState();
  if (--state.nesting == 0) state.mutexes.back().unlock();
}

std::uint8_t ArrayLock::nesting() noexcept { return lockState().nesting; }

}  // namespace kestro
