// SPDX-License-Identifier: MIT
#include "LogGenerator/ArrayLock.h"

#include <list>
#include <mutex>

namespace kestro {
namespace {

constinit std::recursive_mutex firstMutex;
constinit std::recursive_mutex* currentMutex = &firstMutex;
constinit std::uint8_t currentNesting = 0;

}  // namespace

void ArrayLock::initialize() {
  // Replaced mutexes stay: destroying one that a thread holds is not allowed, and by the nesting
  // rule the main thread usually holds it.
  static std::list<std::recursive_mutex> mutexes;
  currentMutex = &mutexes.emplace_back();
  currentNesting = 0;
}

void ArrayLock::lockArray() {
  currentMutex->lock();
  ++currentNesting;
}

void ArrayLock::unlockArray() {
  if (--currentNesting == 0) currentMutex->unlock();
}

std::uint8_t ArrayLock::nesting() noexcept { return currentNesting; }

}  // namespace kestro
