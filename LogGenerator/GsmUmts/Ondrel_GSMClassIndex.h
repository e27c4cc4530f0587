// SPDX-License-Identifier: MIT
// The decoders of the GSM/UMTS technology.
#pragma once

#include <memory>
#include <span>

#include "LogGenerator/GsmUmts/CellSets.h"
#include "LogGenerator/GsmUmts/Cells.h"
#include "LogGenerator/GsmUmts/LinkQuality.h"
#include "LogGenerator/GsmUmts/MobilityManagement.h"
#include "LogGenerator/GsmUmts/RadioResource.h"
#include "LogGenerator/GsmUmts/UnfilledSections.h"
#include "LogGenerator/Ondrel/ClassIndex.h"
#include "LogGenerator/Ondrel/SectionMeasurer.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"

namespace kestro {

/// The sections of these decoders, in the same order: what is measured.
[[nodiscard]] std::span<const MeasuredSection> gsmUmtsSections();

/// Owns one decoder for each section, made in the order of the fields.
class Ondrel_GSMClassIndex : public ClassIndex {
 public:
  explicit Ondrel_GSMClassIndex(const GeneratorServices& services) : ClassIndex(services) {}
  /// Leaves a line on the standard output.
  ~Ondrel_GSMClassIndex() override;

 private:
  std::unique_ptr<ActiveSet> objActiveSet = make<ActiveSet>();
  std::unique_ptr<CodingScheme> objCodingScheme = make<CodingScheme>();
  std::unique_ptr<GPRSInformation> objGPRSInformation = make<GPRSInformation>();
  std::unique_ptr<GSMServingCell> objGSMServingCell = make<GSMServingCell>();
  std::unique_ptr<MobileAllocation> objMobileAllocation = make<MobileAllocation>();
  std::unique_ptr<NeighboringCells> objNeighboringCells = make<NeighboringCells>();
  std::unique_ptr<PDPContextList> objPDPContextList = make<PDPContextList>();
  std::unique_ptr<ProcessPS> objProcessPS = make<ProcessPS>();
  std::unique_ptr<UMTSRRMeasurement> objUMTSRRMeasurement = make<UMTSRRMeasurement>();
  std::unique_ptr<CellChangeCounters> objCellChangeCounter = make<CellChangeCounters>();
  std::unique_ptr<DetectedSet> objDetectedSet = make<DetectedSet>();
  std::unique_ptr<GSMSet> objGSMSet = make<GSMSet>();
  std::unique_ptr<NonRankedGSMSet> objNonRankedGSMSet = make<NonRankedGSMSet>();
  std::unique_ptr<ProcessCO> objProcessCO = make<ProcessCO>();
  std::unique_ptr<ServingPLMN> objServingPLMN = make<ServingPLMN>();
  std::unique_ptr<UMTSSet> objUMTSSet = make<UMTSSet>();
  std::unique_ptr<EquivalentPLMNList> objEquivalentPLMNList = make<EquivalentPLMNList>();
  std::unique_ptr<GSMRRInfo> objGSMRRInfo = make<GSMRRInfo>();
  std::unique_ptr<MonitoredSet> objMonitoredSet = make<MonitoredSet>();
  std::unique_ptr<NonRankedUMTSSet> objNonRankedUMTSSet = make<NonRankedUMTSSet>();
  std::unique_ptr<ProcessCS> objProcessCS = make<ProcessCS>();
  std::unique_ptr<UMTSRRInfo> objUMTSRRInfo = make<UMTSRRInfo>();
  std::unique_ptr<BLER> objBLER = make<BLER>();
  std::unique_ptr<VirtualActiveSet> objVirtualActiveSet = make<VirtualActiveSet>();
  std::unique_ptr<SimInfo> objSimInfo = make<SimInfo>();
  std::unique_ptr<HSDPAInformation> objHSDPAInformation = make<HSDPAInformation>();
};

}  // namespace kestro
