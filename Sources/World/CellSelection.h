// SPDX-License-Identifier: MIT
// How a simulated phone chooses its cells.
#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <span>
#include <vector>

#include "Sources/World/RadioWorld.h"

namespace kestro {

/// One serving cell: another takes over when it has been stronger by the hysteresis for the time to
/// trigger, without a break.
class CellSelection {
 public:
  CellSelection(double hysteresis, std::chrono::milliseconds timeToTrigger) noexcept
      : _hysteresis(hysteresis), _timeToTrigger(timeToTrigger) {}

  /// Looks at the cells, strongest first, `elapsed` after the last look; true when the serving cell
  /// changed. The first look takes the strongest. At least one cell must be given.
  bool update(std::span<const CellLevel> levels, std::chrono::milliseconds elapsed);

  /// The serving cell's index; update must have been called.
  [[nodiscard]] std::size_t serving() const { return *_serving; }

  /// Forgets the serving cell: the next look takes the strongest.
  void reset() noexcept { _serving.reset(); }

 private:
  double _hysteresis;
  std::chrono::milliseconds _timeToTrigger;
  std::optional<std::size_t> _serving;
  std::optional<std::size_t> _candidate;
  std::chrono::milliseconds _stronger{0};
};

/// The active set of a phone in soft handover: at most three cells, those that are not much
/// weaker than the strongest. Cells join sooner than they leave.
class SoftHandoverSet {
 public:
  static constexpr std::size_t kMaximumSize = 3;
  static constexpr double kJoinRange = 4;   ///< dB below the strongest
  static constexpr double kLeaveRange = 7;  ///< dB below the strongest

  /// Looks at the cells, strongest first.
  void update(std::span<const CellLevel> levels);

  [[nodiscard]] bool contains(std::size_t cell) const;
  [[nodiscard]] std::size_t size() const noexcept { return _cells.size(); }

 private:
  std::vector<std::size_t> _cells;
};

/// The entry of a cell in a list of levels, which must hold it.
[[nodiscard]] const CellLevel& levelOfCell(std::span<const CellLevel> levels, std::size_t cell);

}  // namespace kestro
