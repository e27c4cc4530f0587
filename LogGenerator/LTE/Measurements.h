// SPDX-License-Identifier: MIT
// The LTE measurement packets: 0xB179 (intra-frequency), 0xB17F (serving cell) and 0xB180
// (neighbours).
#pragma once

#include <vector>

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kLTEIntraFrequencyPacket = {
    .code = 0xB179, .name = "LTE intra-frequency measurement", .minimumLength = 29};
inline constexpr PacketKind kLTEServingCellPacket = {
    .code = 0xB17F, .name = "LTE serving-cell measurement", .minimumLength = 33};
inline constexpr PacketKind kLTENeighborPacket = {
    .code = 0xB180, .name = "LTE neighbour measurements", .minimumLength = 21};

extern const Section kConnectedModeMeasurementSection;
extern const Section kMeasuredNeighborCellsSection;
extern const Section kDetectedCellsSection;
extern const Section kServingCellMeasurementSection;
extern const Section kNeighborMeasurementSection;
extern const Section kNeighborCellsListSection;

using ConnectedModeMeasurementMisc = TableDecoder<kConnectedModeMeasurementSection>;
using MeasuredNeighborCells = TableDecoder<kMeasuredNeighborCellsSection>;
using DetectedCells = TableDecoder<kDetectedCellsSection>;
using ServingCellMeasurement = TableDecoder<kServingCellMeasurementSection>;
using NeighborMeasurementMisc = TableDecoder<kNeighborMeasurementSection>;

/// Also writes every record's identity and levels to the system log.
class NeighborCellsList : public SectionDecoder {
 public:
  explicit NeighborCellsList(const GeneratorServices& services)
      : SectionDecoder(services, kNeighborCellsListSection) {}

 protected:
  void willPublish(const ListReading& list, PacketView packet, std::vector<Value>& rows) override;
};

}  // namespace kestro
