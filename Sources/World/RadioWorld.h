// SPDX-License-Identifier: MIT
// A small radio world for the simulations: a car on a ring road, and layers of cells along it. All
// of it repeats exactly from run to run.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "Sources/World/Noise.h"

namespace kestro {

/// A place in the plane of the ring road, in metres from its centre.
struct Location {
  double x = 0;
  double y = 0;
};

/// The road around the town.
struct RingRoad {
  static constexpr double kLength = 24'000;  ///< metres
  static constexpr unsigned kSites = 16;     ///< masts beside it, at even distances

  /// The numbers of all masts.
  [[nodiscard]] static std::vector<unsigned> allSites();
  /// The place `distance` metres along the road.
  [[nodiscard]] static Location locationAt(double distance) noexcept;
  /// Where mast number `site` stands, a little off the road.
  [[nodiscard]] static Location siteAt(unsigned site) noexcept;
};

/// A car that drives along the ring road for ever, faster and slower, and sometimes stands still.
class Drive {
 public:
  explicit Drive(std::uint64_t seed) noexcept : _traffic(seed, kTrafficSeconds) {}

  void advance(std::chrono::milliseconds time) noexcept;

  /// Metres per second.
  [[nodiscard]] double speed() const noexcept { return _speed; }
  /// Metres since the beginning.
  [[nodiscard]] double travelled() const noexcept { return _travelled; }
  /// Metres along the road: 0 up to RingRoad::kLength.
  [[nodiscard]] double distance() const noexcept;
  /// Seconds since the beginning.
  [[nodiscard]] double seconds() const noexcept { return _seconds; }

 private:
  static constexpr double kTrafficSeconds = 30;

  SmoothNoise _traffic;
  double _seconds = 0;
  double _speed = 12;
  double _travelled = 0;
};

/// One sector of a mast.
struct SimulatedCell {
  unsigned site = 0;
  unsigned sector = 0;  ///< 0 to 2
};

/// How strongly a cell is received.
struct CellLevel {
  std::size_t cell = 0;  ///< its index in the layer
  double level = 0;      ///< dBm, of the cell's reference signal
  double distance = 0;   ///< metres to its mast
};

struct RadioLayerParameters {
  std::uint64_t seed = 1;
  double frequency = 2100;  ///< MHz
  double power = 46;        ///< dBm radiated in the sector's main direction, reference signal only
  double shadowDeviation = 6;
  double fadingDeviation = 1;
  /// The masts that carry the layer.
  std::vector<unsigned> sites;
};

/// The cells of one technology on one frequency: three sectors on each of its masts.
class RadioLayer {
 public:
  explicit RadioLayer(RadioLayerParameters parameters);

  [[nodiscard]] const std::vector<SimulatedCell>& cells() const noexcept { return _cells; }

  /// All cells as the car receives them now, strongest first: path loss, sector pattern, shadow
  /// fading that belongs to the place, fast fading that belongs to the moment.
  [[nodiscard]] std::vector<CellLevel> levels(const Drive& drive) const;

 private:
  /// What the sectors of a mast have in common.
  struct SiteLevel {
    double distance;
    double direction;   ///< from the mast to the car
    double unshadowed;  ///< dBm in a sector's main direction
    double shadow;      ///< dB
  };

  [[nodiscard]] SiteLevel levelOf(unsigned site, const Drive& drive) const;
  [[nodiscard]] CellLevel levelOf(std::size_t cell, const SiteLevel& ofSite,
                                  const Drive& drive) const;

  RadioLayerParameters _parameters;
  std::vector<SimulatedCell> _cells;
};

/// The power of several signals together. All powers are in dBm.
class PowerSum {
 public:
  void add(double level) noexcept;
  [[nodiscard]] double level() const noexcept;

 private:
  double _milliwatts = 0;
};

}  // namespace kestro
