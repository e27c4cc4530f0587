// SPDX-License-Identifier: MIT
// The decoders of the LTE technology.
#pragma once

#include <memory>
#include <span>

#include "LogGenerator/LTE/Measurements.h"
#include "LogGenerator/LTE/Reselection.h"
#include "LogGenerator/LTE/ServingCellInfo.h"
#include "LogGenerator/Ondrel/ClassIndex.h"
#include "LogGenerator/Ondrel/SectionMeasurer.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"

namespace kestro {

/// The sections of these decoders, in the same order: what is measured.
[[nodiscard]] std::span<const MeasuredSection> lteSections();

/// Owns one decoder for each section, made in the order of the fields.
class LTEClassIndex : public ClassIndex {
 public:
  explicit LTEClassIndex(const GeneratorServices& services) : ClassIndex(services) {}
  /// Leaves a line on the standard output.
  ~LTEClassIndex() override;

 private:
  std::unique_ptr<LTEServingCellInfo> objLTEServingCellInfo = make<LTEServingCellInfo>();
  std::unique_ptr<ConnectedModeMeasurementMisc> objConnectedModeMeasurementMisc =
      make<ConnectedModeMeasurementMisc>();
  std::unique_ptr<MeasuredNeighborCells> objMeasuredNeighborCells = make<MeasuredNeighborCells>();
  std::unique_ptr<DetectedCells> objDetectedCells = make<DetectedCells>();
  std::unique_ptr<ServingCellMeasurement> objServingCellMeasurement =
      make<ServingCellMeasurement>();
  std::unique_ptr<NeighborMeasurementMisc> objNeighborMeasurementMisc =
      make<NeighborMeasurementMisc>();
  std::unique_ptr<NeighborCellsList> objNeighborCellsList = make<NeighborCellsList>();
  std::unique_ptr<ReselectionCandidatesMisc> objReselectionCandidatesMisc =
      make<ReselectionCandidatesMisc>();
  std::unique_ptr<ReselectionCandidatesList> objReselectionCandidatesList =
      make<ReselectionCandidatesList>();
  std::unique_ptr<SimInfo> objSimInfo = make<SimInfo>();
  std::unique_ptr<PDPContextList> objPDPContextList = make<PDPContextList>();
};

}  // namespace kestro
