// SPDX-License-Identifier: MIT
// The UMTS cells that the phone knows: its sets in connected mode (0x417A), the ranking in idle
// mode (0x4005), and the neighbours that the cell monitor reports.
#pragma once

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kUMTSSetInformationPacket = {
    .code = 0x417A, .name = "UMTS set information", .minimumLength = 16};
inline constexpr PacketKind kIdleModeRankingPacket = {
    .code = 0x4005, .name = "Idle-mode cell ranking", .minimumLength = 15};

/// The idle-mode cell ranking, as far as its UMTS and GSM cells have it in common. The cells of
/// both kinds are read from the same offset: a packet carries one kind.
struct IdleModeRanking {
  static constexpr Place kUMTSCellCount = u8(13);
  static constexpr Place kGSMCellCount = u8(14);
  static constexpr unsigned kFirstCell = 15;

  static constexpr Field kCounts[] = {
      {"UMTS Cells", kUMTSCellCount, hidden()},
      {"GSM Cells", kGSMCellCount, hidden()},
  };
};

extern const Section kActiveSetSection;
extern const Section kDetectedSetSection;
extern const Section kMonitoredSetSection;
extern const Section kVirtualActiveSetSection;
extern const Section kUMTSSetSection;

/// The members of the active set, with RSCP and Ec/N0 in dB.
using ActiveSet = TableDecoder<kActiveSetSection>;

// Each packet empties these three: they go through its cells without showing one.
using DetectedSet = TableDecoder<kDetectedSetSection>;
using MonitoredSet = TableDecoder<kMonitoredSetSection>;
using VirtualActiveSet = TableDecoder<kVirtualActiveSetSection>;

/// The ranked UMTS cells, or the UMTS neighbours of the cell monitor: whichever came last.
using UMTSSet = CellMonitorTableDecoder<kUMTSSetSection>;

}  // namespace kestro
