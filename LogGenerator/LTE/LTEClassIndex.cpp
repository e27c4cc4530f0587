// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/LTEClassIndex.h"

#include "LogGenerator/GeneratorServices.h"
#include "Platform/TextSink.h"

namespace kestro {
namespace {

constexpr MeasuredSection kLTESections[] = {
    {&kLTEServingCellInfoSection},
    {&kConnectedModeMeasurementSection},
    {&kMeasuredNeighborCellsSection},
    {&kDetectedCellsSection},
    {&kServingCellMeasurementSection},
    {&kNeighborMeasurementSection},
    {&kNeighborCellsListSection},
    {&kReselectionCandidatesSection},
    {&kReselectionCandidatesListSection},
    {&kSimInfoSection},
    {&kPDPContextListSection},
};

}  // namespace

std::span<const MeasuredSection> lteSections() { return kLTESections; }

LTEClassIndex::~LTEClassIndex() { services().standardOutput.writeLine("Deallocing LTEClassIndex"); }

}  // namespace kestro
