// SPDX-License-Identifier: MIT
#include "Sources/C2K/C2KPackets.h"

#include <algorithm>
#include <cmath>

#include "LogGenerator/C2K/EVDOPilots.h"
#include "LogGenerator/C2K/EVDOStatus.h"
#include "LogGenerator/C2K/FrameErrorRate.h"
#include "LogGenerator/C2K/OneXActiveSet.h"
#include "LogGenerator/C2K/OneXStatus.h"
#include "LogGenerator/C2K/OneXSystemParameters.h"
#include "LogGenerator/C2K/PilotList.h"
#include "LogGenerator/C2K/SubPackets.h"
#include "Sources/ReadingWriter.h"

namespace kestro {
namespace {

// The sizes of the sub-packets that have always the same.
constexpr std::size_t kStateSize = 8;
constexpr std::size_t kRadioSize = 14;
constexpr std::size_t kFingersSize = 8;
constexpr std::size_t kTrafficDemodulationSize = 28;

/// The radio sub-packet's step of received power is a third of a decibel.
constexpr double kWeakestReceived = -105.9;
constexpr double kStrongestReceived = -20.9;

/// A packet that is made of sub-packets.
class SubPacketWriter {
 public:
  explicit SubPacketWriter(const PacketKind& packet) : _writer(packet) {}

  [[nodiscard]] PacketWriter& writer() noexcept { return _writer; }
  /// Where the next sub-packet will lie.
  [[nodiscard]] RecordPosition position() const noexcept { return {.here = _next}; }

  /// Writes the next sub-packet's header. Its last byte must not have been written before.
  RecordPosition begin(std::uint8_t id, std::size_t size) {
    const RecordPosition here = position();
    _writer.put(kSubPacketCount, {}, ++_count);
    _writer.put(u8(static_cast<unsigned>(size - 1)), here, 0);
    _writer.put(kSubPacketId, here, id);
    _writer.put(kSubPacketSize, here, static_cast<std::int64_t>(size));
    _next += size;
    return here;
  }

