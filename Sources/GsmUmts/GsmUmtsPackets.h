// SPDX-License-Identifier: MIT
// GSM and UMTS measurements and states as the baseband's packets, written through the tables that
// decode them. Every function yields one packet; absent when a value lies outside what the packet
// can carry.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

#include "LogGenerator/Packets/PacketKind.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// A UMTS cell as measured: dBm, dB.
struct UMTSCellReport {
  unsigned uarfcn = 10613;
  unsigned scramblingCode = 0;
  double rscp = 0;
  double energyPerChip = 0;  ///< Ec/N0
};

/// A GSM cell as measured.
struct GSMCellReport {
  unsigned arfcn = 0;
  unsigned bsic = 0;  ///< network and base-station colour: 8 × NCC + BCC
  double level = 0;   ///< dBm
  int c1 = 0;
};

/// Network and area.
struct NetworkArea {
  unsigned countryCode = 999;  ///< three digits
  unsigned networkCode = 990;  ///< three digits
  unsigned locationArea = 0;
  unsigned routingArea = 1;
};

/// The GSM level as a packet's byte: dB above -110 dBm, 0 to 63.
[[nodiscard]] unsigned gsmLevelByte(double level) noexcept;

// --- UMTS ----------------------------------------------------------------------------------------

/// The cells of the active set; `total` is the received power of the whole carrier, dBm, of which
/// each cell's Ec/N0 is a part.
[[nodiscard]] std::optional<Bytes> umtsSets(std::span<const UMTSCellReport> active, double total,
                                            Moment time);
/// The idle-mode ranking, of one kind of cells only: the packet's two tables overlap.
[[nodiscard]] std::optional<Bytes> umtsRanking(std::span<const UMTSCellReport> cells, Moment time);
[[nodiscard]] std::optional<Bytes> gsmRanking(std::span<const GSMCellReport> cells, Moment time);

struct TransportChannelReport {
  unsigned id = 0;
  std::uint32_t blocks = 0;
  std::uint32_t errors = 0;
};
[[nodiscard]] std::optional<Bytes> umtsBlockErrors(std::span<const TransportChannelReport> channels,
                                                   Moment time);

struct HarqProcessReport {
  unsigned id = 0;
  std::uint32_t bits = 0;
  unsigned transmissions = 0;
  unsigned blockErrors = 0;
};
[[nodiscard]] std::optional<Bytes> hsdpaStatistics(std::span<const HarqProcessReport> processes,
                                                   unsigned subframes, Moment time);

// --- GSM -----------------------------------------------------------------------------------------

[[nodiscard]] std::optional<Bytes> gsmServingCell(const GSMCellReport& cell, unsigned cellId,
                                                  Moment time);
/// The serving cell's level and C1, C2, and the neighbours.
[[nodiscard]] std::optional<Bytes> gsmMeasurements(const GSMCellReport& serving,
                                                   std::span<const GSMCellReport> neighbours,
                                                   Moment time);
[[nodiscard]] std::optional<Bytes> gsmColourCodes(std::span<const GSMCellReport> neighbours,
                                                  Moment time);
[[nodiscard]] std::optional<Bytes> gsmDedicatedChannel(unsigned arfcn, Moment time);
[[nodiscard]] std::optional<Bytes> gsmMobileAllocation(unsigned hoppingSequence,
                                                       std::span<const unsigned> arfcns,
                                                       Moment time);
/// `state` is a name of the display.
[[nodiscard]] std::optional<Bytes> gsmRadioResource(std::string_view state, unsigned mode,
                                                    Moment time);
[[nodiscard]] std::optional<Bytes> gsmDiscontinuousReception(unsigned seconds, Moment time);
[[nodiscard]] std::optional<Bytes> gsmDiscontinuousTransmission(bool isUsed, Moment time);

// --- Mobility management: states are names of the display ----------------------------------------

[[nodiscard]] std::optional<Bytes> mmState(std::string_view state, std::string_view subState,
                                           std::string_view updateStatus, Moment time);
[[nodiscard]] std::optional<Bytes> gmmState(std::string_view state, std::string_view subState,
                                            std::string_view updateStatus, Moment time);
[[nodiscard]] std::optional<Bytes> registrationState(std::string_view state,
                                                     std::string_view selectionMode, Moment time);
[[nodiscard]] std::optional<Bytes> servingNetwork(const NetworkArea& area,
                                                  std::string_view serviceType, Moment time);
/// One equivalent network: the packet's entries overlap.
[[nodiscard]] std::optional<Bytes> equivalentNetwork(const NetworkArea& network, Moment time);

/// A packet whose contents nobody has described: its header and 32 zero bytes.
[[nodiscard]] std::optional<Bytes> undescribedPacket(const PacketKind& packet, Moment time);

}  // namespace kestro
