// SPDX-License-Identifier: MIT
#include "Sources/C2K/SentCounters.h"

#include "Sources/C2K/C2KPackets.h"

namespace kestro {

void SentCounters::send(std::size_t counter, double bits) {
  const double size = _layout.counters[counter].bits;
  _rest += bits;
  const auto packets = static_cast<std::uint32_t>(_rest / size);
  _rest -= size * packets;
  _counters[counter] += packets;
}

std::optional<Bytes> SentCounters::packet(Moment time) {
  return evdoThroughput(_layout, ++_sequenceNumber, _counters, time);
}

std::span<const std::size_t> forwardPacketCounters() {
  // Each rate's counters end with one that stands for no bits.
  static const std::vector<std::size_t> kCounters = [] {
    std::vector<std::size_t> found;
    const auto counters = kForwardThroughput.counters;
    for (std::size_t i = 1; i < counters.size(); ++i) {
      if (counters[i].bits == 0) found.push_back(i - 1);
    }
    return found;
  }();
  return kCounters;
}

std::size_t reversePacketCounter(double rate) noexcept {
  constexpr double kPacketsPerSecond = 150;
  const auto counters = kReverseThroughput.counters;
  // The counters of the first of three blocks, smallest packets first.
  const std::size_t end = counters.size() / 3;
  std::size_t found = 0;
  for (std::size_t i = 0; i < end; ++i) {
    if (counters[i].bits == counters[found].bits) continue;
    if (counters[found].bits * kPacketsPerSecond >= rate) break;
    found = i;
  }
  return found;
}

}  // namespace kestro
