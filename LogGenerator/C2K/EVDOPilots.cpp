// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/EVDOPilots.h"

#include <cmath>

namespace kestro {
namespace {

constexpr NumberFormat kEnergyFormat = "%+.2f dB";

ComputedValue writeEnergy(std::span<const std::int64_t> raw) {
  return {.number = 10 * std::log10(static_cast<double>(raw[0]) / 512), .format = &kEnergyFormat};
}

// --- 0x12B6: active set, records of 12 bytes from byte 25 ----------------------------------------

constexpr Field kActivePilot[] = {
    {kPilotPNOffset, u16(0), decimal()},
    {kPilotEnergy, u16(2), computed(writeEnergy, "writeEnergy")},
};
static_assert(isLayout(kActivePilot));
constexpr auto kActivePilotIdentity = fieldsNamed(kActivePilot, kPilotPNOffset);

constexpr ListReading kActivePilots[] = {{.table = {.name = "pilot",
                                                    .count = u8(15),
                                                    .base = 25,
                                                    .stride = 12,
                                                    .fields = kActivePilot,
                                                    .identity = kActivePilotIdentity},
                                          .key = "kActiveSetPilots"}};

constexpr Requirement kActiveSetRequirements[] = {
    kMinimumLength,
    {Requirement::Kind::HoldsRecords,
     "Log code 0x12b6 is {0} bytes long, but has {3} substructs."}};

// --- 0x108A: fingers, records of 14 bytes from byte 23 -------------------------------------------

constexpr Place kFingerPN = u16(0);
constexpr std::int64_t kUnusedFinger = 0xFFFF;

constexpr Field kFinger[] = {
    {kPilotPNOffset, kFingerPN, decimal()},
    {kPilotEnergy, u16(6), computed(writeEnergy, "writeEnergy")},
};
static_assert(isLayout(kFinger));
constexpr auto kFingerIdentity = fieldsNamed(kFinger, kPilotPNOffset);

constexpr ListReading kFingers[] = {{.table = {.name = "finger",
                                               .count = u8(22),
                                               .base = 23,
                                               .stride = 14,
                                               .fields = kFinger,
                                               .keep = between(kFingerPN, 0, kUnusedFinger - 1),
                                               .identity = kFingerIdentity},
                                     .key = "kFingerC2I"}};

// The size shown is the header's alone, whatever the count.
constexpr Requirement kFingersRequirements[] = {
    kMinimumLength,
    {Requirement::Kind::EndsWithRecords,
     "Log code 0x108a has bad length of {0} bytes, but has {3} substructs (size={1})."}};

}  // namespace

constexpr PacketReading kEVDOActiveSetReading = {.packet = kEVDOActiveSetPacket,
                                                 .lists = kActivePilots};
constexpr PacketReading kEVDOFingersReading = {.packet = kEVDOFingersPacket, .lists = kFingers};
constexpr PacketRules kEVDOActiveSetRules = {kEVDOActiveSetReading, kActiveSetRequirements};
constexpr PacketRules kEVDOFingersRules = {kEVDOFingersReading, kFingersRequirements};

EVDOPilots::EVDOPilots(const PacketRules& pilotsRules)
    : C2KParser(pilotsRules), _energy(table().fields[1]), _name(pilotsRules.reading.lists[0].key) {}

void EVDOPilots::take(const TakenPacket& packet, C2KOutput& output) {
  forEachRecord(table(), packet.bytes, [&](std::size_t index, const RecordPosition& position) {
    _pilots.add(index, readBits(table().fields[0].places[0], packet.bytes, position),
                _energy.value(packet.bytes, position));
  });
  if (_pilots.empty()) {
    output.lookup.store(_name, kNoPilots);
  } else {
    _pilots.store(_name, output.lookup);
  }
}

EVDOActiveSet::EVDOActiveSet() : EVDOPilots(kEVDOActiveSetRules) {}
EVDOFingers::EVDOFingers() : EVDOPilots(kEVDOFingersRules) {}

}  // namespace kestro
