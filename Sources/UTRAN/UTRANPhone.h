// SPDX-License-Identifier: MIT
// A simulated UTRAN phone on a drive: three frequencies whose directions take turns, cell changes,
// and a connection that comes and goes with the data.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "Sources/UTRAN/UTRANPackets.h"
#include "Sources/World/CellSelection.h"
#include "Sources/World/RadioWorld.h"
#include "Sources/World/SimulatedPhone.h"

namespace kestro {

/// The connection to the network: set up for a transfer, and given up step by step after it.
class UTRANConnection {
 public:
  void advance(std::chrono::milliseconds time, Activity activity) noexcept;
  [[nodiscard]] UTRANMode mode() const noexcept { return _mode; }

 private:
  [[nodiscard]] UTRANMode next(Activity activity) const noexcept;

  UTRANMode _mode = UTRANMode::Disconnected;
  std::chrono::milliseconds _inMode{0};
};

class UTRANPhone {
 public:
  explicit UTRANPhone(std::uint64_t seed);

  /// Lets time pass: the car drives, cells are measured and chosen, data flows.
  void advance(std::chrono::milliseconds time);

  [[nodiscard]] UTRANMode mode() const noexcept { return _connection.mode(); }
  [[nodiscard]] UTRANCell serving() const { return cell(_selection.serving()); }
  /// The serving cell, then the other cells that can be measured, strongest first.
  [[nodiscard]] std::vector<UTRANCellReport> cells() const;
  /// The strongest GSM cells.
  [[nodiscard]] std::vector<UTRANGSMCellReport> gsmCells() const;

  /// The channels that are received in the present mode: never none.
  [[nodiscard]] std::vector<UTRANTransportChannel> transportChannels() const;
  [[nodiscard]] std::vector<UTRANCodedChannel> codedChannels() const;

  [[nodiscard]] double downlinkBytes() const noexcept { return _downlinkBytes; }
  [[nodiscard]] double uplinkBytes() const noexcept { return _uplinkBytes; }
  /// Whether the serving cell changed in the last step.
  [[nodiscard]] bool hasNewCell() const noexcept { return _hasNewCell; }

 private:
  [[nodiscard]] UTRANCell cell(std::size_t index) const;
  [[nodiscard]] UTRANCellReport report(const CellLevel& level, UTRANSet set) const;
  /// Whether the serving cell's neighbour list names the cell.
  [[nodiscard]] bool isListed(std::size_t index) const;
  void measureInterference();
  [[nodiscard]] UTRANCodedChannel codedChannel(unsigned id, unsigned timeslot, double sir) const;
  [[nodiscard]] double dedicatedSir() const noexcept;
  void transfer(std::chrono::milliseconds time);

  std::uint64_t _seed;
  Drive _drive;
  RadioLayer _radio;
  RadioLayer _gsm;
  DataSession _session;
  UTRANConnection _connection;
  CellSelection _selection{3, std::chrono::milliseconds(1'000)};

  std::vector<CellLevel> _levels;
  std::vector<CellLevel> _gsmLevels;
  std::vector<std::size_t> _jointlyDetected;  ///< on the serving frequency, the serving cell first
  double _commonSir = 0;                      ///< of the serving cell's common channels, dB
  bool _hasNewCell = true;
  double _downlinkBytes = 0;
  double _uplinkBytes = 0;
};

}  // namespace kestro
