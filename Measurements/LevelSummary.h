// SPDX-License-Identifier: MIT
// Last, least, median and greatest of values without end, in little memory.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace kestro {

/// Levels in dBm and qualities in dB. The median is exact while there are at most
/// `kMaximumDistinct` different values, as every format of a packet has over a range of 60 dB. Then
/// values are counted in steps of 1/4 dB, and where that does not do of 1/2, 1, 2 dB and so on: the
/// median is off by half a step at most.
class LevelSummary {
 public:
  static constexpr std::size_t kMaximumDistinct = 256;

  /// Takes a finite value.
  void add(double value);

  [[nodiscard]] std::uint64_t count() const noexcept { return _count; }
  // The values below are 0 before there was one.
  [[nodiscard]] double last() const noexcept { return _last; }
  [[nodiscard]] double least() const noexcept { return _least; }
  [[nodiscard]] double greatest() const noexcept { return _greatest; }
  /// The value in the middle; of an even count the lower one of the two.
  [[nodiscard]] double median() const noexcept;
  /// By how much the median can be off: 0 while it is exact.
  [[nodiscard]] double medianError() const noexcept { return _step / 2; }

 private:
  struct Bin {
    double value;
    std::uint64_t count;
  };
  /// The value's bin, named by its lower end.
  [[nodiscard]] double binOf(double value) const noexcept;
  void count(double value);
  void coarsen();

  std::vector<Bin> _bins;  ///< by value
  double _step = 0;        ///< 0: each value has its own bin
  std::uint64_t _count = 0;
  double _last = 0;
  double _least = 0;
  double _greatest = 0;
};

}  // namespace kestro