 private:
  PacketWriter _writer;
  std::size_t _next = kFirstSubPacket;
  std::int64_t _count = 0;
};

// How the simulated phone accumulates the pilots' energies.
constexpr int kAccumulationLength = 512;
constexpr int kEnergyFactor = 1;
constexpr int kEnergyExponent = 4;
constexpr int kValuesPerPilot = 1;

/// What the phone accumulates of a pilot that is so strong, dB.
std::int64_t accumulatedEnergy(double energy) {
  constexpr double kWeakest = -20;
  constexpr double kStrongest = -1;
  constexpr double kLength = kAccumulationLength;
  const double linear = std::pow(10, std::clamp(energy, kWeakest, kStrongest) / 10);
  const double unit = std::ldexp(1, 2 * kEnergyExponent - 3) / (9 * kLength * kLength);
  return std::llround((linear + 1 / kLength) * kEnergyFactor / unit);
}

/// False when the pilots are more than the packet can count.
bool writeActiveSet(SubPacketWriter& packet, std::span<const C2KPilot> pilots, Moment time) {
  PacketWriter& writer = packet.writer();
  const RecordPosition position = packet.position();
  const auto count = static_cast<std::int64_t>(pilots.size());
  writer.fieldsAt(kOneXActiveSetFields, position)
      .raw("Accumulation Length", kAccumulationLength)
      .raw("Energy Factor", kEnergyFactor)
      .raw("Energy Exponent", kEnergyExponent)
      .raw("Pilots", count)
      .raw("Values per Pilot", kValuesPerPilot)
      .raw("Reference PN Offset", pilots.empty() ? 0 : pilots[0].pnOffset);
  // Who reads the sub-packet knows where its pilots lie.
  const auto draft = writer.finish(time);
  if (!draft) return false;
  const OneXActiveSet set(PacketView(*draft), position.here);
  const std::size_t end = set.pilotAt(pilots.size()).here + kOneXPilotPN.offset;
  packet.begin(kOneXActiveSetId, end - position.here);
  for (std::size_t i = 0; i < pilots.size(); ++i) {
    writer.put(kOneXPilotPN, set.pilotAt(i), pilots[i].pnOffset);
    writer.put(kOneXPilotEnergy, set.pilotEnergyAt(i), accumulatedEnergy(pilots[i].energy));
  }
  return true;
}

void writePilot(PacketWriter::Fields record, const C2KPilot& pilot) {
  constexpr double kOne = 512;  // of the linear energy
  constexpr std::int64_t kLargest = 0xFFFF;
  const std::int64_t linear = std::llround(kOne * std::pow(10, pilot.energy / 10));
  record.raw(kPilotPNOffset, pilot.pnOffset).raw(kPilotEnergy, std::clamp(linear, {1}, kLargest));
}

double reportedPower(double level) {
  return std::clamp(level, kWeakestReceived, kStrongestReceived);
}

}  // namespace

// --- 1x ------------------------------------------------------------------------------------------

std::optional<Bytes> oneXStatus(const OneXReport& report, Moment time) {
  SubPacketWriter packet(kOneXStatusPacket);
  const RecordPosition state = packet.begin(kOneXStateId, kStateSize);
  const RecordPosition radio = packet.begin(kOneXRadioId, kRadioSize);
  packet.writer()
      .fieldsAt(kOneXStatusFields, {.here = radio.here, .twin = state.here})
      .raw("k1xDeviceState", static_cast<std::int64_t>(report.state))
      .raw("k1xRx0BandClass", report.channel.bandClass)
      .raw("k1xRx0ChanNum", report.channel.number)
      .number("k1xRxAGC0", reportedPower(report.receivePower[0]))
      .raw("k1xRx1BandClass", report.channel.bandClass)
      .raw("k1xRx1ChanNum", report.channel.number)
      .number("k1xRxAGC1", reportedPower(report.receivePower[1]))
      .number("k1xTxAGC", report.transmitPower);
  if (!writeActiveSet(packet, report.activeSet, time)) return std::nullopt;
  packet.begin(kOneXFingersId, kFingersSize);
  return packet.writer().finish(time);
}

std::optional<Bytes> oneXTrafficFrame(bool isBad, Moment time) {
  SubPacketWriter packet(kOneXTrafficFramePacket);
  const RecordPosition frame = packet.begin(kTrafficDemodulationId, kTrafficDemodulationSize);
  packet.writer().put(kIsBadFrame, frame, isBad ? 1 : 0);
  return packet.writer().finish(time);
}

std::optional<Bytes> oneXSystemParameters(const OneXSystem& system, Moment time) {
  constexpr std::int64_t kVersion = 2;
  constexpr std::int64_t kSystemType = 2;  // the one that has these identities
  ReadingWriter packet(kOneXSystemParametersReading);
  packet.fields()
      .raw("Version", kVersion)
      .raw("k1xRoamingHome", system.isRoaming ? 1 : 0)
      .raw("kSystemId", {kSystemType, std::int64_t{system.systemId}})
      .raw("kNetworkId", {kSystemType, std::int64_t{system.networkId}})
      .raw("kPacketZoneId", system.packetZoneId)
      .raw("kBaseId", system.baseStationId)
      .raw("kProtocolRevision", system.protocolRevision);
  return packet.finish(time);
}

// --- EV-DO ---------------------------------------------------------------------------------------

std::optional<Bytes> evdoStatus(const EVDOReport& report, Moment time) {
  ReadingWriter packet(kEVDOStatusReading);
  PacketWriter::Fields fields = packet.fields();
  fields.raw("kChannel", report.channel.number)
      .raw("k1xEVDODeviceState", static_cast<std::int64_t>(report.deviceState))
      .raw("kBandClass", report.channel.bandClass)
      .number("kRxAGC0", report.receivePower[0])
      .number("kRxAGC1", report.receivePower[1])
      .number("kTxAGC", report.transmitPower)
      .raw("kSessionState", static_cast<std::int64_t>(report.sessionState))
      .raw("kUATI24", report.address)
      .raw("kColorCode", report.colorCode);
  if (report.servingPilot) {
    fields.raw("kServingPNOffset", *report.servingPilot);
  } else {
    fields.text("kServingPNOffset", "Invalid Value");
  }
  return packet.finish(time);
}

std::optional<Bytes> evdoActiveSet(std::span<const C2KPilot> pilots, Moment time) {
  ReadingWriter packet(kEVDOActiveSetReading);
  const RecordTable& table = packet.table(pilots.size());
  const std::size_t end = table.base + table.stride * pilots.size();
  packet.writer().put(u8(static_cast<unsigned>(end - 1)), {}, 0);
  for (std::size_t i = 0; i < pilots.size(); ++i) {
    writePilot(packet.writer().record(table, i), pilots[i]);
  }
  return packet.finish(time);
}

std::optional<Bytes> evdoFingers(std::span<const std::optional<C2KPilot>> fingers, Moment time) {
  constexpr std::int64_t kUnused = 0xFFFF;
  ReadingWriter packet(kEVDOFingersReading);
  const RecordTable& table = packet.table(fingers.size());
  const std::size_t end = table.base + table.stride * fingers.size();
  packet.writer().put(u8(static_cast<unsigned>(end - 1)), {}, 0);
  for (std::size_t i = 0; i < fingers.size(); ++i) {
    PacketWriter::Fields record = packet.writer().record(table, i);
    if (fingers[i]) {
      writePilot(record, *fingers[i]);
    } else {
      record.raw(kPilotPNOffset, kUnused);
    }
  }
  return packet.finish(time);
}

std::optional<Bytes> evdoThroughput(const ThroughputLayout& layout, std::uint32_t sequenceNumber,
                                    std::span<const std::uint32_t> counters, Moment time) {
  if (counters.size() != layout.counters.size()) return std::nullopt;
  ReadingWriter packet(layout.reading);
  packet.writer().put(layout.sequenceNumber, {}, sequenceNumber);
  for (std::size_t i = 0; i < counters.size(); ++i) {
    packet.writer().put(layout.counters[i].place(), {}, counters[i]);
  }
  return packet.finish(time);
}

}  // namespace kestro
