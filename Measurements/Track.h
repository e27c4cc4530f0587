// SPDX-License-Identifier: MIT
// Where a drive was at a time.
#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <vector>

#include "Platform/Clock.h"

namespace kestro {

/// A place on earth, in degrees (WGS 84).
struct Coordinates {
  double latitude = 0;   ///< -90 to 90
  double longitude = 0;  ///< -180 to 180

  friend bool operator==(const Coordinates&, const Coordinates&) = default;
};

/// A place at a time.
struct Fix {
  Moment time;
  Coordinates position;
};

/// The fixes of a drive.
class Track {
 public:
  /// Between fixes that are so far apart nobody knows where the drive was.
  static constexpr std::chrono::seconds kGap{10};
  static constexpr std::size_t kMaximumFixes = 2'000'000;  ///< 23 days, one a second

  Track() = default;
  /// `fixes` in any order; of several at one time the first counts.
  explicit Track(std::vector<Fix> fixes);

  /// Where the drive was: at a fix, or on the straight line between two that are less than `kGap`
  /// apart, the shorter way round.
  [[nodiscard]] std::optional<Coordinates> at(Moment time) const;

  [[nodiscard]] const std::vector<Fix>& fixes() const noexcept { return _fixes; }

 private:
  std::vector<Fix> _fixes;  ///< by their times
};

}  // namespace kestro
