// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/EVDOStatus.h"

#include "LogGenerator/C2K/BandClass.h"

namespace kestro {
namespace {

constexpr NamedValue kDeviceStates[] = {
    {0, "Inactive [0]"}, {1, "Acquisition [1]"}, {2, "Sync [2]"},
    {3, "Idle [3]"},     {4, "Access [4]"},      {5, "Connected [5]"},
};
constexpr NamedValue kSessionStates[] = {
    {0, "Closed [0]"},        {1, "AMP setup [1]"}, {2, "AT-initiated neg [2]"},
    {3, "Initiated neg [3]"}, {4, "Open [4]"},
};

constexpr Place kDeviceState = u8(36);
/// In earlier states there is no transmitter and no second receiver.
constexpr Condition kHasAccess = between(kDeviceState, 4, 255);

constexpr Field kEVDOStatusFields[] = {
    {"kChannel", u16(13).bits(0, 10), decimal()},
    {"k1xEVDODeviceState", kDeviceState, namedElse(kDeviceStates, "[Reserved %d]")},
    {"kBandClass", u8(14).bits(3, 7), bandClass()},
    {"kRxAGC0", s8(15), decimal("%+d dBm")},
    {"kRxAGC1", s8(16), decimal("%+d dBm"), when(kHasAccess).elseText(kNotAvailable)},
    {"kTxAGC", s8(17), decimal("%+d dBm"), when(kHasAccess).elseText(kNotAvailable)},
    {"kServingPNOffset", u16(18), decimal("%d × 64chips").absentAt(0xFFFF, "Invalid Value")},
    {"kSessionState", u8(37), namedElse(kSessionStates, "[Reserved %d]")},
    {"kUATI24", u24(38), decimal("0x%06x")},
    {"kColorCode", u8(41), decimal()},
};
static_assert(isLayout(kEVDOStatusFields));

// A longer packet is none of these either.
constexpr Requirement kEVDOStatusRequirements[] = {
    {Requirement::Kind::ExactLength, "Log code 0x1183 is {0} bytes long but should be {1} bytes."}};

}  // namespace

constexpr PacketReading kEVDOStatusReading = {.packet = kEVDOStatusPacket,
                                              .fields = kEVDOStatusFields};

constexpr PacketRules kEVDOStatusRules = {kEVDOStatusReading, kEVDOStatusRequirements};

EVDOStatus::EVDOStatus() : FieldParser(kEVDOStatusRules) {}

}  // namespace kestro
