// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/OneXSystemParameters.h"

namespace kestro {
namespace {

constexpr NamedValue kRoamingIndicators[] = {
    {0, "OFF [0]"},
    {1, "ON [1]"},
    {2, "Flashing [2]"},
    {3, "Out of Neighborhood [3]"},
    {4, "Out of Building [4]"},
    {5, "Preferred system [5]"},
    {6, "Available system [6]"},
    {7, "Alliance partner [7]"},
    {8, "Premium partner [8]"},
    {9, "Full service functionality [9]"},
    {10, "Partial service functionality [10]"},
    {11, "Banner ON [11]"},
    {12, "Banner OFF [12]"},
};

constexpr Place kVersion = u8(13);

constexpr Place kSystemType = u32(46).shared();
constexpr std::int64_t kCDMA2000System = 2;

constexpr NumberFormat kIdentityFormat = "%d";
constexpr NumberFormat kNoIdentityFormat = "(unknown system type %d)";

/// An identity of the system, if the system is of the type that has it: `raw` is type and identity.
ComputedValue writeIdentity(std::span<const std::int64_t> raw) {
  if (raw[0] == kCDMA2000System) {
    return {.number = static_cast<double>(raw[1]), .format = &kIdentityFormat};
  }
  return {.number = static_cast<double>(raw[0]), .format = &kNoIdentityFormat, .isAbsent = true};
}

// The base station's identity lies past the minimum length.
constexpr Field kSystemParametersFields[] = {
    {"Version", kVersion, hidden()},
    {"k1xRoamingHome", s32(42), namedElse(kRoamingIndicators, "ERI - %d")},
    {"kSystemId", {kSystemType, u16(50)}, computed(writeIdentity, "writeIdentity")},
    {"kNetworkId", {kSystemType, u16(52)}, computed(writeIdentity, "writeIdentity")},
    {"kPacketZoneId", u8(131), decimal()},
    {"kBaseId", u16(184), decimal()},
    {"kProtocolRevision", u8(133), decimal()},
};
static_assert(isLayout(kSystemParametersFields));

constexpr Requirement kSystemParametersRequirements[] = {
    kMinimumLength,
    {.kind = Requirement::Kind::Number,
     .line = "Log code 0x134f has version={}; only version 2 or higher expected; dropping.",
     .condition = between(kVersion, 2, 255)}};

}  // namespace

constexpr PacketReading kOneXSystemParametersReading = {.packet = kOneXSystemParametersPacket,
                                                        .fields = kSystemParametersFields};

constexpr PacketRules kOneXSystemParametersRules = {kOneXSystemParametersReading,
                                                    kSystemParametersRequirements};

OneXSystemParameters::OneXSystemParameters() : FieldParser(kOneXSystemParametersRules) {}

}  // namespace kestro
