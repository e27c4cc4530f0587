// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"

#include "LogGenerator/GsmUmts/NeighbourMeasurer.h"
#include "Platform/TextSink.h"

namespace kestro {
namespace {

constexpr MeasuredSection kGsmUmtsSections[] = {
    {&kActiveSetSection},
    {&kCodingSchemeSection},
    {&kGPRSInformationSection},
    {&kGSMServingCellSection},
    {&kMobileAllocationSection},
    {&kNeighboringCellsSection, MeasuredSection::make<NeighbourMeasurer>},
    {&kPDPContextListSection},
    {&kProcessPSSection},
    {&kUMTSRRMeasurementSection},
    {&kCellChangeCountersSection},
    {&kDetectedSetSection},
    {&kGSMSetSection},
    {&kNonRankedGSMSetSection},
    {&kProcessCOSection},
    {&kServingPLMNSection},
    {&kUMTSSetSection},
    {&kEquivalentPLMNListSection},
    {&kGSMRRInfoSection},
    {&kMonitoredSetSection},
    {&kNonRankedUMTSSetSection},
    {&kProcessCSSection},
    {&kUMTSRRInfoSection},
    {&kBLERSection},
    {&kVirtualActiveSetSection},
    {&kSimInfoSection},
    {&kHSDPAInformationSection},
};

}  // namespace

std::span<const MeasuredSection> gsmUmtsSections() { return kGsmUmtsSections; }

Ondrel_GSMClassIndex::~Ondrel_GSMClassIndex() {
  services().standardOutput.writeLine("Deallocing Ondrel_GSMClassIndex");
}

}  // namespace kestro
