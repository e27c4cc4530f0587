// SPDX-License-Identifier: MIT
// An interface of a pcapng file: what its packets are, and how their times are to be read.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "Platform/Clock.h"
#include "Platform/Result.h"
#include "Recordings/PcapngBlocks.h"

namespace kestro {

/// Turns a pcapng file's times, counted in units of any size, into moments.
class PcapngTimeScale {
 public:
  /// Microseconds since 1970-01-01 00:00:00 UTC.
  PcapngTimeScale() = default;
  /// `resolution` as the option holds it: a unit is 10^-r s, or with the highest bit 2^-r s, r
  /// being the other bits. `offset`, in seconds, is added to every time.
  PcapngTimeScale(std::uint8_t resolution, std::int64_t offset) noexcept;

  /// The moment of a time, rounded down to the microsecond; absent when it lies outside the years 1
  /// to 9999, as texts and property lists hold them.
  [[nodiscard]] std::optional<Moment> momentOf(std::uint64_t units) const noexcept {
    if (!_isMicroseconds || units > kMostMicroseconds) return scaledMomentOf(units);
    return Moment(std::chrono::microseconds(units));
  }

 private:
  static constexpr std::uint64_t kMostMicroseconds = kLastPcapngTime.time_since_epoch().count();

  [[nodiscard]] std::optional<Moment> scaledMomentOf(std::uint64_t units) const noexcept;

  bool _isMicroseconds = true;    ///< since 1970
  std::uint64_t _multiplier = 1;  ///< microseconds = units * multiplier / divisor / 2^shift
  std::uint64_t _divisor = 1;
  unsigned _shift = 0;
  std::int64_t _offset = 0;
};

struct PcapngInterface {
  std::uint16_t linkType = 0;
  std::string_view technology = {};  ///< a constant text; empty when it is none of ours
  std::uint32_t longestPacket = 0;   ///< of a simple packet; 0: no limit
  PcapngTimeScale times = {};
};

/// The interface that a block's body describes. The error says what is wrong, without a place.
[[nodiscard]] Result<PcapngInterface> pcapngInterfaceOf(PcapngBytes body);

}  // namespace kestro
