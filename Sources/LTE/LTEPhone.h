// SPDX-License-Identifier: MIT
// A simulated LTE phone on a drive: two frequencies, handover and reselection between their cells.
#pragma once

#include <array>
#include <chrono>
#include <cstdint>
#include <optional>
#include <vector>

#include "Sources/LTE/LTEPackets.h"
#include "Sources/World/CellSelection.h"
#include "Sources/World/RadioWorld.h"
#include "Sources/World/SimulatedPhone.h"

namespace kestro {

/// The cells of one LTE frequency, as the phone receives them.
class LTECarrier {
 public:
  struct Parameters {
    LTECell cell;  ///< what all its cells have in common
    RadioLayerParameters radio;
    LTEReselectionParameters reselection;
    unsigned firstPhysicalCellId = 0;
    unsigned firstSectorNumber = 0;  ///< within a mast's cell identities
  };

  explicit LTECarrier(Parameters parameters);

  /// Measures all cells from where the car is.
  void measure(const Drive& drive);

  /// All cells by their filtered level, strongest first.
  [[nodiscard]] const std::vector<CellLevel>& levels() const noexcept { return _averages; }
  [[nodiscard]] const LTEReselectionParameters& reselection() const noexcept {
    return _parameters.reselection;
  }
  [[nodiscard]] LTECell cell(std::size_t index) const;
  [[nodiscard]] LTEServing serving(std::size_t index) const;
  [[nodiscard]] LTENeighbour neighbour(std::size_t index) const;
  /// Srxlev of a cell by its filtered level.
  [[nodiscard]] int selectionLevel(std::size_t index) const;

 private:
  [[nodiscard]] LTELevel levelOf(double rsrp) const;
  [[nodiscard]] const CellLevel& measured(std::size_t index) const;

  Parameters _parameters;
  RadioLayer _radio;
  std::vector<CellLevel> _levels;
  std::vector<CellLevel> _averages;
  double _totalPerBlock = 0;  ///< dBm in one resource block, everything together
};

class LTEPhone {
 public:
  static constexpr std::size_t kCarriers = 2;

  explicit LTEPhone(std::uint64_t seed);

  /// Lets time pass: the car drives, cells are measured and chosen, data flows.
  void advance(std::chrono::milliseconds time);

  [[nodiscard]] const Drive& drive() const noexcept { return _drive; }
  [[nodiscard]] const LTECarrier& servingCarrier() const { return _carriers[_carrier]; }
  [[nodiscard]] std::size_t servingCell() const { return _selections[_carrier].serving(); }
  /// The frequency that does not serve, and its strongest cell.
  [[nodiscard]] const LTECarrier& otherCarrier() const { return _carriers[1 - _carrier]; }
  [[nodiscard]] std::size_t otherCell() const { return otherCarrier().levels().front().cell; }

  [[nodiscard]] LTEServing serving() const;
  /// The other cells on the serving frequency that can be measured, strongest first.
  [[nodiscard]] std::vector<LTENeighbour> neighbours() const;

  [[nodiscard]] Activity activity() const noexcept { return _session.activity(); }
  [[nodiscard]] double downlinkBytes() const noexcept { return _downlinkBytes; }
  [[nodiscard]] double uplinkBytes() const noexcept { return _uplinkBytes; }
  /// Whether the serving cell changed in the last step.
  [[nodiscard]] bool hasNewCell() const noexcept { return _hasNewCell; }

 private:
  void chooseCarrier(std::chrono::milliseconds time);
  void transfer(std::chrono::milliseconds time);

  Drive _drive;
  DataSession _session;
  std::array<LTECarrier, kCarriers> _carriers;
  std::array<CellSelection, kCarriers> _selections;
  std::size_t _carrier = 0;
  std::chrono::milliseconds _otherIsBetter{0};
  unsigned _lowCycles = 0;
  bool _hasNewCell = true;
  double _downlinkBytes = 0;
  double _uplinkBytes = 0;
};

}  // namespace kestro
