// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/Reselection.h"

namespace kestro {
namespace {

constexpr Field kHeader[] = {
    {"Version", u8(13), decimal()},
    {"Serving EARFCN", u16(15), decimal()},
    {"Serving Cell ID", u16(17), decimal()},
};
static_assert(isLayout(kHeader));

constexpr NamedValue kCandidateTechnologies[] = {
    {0, "LTE"}, {1, "UTRAN"}, {2, "GERAN"}, {3, "CDMA1XRTT"}, {4, "CDMAHRPD"},
};

constexpr Place kTechnology = u16(2);
constexpr Condition kIsLTE = equals(kTechnology, 0);
constexpr Condition kIsUTRAN = equals(kTechnology, 1);
constexpr Condition kIsGeran = equals(kTechnology, 2);
constexpr Condition kIsCDMA = between(kTechnology, 3, 4);

constexpr Field kCandidate[] = {
    {"Candidate Priority", u16(0), decimal()},
    {"Candidate RAT Type", kTechnology, named(kCandidateTechnologies, "??")},
    {"E ARFCN", u16(4), decimal(), when(kIsLTE)},
    {"Cell ID", u16(6).bits(7, 15), decimal(), when(kIsLTE)},
    {"U ARFCN", u16(4), decimal(), when(kIsUTRAN)},
    {"PSC", u16(6), decimal(), when(kIsUTRAN)},
    {"ARFCN", u16(4), decimal(), when(kIsGeran)},
    {"Band", u8(6), decimal(), when(kIsGeran)},
    {"BSIC ID", u8(7), decimal(), when(kIsGeran)},
    {"Band", u8(4), decimal(), when(kIsCDMA)},
    {"Channel", u16(8), decimal(), when(kIsCDMA)},
    {"Pilot", u16(10), decimal(), when(kIsCDMA)},
};
static_assert(isLayout(kCandidate));

constexpr auto kCandidateIdentity =
    fieldsNamed(kCandidate, "Candidate RAT Type", "E ARFCN", "Cell ID", "U ARFCN", "PSC", "ARFCN",
                "BSIC ID", "Channel", "Pilot");

// The list is as long as the count's low byte says, while an index is checked against all of it.
// Candidates stand 4 bytes apart though their fields reach further.
constexpr ListReading kCandidates[] = {{.table = {
                                            .name = "candidate",
                                            .count = u8(19),
                                            .boundsCount = u16(19),
                                            .base = kLTEReselectionPacket.minimumLength,
                                            .stride = 4,
                                            .fields = kCandidate,
                                            .identity = kCandidateIdentity,
                                        }}};

constexpr PacketReading kHeaderReadings[] = {{.packet = kLTEReselectionPacket, .fields = kHeader}};
constexpr PacketReading kCandidatesReadings[] = {
    {.packet = kLTEReselectionPacket, .lists = kCandidates}};

}  // namespace

constexpr Section kReselectionCandidatesSection = {
    .name = "Reselection Candidates",
    .kind = SectionKind::Dictionary,
    .readings = kHeaderReadings,
};

constexpr Section kReselectionCandidatesListSection = {
    .name = "Reselection Candidates List",
    .kind = SectionKind::List,
    .readings = kCandidatesReadings,
};

}  // namespace kestro
