// SPDX-License-Identifier: MIT
// UTRAN measurements and states as the baseband's packets, written through the tables that decode
// them. Every function yields one packet; absent when a value lies outside what the packet can
// carry.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <span>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// What a cell broadcasts about itself. In TDD, uplink and downlink share its frequency.
struct UTRANCell {
  unsigned uarfcn = 0;
  unsigned parameterId = 0;  ///< the cell parameter ID, 0 to 127, for the scrambling code
  std::uint32_t cellIdentity = 0;
  unsigned locationArea = 0;
  unsigned registrationArea = 0;  ///< URA
};

/// The mode of the phone's radio-resource control, as the packet numbers it.
enum class UTRANMode : std::uint8_t { Disconnected, Connecting, Fach, Dch, CellPch, UraPch };

/// How much the phone has to do with a cell, as the packet numbers it.
enum class UTRANSet : std::uint8_t {
  Active,     ///< connected to it, or camping on it
  Monitored,  ///< the network asked for its measurement
  Detected,   ///< found without having been asked for
};

struct UTRANCellReport {
  unsigned uarfcn = 0;
  unsigned parameterId = 0;
  double rscp = 0;  ///< dBm; what lies outside -116 to 139 is reported as these
  UTRANSet set = UTRANSet::Monitored;
  bool isJointlyDetected = false;  ///< taken out of the serving cell's interference
};

struct UTRANGSMCellReport {
  unsigned cellId = 0;
  unsigned arfcn = 0;
  unsigned bsic = 0;  ///< 8 × NCC + BCC
  double level = 0;   ///< dBm
};

struct UTRANTransportChannel {
  unsigned id = 0;
  double blockErrorRate = 0;  ///< 0 to 1
};

/// A coded composite transport channel.
struct UTRANCodedChannel {
  unsigned id = 0;
  unsigned timeslot = 0;
  std::array<double, 6> sir{};  ///< signal to interference, dB
};

[[nodiscard]] std::optional<Bytes> utranRrcState(UTRANMode mode, Moment time);
[[nodiscard]] std::optional<Bytes> utranSystemInformation(const UTRANCell& cell, Moment time);
[[nodiscard]] std::optional<Bytes> utranNeighbours(std::span<const UTRANCellReport> cells,
                                                   Moment time);
[[nodiscard]] std::optional<Bytes> utranGSMNeighbours(std::span<const UTRANGSMCellReport> cells,
                                                      Moment time);
[[nodiscard]] std::optional<Bytes> utranChannels(std::span<const UTRANTransportChannel> transport,
                                                 std::span<const UTRANCodedChannel> coded,
                                                 Moment time);

// --- The steps in which the phone reports its measurements ---------------------------------------

/// 0 for no errors, then 1 to 63: steps of 0.065 in the rate's logarithm, the first below 10^-4.03.
[[nodiscard]] unsigned utranBlockErrorStep(double rate) noexcept;

/// 0 to 63: half decibels from -11 dB, the first below it.
[[nodiscard]] unsigned utranSirStep(double sir) noexcept;

}  // namespace kestro
