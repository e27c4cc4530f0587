// SPDX-License-Identifier: MIT
// Everything that is told of a drive: its cells, and what happened.
#pragma once

#include <chrono>
#include <optional>
#include <span>
#include <vector>

#include "Measurements/Alarms.h"
#include "Measurements/CellTracker.h"
#include "Measurements/StateChanges.h"

namespace kestro {

/// Watches one drive, in memory that does not grow with its length.
class DriveWatch {
 public:
  /// Without a message for so long they are told to be missing.
  static constexpr std::chrono::seconds kMissingAfter{5};

  /// `sink` receives every event; it must not call the watch. The messages' technologies must be
  /// constants.
  DriveWatch(std::vector<Rule> rules, const EventSink& sink);

  void take(const MeasuredMessage& message);

  /// For a drive that is going on, whose messages come at about `now`: tells when they are missing.
  void passTime(Moment now);

  [[nodiscard]] const Cells& cells() const noexcept { return _cells.cells(); }
  /// The last message's levels and qualities of cells. Valid until the next message.
  [[nodiscard]] std::span<const CellValue> cellValues() const noexcept { return _cells.values(); }
  [[nodiscard]] const Alarms& alarms() const noexcept { return _alarms; }

 private:
  void tellMissing();
  void tellBack(const MeasuredMessage& message);

  EventSink _sink;
  Alarms _alarms;
  CellTracker _cells;
  StateChanges _states;
  std::optional<Moment> _lastTime;
  std::uint64_t _lastNumber = 0;
  std::string_view _lastTechnology;
  bool _areMissing = false;
};

}  // namespace kestro
