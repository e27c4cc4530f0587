// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/EVDOPilots.h"

#include <cmath>

namespace kestro {
namespace {

void writeEnergy(std::span<const std::int64_t> raw, TextBuffer& text) {
  text.append("%+.2f dB", 10 * std::log10(static_cast<double>(raw[0]) / 512));
}

// --- 0x12B6: active set, records of 12 bytes from byte 25 ----------------------------------------

constexpr Field kActivePilot[] = {
    {kPilotPNOffset, u16(0), decimal()},
    {kPilotEnergy, u16(2), computed(writeEnergy)},
};
static_assert(isLayout(kActivePilot));

constexpr ListReading kActivePilots[] = {
    {.table = {.name = "pilot", .count = u8(15), .base = 25, .stride = 12, .fields = kActivePilot},
     .key = "kActiveSetPilots"}};

// --- 0x108A: fingers, records of 14 bytes from byte 23 -------------------------------------------

constexpr Place kFingerPN = u16(0);
constexpr std::int64_t kUnusedFinger = 0xFFFF;

constexpr Field kFinger[] = {
    {kPilotPNOffset, kFingerPN, decimal()},
    {kPilotEnergy, u16(6), computed(writeEnergy)},
};
static_assert(isLayout(kFinger));

constexpr ListReading kFingers[] = {{.table = {.name = "finger",
                                               .count = u8(22),
                                               .base = 23,
                                               .stride = 14,
                                               .fields = kFinger,
                                               .keep = between(kFingerPN, 0, kUnusedFinger - 1)},
                                     .key = "kFingerC2I"}};

}  // namespace

constexpr PacketReading kEVDOActiveSetReading = {.packet = kEVDOActiveSetPacket,
                                                 .lists = kActivePilots};
constexpr PacketReading kEVDOFingersReading = {.packet = kEVDOFingersPacket, .lists = kFingers};

// --- EVDOPilots ----------------------------------------------------------------------------------

EVDOPilots::EVDOPilots(const PacketReading& pilotsReading)
    : C2KParser(pilotsReading), _energy(table().fields[1]), _name(pilotsReading.lists[0].key) {}

std::size_t EVDOPilots::recordsIn(PacketView packet) const { return recordCount(table(), packet); }

std::size_t EVDOPilots::lengthWithRecords(PacketView packet) const {
  return table().base + table().stride * recordsIn(packet);
}

void EVDOPilots::parse(PacketView packet, C2KOutput& output) {
  if (!isLongEnough(packet, output.log)) return;
  if (!hasRightLength(packet)) {
    reportLength(packet, output.log);
    return;
  }
  forEachRecord(table(), packet, [&](std::size_t index, const RecordPosition& position) {
    _pilots.add(index, readBits(table().fields[0].places[0], packet, position),
                _energy.value(packet, position));
  });
  if (_pilots.empty()) {
    output.lookup.store(_name, kNoPilots);
  } else {
    _pilots.store(_name, output.lookup);
  }
}

void EVDOPilots::explain(PacketView packet, const ExplainVisitor& visit) const {
  if (!isLongEnough(packet) || !hasRightLength(packet)) return;
  Explainer(reading().packet.name, packet, visit).reading(reading());
}

// --- The two lists -------------------------------------------------------------------------------

bool EVDOActiveSet::hasRightLength(PacketView packet) const {
  return packet.size() >= lengthWithRecords(packet);
}

void EVDOActiveSet::reportLength(PacketView packet, SystemLog& log) const {
  log.log(LogPriority::Error, "Log code 0x12b6 is {} bytes long, but has {} substructs.",
          packet.size(), recordsIn(packet));
}

bool EVDOFingers::hasRightLength(PacketView packet) const {
  return packet.size() == lengthWithRecords(packet);
}

void EVDOFingers::reportLength(PacketView packet, SystemLog& log) const {
  // The size shown is the header's alone, whatever the count.
  log.log(LogPriority::Error,
          "Log code 0x108a has bad length of {} bytes, but has {} substructs (size={}).",
          packet.size(), recordsIn(packet), reading().packet.minimumLength);
}

}  // namespace kestro
