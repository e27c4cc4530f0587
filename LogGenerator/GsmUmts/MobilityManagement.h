// SPDX-License-Identifier: MIT
// The registration side of the protocol stack: the state machines of the circuit-switched and the
// packet-switched mobility management, the registered network, and its equivalents.
#pragma once

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

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
