// SPDX-License-Identifier: MIT
#include "Sources/PacketSimulation.h"

#include <utility>

namespace kestro {
namespace {

/// So many steps without a packet mean that the baseband has fallen silent.
constexpr int kMaximumSilentSteps = 1'000;

}  // namespace

Result<SourceStep> PacketSimulation::next() {
  for (int i = 0; _packets.empty(); ++i) {
    if (i == kMaximumSilentSteps) return failure("simulation: the baseband says nothing");
    takeStep();
  }
  _message = std::move(_packets.front());
  _packets.pop_front();
  return SourceEvent{.time = *_time,
                     .technology = technology(),
                     .message = _message,
                     .moment = kSimulationBegin + *_time};
}

void PacketSimulation::takeStep() {
  const auto elapsed = _time ? kSimulationStep : std::chrono::milliseconds(0);
  _time = _time.value_or(std::chrono::milliseconds(0)) + elapsed;
  for (Bytes& packet : _baseband->step(elapsed, kSimulationBegin + *_time)) {
    _packets.push_back(std::move(packet));
  }
}

Result<void> PacketSimulation::restart() {
  _baseband = _makeBaseband();
  _time.reset();
  _packets.clear();
  return {};
}

}  // namespace kestro
