// SPDX-License-Identifier: MIT
// Randomness that repeats: a function of its seed and place, the same in every run and on every
// machine.
#pragma once

#include <cmath>
#include <cstdint>

namespace kestro {

/// A well-mixed number of a seed and an index.
[[nodiscard]] constexpr std::uint64_t hashed(std::uint64_t seed, std::uint64_t index) noexcept {
  std::uint64_t value = seed + (index + 1) * 0x9E3779B97F4A7C15U;
  value = (value ^ (value >> 30)) * 0xBF58476D1CE4E5B9U;
  value = (value ^ (value >> 27)) * 0x94D049BB133111EBU;
  return value ^ (value >> 31);
}

/// A number from 0 up to, not including, 1.
[[nodiscard]] constexpr double hashedFraction(std::uint64_t seed, std::uint64_t index) noexcept {
  return static_cast<double>(hashed(seed, index) >> 11) * 0x1.0p-53;
}

/// Noise along a line: mean 0, standard deviation 1, never beyond 5, and smooth: its values at
/// places closer than the correlation length resemble each other.
class SmoothNoise {
 public:
  /// With a period other than 0 the noise repeats after that many correlation lengths.
  constexpr SmoothNoise(std::uint64_t seed, double correlationLength,
                        std::uint64_t period = 0) noexcept
      : _seed(seed), _correlationLength(correlationLength), _period(period) {}

  /// The noise at a place of 0 or more.
  [[nodiscard]] double at(double place) const noexcept {
    const double scaled = place / _correlationLength;
    const double floor = std::floor(scaled);
    const auto index = static_cast<std::uint64_t>(floor);
    const double t = scaled - floor;
    const double weight = t * t * (3 - 2 * t);
    const double mixed = (1 - weight) * knot(index) + weight * knot(index + 1);
    // Between two independent knots the mixture varies less than at them; this evens it out.
    return mixed / std::sqrt((1 - weight) * (1 - weight) + weight * weight);
  }

 private:
  /// About normally distributed: the sum of four uniform numbers, scaled to a deviation of 1.
  [[nodiscard]] double knot(std::uint64_t index) const noexcept {
    if (_period != 0) index %= _period;
    double sum = 0;
    for (std::uint64_t i = 0; i < 4; ++i) sum += hashedFraction(_seed, index * 4 + i);
    return (sum - 2) * std::sqrt(3.0);
  }

  std::uint64_t _seed;
  double _correlationLength;
  std::uint64_t _period;
};

}  // namespace kestro
