// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/UTRANClassIndex.h"

namespace kestro {
namespace {

constexpr MeasuredSection kUTRANSections[] = {
    {&kRRCStateSection},       {&kUTRANServingCellInfoSection},
    {&kUTRANNeighborsSection}, {&kUTRANGSMNeighborsSection},
    {&kTRCHBLERSection},       {&kCCTRCHSIRSection},
    {&kPDPContextListSection}, {&kSimInfoSection},
};

}  // namespace

std::span<const MeasuredSection> utranSections() { return kUTRANSections; }

}  // namespace kestro
