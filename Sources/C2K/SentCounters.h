// SPDX-License-Identifier: MIT
// The counters of what an EV-DO phone has sent or received at each rate.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "LogGenerator/C2K/EVDOThroughput.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// Counts up for ever, as the baseband does; a counter wraps at 32 bits.
class SentCounters {
 public:
  /// `layout` must be a constant.
  explicit SentCounters(const ThroughputLayout& layout)
      : _layout(layout), _counters(layout.counters.size(), 0) {}

  /// Adds the bits to those left over before, and counts as many packets of the counter's size as
  /// they fill. The counter must be of packets of one size.
  void send(std::size_t counter, double bits);

  /// The counters as they are, under the next sequence number. One packet a second makes the
  /// display's rate one a second.
  [[nodiscard]] std::optional<Bytes> packet(Moment time);

 private:
  const ThroughputLayout& _layout;
  std::vector<std::uint32_t> _counters;
  double _rest = 0;  ///< bits that have not filled a packet yet
  std::uint32_t _sequenceNumber = 0;
};

/// The forward link's counters of the largest good packets, slowest rate first.
[[nodiscard]] std::span<const std::size_t> forwardPacketCounters();

/// The reverse link's counter of the smallest packet with which this rate can be sent, bit/s.
[[nodiscard]] std::size_t reversePacketCounter(double rate) noexcept;

}  // namespace kestro
