// SPDX-License-Identifier: MIT
// The decoders of the UTRAN technology.
#pragma once

#include <memory>
#include <span>

#include "LogGenerator/Ondrel/ClassIndex.h"
#include "LogGenerator/Ondrel/SectionMeasurer.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "LogGenerator/UTRAN/Measurements.h"
#include "LogGenerator/UTRAN/RRCState.h"
#include "LogGenerator/UTRAN/ServingCellInfo.h"

namespace kestro {

/// The sections of these decoders, in the same order: what is measured.
[[nodiscard]] std::span<const MeasuredSection> utranSections();

/// Owns one decoder for each section, made in the order of the fields.
class UTRANClassIndex : public ClassIndex {
 public:
  explicit UTRANClassIndex(const GeneratorServices& services) : ClassIndex(services) {}

 private:
  // NOLINTBEGIN(readability-identifier-naming): the fields' given names
  std::unique_ptr<RRC_State> rrc_state = make<RRC_State>();
  std::unique_ptr<UTRANServingCellInfo> servingCellInfo = make<UTRANServingCellInfo>();
  std::unique_ptr<UTRANNeighbhorMeasurements> tdMeasurements = make<UTRANNeighbhorMeasurements>();
  std::unique_ptr<GSMNeighbhorMeasurements> gsmMeasurements = make<GSMNeighbhorMeasurements>();
  std::unique_ptr<TRCHBLERMeasurement> trchMeasurements = make<TRCHBLERMeasurement>();
  std::unique_ptr<CCTRCHSIRMeasurement> cctrchMeasurements = make<CCTRCHSIRMeasurement>();
  std::unique_ptr<PDPContextList> pdpList = make<PDPContextList>();
  std::unique_ptr<SimInfo> simInfo = make<SimInfo>();
  // NOLINTEND(readability-identifier-naming)
};

}  // namespace kestro
