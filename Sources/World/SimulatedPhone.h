// SPDX-License-Identifier: MIT
// A simulated GSM and UMTS phone on a drive: which cells serve it, and what it does there.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "Sources/World/CellSelection.h"
#include "Sources/World/RadioWorld.h"

namespace kestro {

enum class RadioAccess : std::uint8_t { GSM, UMTS };

/// What the data connection does: nothing, a transfer, or the wait after one.
enum class Activity : std::uint8_t { Idle, Transfer, Tail };

/// Transfers that come and go by themselves, in a rhythm that repeats from run to run.
class DataSession {
 public:
  explicit DataSession(std::uint64_t seed) noexcept : _seed(seed) {}

  void advance(std::chrono::milliseconds time);
  [[nodiscard]] Activity activity() const noexcept { return _activity; }

 private:
  std::uint64_t _seed;
  std::uint64_t _phases = 0;
  Activity _activity = Activity::Idle;
  std::chrono::milliseconds _left{2'000};
};

/// What the phone measures of its serving cell, in the terms of its radio access.
struct RadioQuality {
  double level = 0;     ///< dBm: RSCP or RxLev
  double quality = 0;   ///< dB: Ec/N0, or the carrier over its interference
  double total = 0;     ///< dBm: RSSI
  double distance = 0;  ///< metres to the mast
};

class SimulatedPhone {
 public:
  explicit SimulatedPhone(std::uint64_t seed);

  /// Lets time pass: the car drives, cells are measured and chosen, data flows.
  void advance(std::chrono::milliseconds time);

  [[nodiscard]] const Drive& drive() const noexcept { return _drive; }
  [[nodiscard]] RadioAccess access() const noexcept { return _access; }
  [[nodiscard]] Activity activity() const noexcept { return _session.activity(); }

  [[nodiscard]] const RadioLayer& umts() const noexcept { return _umts; }
  [[nodiscard]] const RadioLayer& gsm() const noexcept { return _gsm; }
  /// All cells of a layer as measured last, strongest first.
  [[nodiscard]] const std::vector<CellLevel>& umtsLevels() const noexcept { return _umtsLevels; }
  [[nodiscard]] const std::vector<CellLevel>& gsmLevels() const noexcept { return _gsmLevels; }

  /// The serving cell's index in the layer of the present radio access.
  [[nodiscard]] std::size_t servingCell() const;
  [[nodiscard]] const RadioQuality& quality() const noexcept { return _quality; }
  [[nodiscard]] const SoftHandoverSet& activeSet() const noexcept { return _activeSet; }
  /// Ec/N0 of a UMTS level, in dB.
  [[nodiscard]] double energyOverNoise(double level) const { return level - _umtsTotal; }

  /// kbit/s at present.
  [[nodiscard]] double downlinkRate() const noexcept { return _downlinkRate; }
  [[nodiscard]] double uplinkRate() const noexcept { return _uplinkRate; }
  /// Bytes since the beginning.
  [[nodiscard]] double downlinkBytes() const noexcept { return _downlinkBytes; }
  [[nodiscard]] double uplinkBytes() const noexcept { return _uplinkBytes; }

  [[nodiscard]] unsigned cellChanges() const noexcept { return _cellChanges; }
  [[nodiscard]] unsigned accessChanges() const noexcept { return _accessChanges; }
  /// Seconds since the serving cell became it.
  [[nodiscard]] double secondsInCell() const noexcept { return _drive.seconds() - _inCellSince; }

 private:
  void measure();
  void chooseAccess(std::chrono::milliseconds time);
  void chooseCell(std::chrono::milliseconds time);
  void transfer(std::chrono::milliseconds time);

  Drive _drive;
  RadioLayer _umts;
  RadioLayer _gsm;
  SmoothNoise _load;
  DataSession _session;
  CellSelection _umtsSelection{3, std::chrono::milliseconds(1'280)};
  CellSelection _gsmSelection{4, std::chrono::milliseconds(2'000)};
  SoftHandoverSet _activeSet;

  std::vector<CellLevel> _umtsLevels;
  std::vector<CellLevel> _gsmLevels;
  double _umtsTotal = 0;
  RadioQuality _quality;

  RadioAccess _access = RadioAccess::UMTS;
  /// How long the other radio access has been the better one.
  std::chrono::milliseconds _otherIsBetter{0};
  double _downlinkRate = 0;
  double _uplinkRate = 0;
  double _downlinkBytes = 0;
  double _uplinkBytes = 0;
  unsigned _cellChanges = 0;
  unsigned _accessChanges = 0;
  double _inCellSince = 0;
};

}  // namespace kestro
