// SPDX-License-Identifier: MIT
// The GSM radio-resource layer: its state, discontinuous reception and transmission, and the
// serving cell's level and quality.
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

extern const Section kGSMRRInfoSection;

/// What a packet does not carry stays.
using GSMRRInfo = TableDecoder<kGSMRRInfoSection>;

}  // namespace kestro
