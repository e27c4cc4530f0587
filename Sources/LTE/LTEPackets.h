// SPDX-License-Identifier: MIT
// LTE measurements as the baseband's packets, written through the tables that decode them.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "LogGenerator/Packets/Encode.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// What a cell broadcasts about itself.
struct LTECell {
  unsigned earfcn = 0;
  unsigned uplinkEarfcn = 0;
  unsigned band = 0;
  unsigned resourceBlocks = 100;
  unsigned physicalCellId = 0;
  std::uint32_t cellIdentity = 0;
  unsigned trackingAreaCode = 0;
  unsigned antennas = 2;
};

/// dBm, dB, dBm.
struct LTELevel {
  double rsrp = 0;
  double rsrq = 0;
  double rssi = 0;
};

/// What a cell broadcasts about reselection. All levels in dBm or dB, as shown.
struct LTEReselectionParameters {
  unsigned priority = 0;
  int minimumRsrp = -128;   ///< Qrxlevmin
  int maximumPower = 23;    ///< P_Max
  int intraSearch = 46;     ///< neighbours on the frequency are looked for below this Srxlev
  int nonIntraSearch = 20;  ///< other frequencies are, below this one

  /// Srxlev of a cell received so: how far it is above the minimum.
  [[nodiscard]] int selectionLevel(double rsrp) const noexcept;
};

struct LTENeighbour {
  unsigned physicalCellId = 0;
  LTELevel now;
  LTELevel average;
  unsigned frameOffset = 0;      ///< frames
  unsigned sampleOffset = 0;     ///< samples
  unsigned frequencyOffset = 0;  ///< Hz
};

struct LTEServing {
  LTECell cell;
  LTELevel now;
  LTELevel average;
  LTEReselectionParameters reselection;
  unsigned consecutiveLowCycles = 0;  ///< DRX cycles with Srxlev below 0
  bool rulesUpdated = false;
};

// One packet each; absent when a value lies outside what the packet can carry.
[[nodiscard]] std::optional<Bytes> lteSystemInformation(const LTECell& cell, Moment time);
[[nodiscard]] std::optional<Bytes> lteAntennas(const LTECell& cell, Moment time);
[[nodiscard]] std::optional<Bytes> lteServingCell(const LTEServing& serving, Moment time);
[[nodiscard]] std::optional<Bytes> lteIntraFrequency(const LTEServing& serving,
                                                     std::span<const LTENeighbour> measured,
                                                     std::span<const unsigned> detectedCellIds,
                                                     unsigned subframe, Moment time);
/// 1 to 32 neighbours.
[[nodiscard]] std::optional<Bytes> lteNeighbours(const LTEServing& serving,
                                                 std::span<const LTENeighbour> neighbours,
                                                 Moment time);

/// The one candidate of a reselection packet, by its keys in the display and their raw values.
struct LTECandidate {
  std::string_view technology;  ///< as the display names it: "LTE", "UTRAN", …
  unsigned priority = 0;
  std::vector<std::pair<std::string_view, std::int64_t>> fields;
};
[[nodiscard]] std::optional<Bytes> lteReselection(const LTEServing& serving,
                                                  const LTECandidate& candidate, Moment time);

}  // namespace kestro
