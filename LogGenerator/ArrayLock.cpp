// SPDX-License-Identifier: MIT
#include "LogGenerator/ArrayLock.h"

#include <list>

#include "LogGenerator/DeepMutex.h"

namespace kestro {
namespace {

constinit DeepMutex firstMutex;
constinit DeepMutex* currentMutex = &firstMutex;
constinit std::uint8_t currentNesting = 0;

}  // namespace

void ArrayLock::initialize() {
  // Replaced mutexes stay: destroying one that a thread holds is not allowed, and by the nesting
  // rule the main thread usually holds it.
  static std::list<DeepMutex> mutexes;
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
