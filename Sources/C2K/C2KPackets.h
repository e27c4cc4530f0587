// SPDX-License-Identifier: MIT
// CDMA2000 measurements, states and counters as the baseband's packets, written through the tables
// that decode them. Every function yields one packet; absent when a value lies outside what the
// packet can carry.
#pragma once

#include <cstdint>
#include <optional>
#include <span>

#include "LogGenerator/C2K/EVDOThroughput.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

struct C2KPilot {
  unsigned pnOffset = 0;  ///< 0 to 511, in units of 64 chips
  double energy = 0;      ///< dB
};

/// Where a receiver is tuned to.
struct C2KChannel {
  unsigned bandClass = 0;
  unsigned number = 0;
};

// --- 1x ------------------------------------------------------------------------------------------

/// The states of 1x call processing that a phone reports, as the packet numbers them.
enum class OneXState : std::uint8_t {
  Initial = 2,  ///< after a call
  Acquisition = 3,
  Sync = 4,
  Paging = 6,
  Sleep = 7,  ///< between the slots in which the phone may be paged
  Traffic = 8,
  PowerUp = 11,
};

struct OneXReport {
  OneXState state = OneXState::PowerUp;
  C2KChannel channel;           ///< of both receivers
  double receivePower[2] = {};  ///< dBm; what lies outside -106.0 to -20.8 is reported as these
  double transmitPower = 0;     ///< dBm
  /// The pilots with the Ec/Io of each (against everything received), -20 to -1 dB. The first one
  /// is the reference.
  std::span<const C2KPilot> activeSet;
};
[[nodiscard]] std::optional<Bytes> oneXStatus(const OneXReport& report, Moment time);

/// One frame of the traffic channel.
[[nodiscard]] std::optional<Bytes> oneXTrafficFrame(bool isBad, Moment time);

struct OneXSystem {
  unsigned systemId = 0;
  unsigned networkId = 0;
  unsigned baseStationId = 0;
  unsigned packetZoneId = 0;
  unsigned protocolRevision = 6;
  bool isRoaming = false;
};
[[nodiscard]] std::optional<Bytes> oneXSystemParameters(const OneXSystem& system, Moment time);

// --- EV-DO ---------------------------------------------------------------------------------------

// As the packet numbers them.
enum class EVDOState : std::uint8_t { Inactive, Acquisition, Sync, Idle, Access, Connected };
enum class EVDOSession : std::uint8_t { Closed, Setup, Negotiation, Initiated, Open };

struct EVDOReport {
  EVDOState deviceState = EVDOState::Inactive;
  EVDOSession sessionState = EVDOSession::Closed;
  C2KChannel channel;
  double receivePower[2] = {};  ///< dBm
  double transmitPower = 0;     ///< dBm
  std::optional<unsigned> servingPilot{};
  std::uint32_t address = 0;  ///< the low 24 bits of the unicast address (UATI)
  unsigned colorCode = 0;
};
[[nodiscard]] std::optional<Bytes> evdoStatus(const EVDOReport& report, Moment time);

/// The energies are Ec/Io: against everything received.
[[nodiscard]] std::optional<Bytes> evdoActiveSet(std::span<const C2KPilot> pilots, Moment time);

/// The pilots that the receiver's fingers follow, with the carrier against the interference. A
/// finger without a pilot is reported as unused.
[[nodiscard]] std::optional<Bytes> evdoFingers(std::span<const std::optional<C2KPilot>> fingers,
                                               Moment time);

/// One value for each of the layout's counters.
[[nodiscard]] std::optional<Bytes> evdoThroughput(const ThroughputLayout& layout,
                                                  std::uint32_t sequenceNumber,
                                                  std::span<const std::uint32_t> counters,
                                                  Moment time);

}  // namespace kestro
