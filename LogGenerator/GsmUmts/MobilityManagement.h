// SPDX-License-Identifier: MIT
// The registration side of the protocol stack: the state machines of the circuit-switched and the
// packet-switched mobility management, the registered network, and its equivalents.
#pragma once

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

inline constexpr PacketKind kGMMStatePacket = {
    .code = 0x7130, .name = "GMM state", .minimumLength = 16};
inline constexpr PacketKind kMMStatePacket = {
    .code = 0x7131, .name = "MM state", .minimumLength = 16};
inline constexpr PacketKind kRegistrationStatePacket = {
    .code = 0x7132, .name = "Registration state", .minimumLength = 16};
inline constexpr PacketKind kServingPLMNPacket = {
    .code = 0x7135, .name = "Serving PLMN", .minimumLength = 32};
inline constexpr PacketKind kEquivalentPLMNListPacket = {
    .code = 0x7150, .name = "Equivalent PLMN list", .minimumLength = 17};

extern const Section kProcessCOSection;
extern const Section kProcessCSSection;
extern const Section kProcessPSSection;
extern const Section kServingPLMNSection;
extern const Section kEquivalentPLMNListSection;

// The states of both domains in common, of the circuit-switched and of the packet-switched domain.
// All three name them alike. What a packet does not carry stays.
using ProcessCO = TableDecoder<kProcessCOSection>;
using ProcessCS = TableDecoder<kProcessCSSection>;
using ProcessPS = TableDecoder<kProcessPSSection>;

/// The registered network and area. What a packet does not carry stays.
using ServingPLMN = CellMonitorTableDecoder<kServingPLMNSection>;

/// The networks that count as the registered one.
using EquivalentPLMNList = TableDecoder<kEquivalentPLMNListSection>;

}  // namespace kestro
