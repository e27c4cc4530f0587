// SPDX-License-Identifier: MIT
// The GSM cells: the serving cell, its neighbours, the GSM cells of the idle-mode ranking, and the
// frequencies that a hopping channel uses.
#pragma once

#include <cstdint>
#include <vector>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

/// 0x5137, GSM serving and neighbour measurements, in the packet's order. Three sections show the
/// serving cell's values, each in its own way.
struct GSMMeasurements {
  static constexpr LogCode kCode = 0x5137;
  static constexpr std::string_view kName = "GSM serving and neighbour measurements";
  static constexpr std::size_t kMinimumLength = 29;
  static constexpr Place kServingLevel = u8(15);
  static constexpr Place kServingQualityFull = u32(16);
  static constexpr Place kServingQualitySub = u32(20);
  static constexpr Place kNeighbourCount = u8(28);
  static constexpr unsigned kFirstNeighbour = 29;
};

extern const Section kGSMServingCellSection;
extern const Section kNeighboringCellsSection;
extern const Section kGSMSetSection;
extern const Section kMobileAllocationSection;

/// Identity, channel and measurements of the serving cell. What a packet does not carry stays.
using GSMServingCell = CellMonitorTableDecoder<kGSMServingCellSection>;

/// The measured neighbours, each with the BSIC that the last BSIC list (0x51FF) has for its ARFCN,
/// or the GSM neighbours of the cell monitor: whichever came last.
class NeighboringCells : public CellMonitorDecoder {
 public:
  explicit NeighboringCells(Platform& platform)
      : CellMonitorDecoder(platform, kNeighboringCellsSection) {}

 protected:
  /// Notes the rows of a BSIC list.
  void willPublish(const ListReading& list, PacketView packet, std::vector<Value>& rows) override;
  /// A measured neighbour's BSIC.
  [[nodiscard]] Value supply(const Field& field, PacketView packet,
                             const RecordPosition& position) const override;

 private:
  struct NotedCell {
    std::uint32_t arfcn;
    Value bsic;
  };
  std::vector<NotedCell> _arfcnToBsic;  ///< the last list, in its order
};

/// The GSM cells of the idle-mode ranking.
using GSMSet = TableDecoder<kGSMSetSection>;

/// Hopping sequence number and frequencies.
using MobileAllocation = TableDecoder<kMobileAllocationSection>;

}  // namespace kestro
