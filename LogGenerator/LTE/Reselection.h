// SPDX-License-Identifier: MIT
// The LTE reselection packet, 0xB186: the candidates of any radio technology.
#pragma once

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

/// A candidate's fields overlap the first bytes of the next one. So of several candidates only the
/// last one is shown as it was meant.
inline constexpr PacketKind kLTEReselectionPacket = {
    .code = 0xB186, .name = "LTE reselection candidates", .minimumLength = 21};

extern const Section kReselectionCandidatesSection;
extern const Section kReselectionCandidatesListSection;

using ReselectionCandidatesMisc = TableDecoder<kReselectionCandidatesSection>;
using ReselectionCandidatesList = TableDecoder<kReselectionCandidatesListSection>;

}  // namespace kestro
