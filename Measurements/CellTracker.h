// SPDX-License-Identifier: MIT
// Follows the cells of a drive, message by message.
#pragma once

#include <array>
#include <chrono>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "Measurements/CellReader.h"
#include "Measurements/Cells.h"
#include "Measurements/ServingCells.h"

namespace kestro {

/// A level or quality among a message's values, and the cell that it is of.
struct CellValue {
  std::size_t at = 0;  ///< its place among the message's values
  CellId cell = 0;
  bool isQuality = false;
  bool isServing = false;
  bool isAssumed = false;  ///< the cell is known by channel and physical identity only
};

/// Joins what packets say of cells into rows (`cells`), and tells changes of the serving cell, its
/// technology, area and network.
class CellTracker {
 public:
  /// Without a deciding packet for so long, the fallback decides.
  static constexpr std::chrono::seconds kFallbackAfter{2};
  /// A cell is not said to serve where no message came for so long.
  static constexpr std::chrono::seconds kSilence{5};

  explicit CellTracker(EventSink sink) : _sink(sink), _serving(_cells, std::move(sink)) {}
  CellTracker(const CellTracker&) = delete;
  CellTracker& operator=(const CellTracker&) = delete;

  void take(const MeasuredMessage& message);

  [[nodiscard]] const Cells& cells() const noexcept { return _cells; }
  /// The last message's levels and qualities. Valid until the next message.
  [[nodiscard]] std::span<const CellValue> values() const noexcept { return _values; }

 private:
  /// A cell that an observation is of.
  struct Sight {
    ServingCell cell;
    bool isServing = false;
  };
  /// Areas and networks of radios that share them.
  struct Region {
    std::optional<std::uint32_t> area{};
    std::string network{};
  };

  void countServing(Moment time);
  void takeObservation(const MeasuredMessage& message, const CellObservation& observation);
  void takeActiveSet(const MeasuredMessage& message, std::span<const CellObservation> rows);
  void decide(const MeasuredMessage& message, const CellObservation& observation);
  [[nodiscard]] bool fallbackDecides(const MeasuredMessage& message, Radio radio);
  [[nodiscard]] Sight sightOf(const CellObservation& observation, Moment time) const;
  [[nodiscard]] Sight servingSight(const CellObservation& observation, Moment time) const;
  void absorb(const MeasuredMessage& message, const CellObservation& observation,
              const Sight& sight);
  void addLevels(const CellObservation& observation, const Sight& sight, Moment time);
  void takeRegion(const MeasuredMessage& message, const CellObservation& observation, Radio radio);
  void tellRegion(EventKind kind, const MeasuredMessage& message, Radio radio, std::string from,
                  std::string to) const;
  [[nodiscard]] Region& regionOf(Radio radio);

  EventSink _sink;
  CellReader _reader;
  Cells _cells;
  ServingCells _serving;
  KnownIdentities _identities;
  std::vector<CellValue> _values;
  std::array<std::optional<Moment>, kRadioCount> _lastDecided{};
  std::array<Region, kRadioCount> _regions{};
  std::optional<Moment> _lastTime;
};

}  // namespace kestro
