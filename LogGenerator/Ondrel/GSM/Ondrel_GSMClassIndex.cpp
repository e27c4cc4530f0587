// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/GSM/Ondrel_GSMClassIndex.h"

#include "Platform/TextSink.h"

namespace kestro {
namespace {

constexpr const Section* kSections[] = {
    &kActiveSetSection,
    &kCodingSchemeSection,
    &kGPRSInformationSection,
    &kGSMServingCellSection,
    &kMobileAllocationSection,
    &kNeighboringCellsSection,
    &kPDPContextListSection,
    &kProcessPSSection,
    &kUMTSRRMeasurementSection,
    &kCellChangeCountersSection,
    &kDetectedSetSection,
    &kGSMSetSection,
    &kNonRankedGSMSetSection,
    &kProcessCOSection,
    &kServingPLMNSection,
    &kUMTSSetSection,
    &kEquivalentPLMNListSection,
    &kGSMRRInfoSection,
    &kMonitoredSetSection,
    &kNonRankedUMTSSetSection,
    &kProcessCSSection,
    &kUMTSRRInfoSection,
    &kBLERSection,
    &kVirtualActiveSetSection,
    &kSimInfoSection,
    &kHSDPAInformationSection,
};

}  // namespace

std::span<const Section* const> gsmSections() { return kSections; }

Ondrel_GSMClassIndex::~Ondrel_GSMClassIndex() {
  platform().standardOutput().writeLine("Deallocing Ondrel_GSMClassIndex");
}

}  // namespace kestro
