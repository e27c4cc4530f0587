// SPDX-License-Identifier: MIT
// The GSM cells: the serving cell, its neighbours, the GSM cells of the idle-mode ranking, and the
// frequencies that a hopping channel uses.
#pragma once

#include <cstdint>
#include <vector>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kGSMServingCellPacket = {
    .code = 0x5134, .name = "GSM serving-cell identity", .minimumLength = 26};
inline constexpr PacketKind kGSMMeasurementsPacket = {
    .code = 0x5137, .name = "GSM serving and neighbour measurements", .minimumLength = 29};
inline constexpr PacketKind kGSMNeighbourBSICsPacket = {
    .code = 0x51FF, .name = "Neighbour BSIC list", .minimumLength = 15};
inline constexpr PacketKind kGSMDedicatedChannelPacket = {
    .code = 0x5076, .name = "Dedicated-mode channel", .minimumLength = 17};
inline constexpr PacketKind kGSMMobileAllocationPacket = {
    .code = 0x51F8, .name = "Mobile allocation", .minimumLength = 15};

/// The GSM measurements, in the packet's order. Three sections show the serving cell's values, each
/// in its own way.
struct GSMMeasurements {
  static constexpr Place kServingLevel = u8(15);
  static constexpr Place kServingQualityFull = u32(16);
  static constexpr Place kServingQualitySub = u32(20);
  static constexpr Place kNeighbourCount = u8(28);
  static constexpr unsigned kFirstNeighbour = 29;
  static constexpr Place kNeighbourARFCN = u16(0);  ///< in each neighbour's record
};

/// The list of the cells' identities by their channels: in each entry.
struct GSMBSICList {
  static constexpr Place kARFCN = u16(0);
  static constexpr Place kBSIC = u8(2);
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
  explicit NeighboringCells(const GeneratorServices& services)
      : CellMonitorDecoder(services, kNeighboringCellsSection) {}

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
