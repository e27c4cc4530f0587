// SPDX-License-Identifier: MIT
#include "Sources/UTRAN/UTRANPackets.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "LogGenerator/UTRAN/Measurements.h"
#include "LogGenerator/UTRAN/RRCState.h"
#include "LogGenerator/UTRAN/ServingCellInfo.h"
#include "Sources/ReadingWriter.h"

namespace kestro {
namespace {

constexpr std::int64_t kGSM900 = 0;  // the band indicator of 900 and 1800 MHz
constexpr double kHighestStep = 63;

/// Whole dB above the weakest level that a phone reports. The display shows 256ths of it.
std::int64_t rscpStep(double rscp) {
  constexpr double kWeakest = -116;
  return std::llround(std::clamp(rscp - kWeakest, 0.0, 255.0));
}

unsigned stepFrom(double first, double size, double value) {
  return static_cast<unsigned>(
      std::clamp(std::floor((value - first) / size) + 1, 0.0, kHighestStep));
}

void writeTransportChannel(PacketWriter::Fields record, const UTRANTransportChannel& channel) {
  record.raw("TRCH ID", channel.id)
      .raw("TRCH BLER Measurement", utranBlockErrorStep(channel.blockErrorRate));
}

void writeCodedChannel(PacketWriter::Fields record, const UTRANCodedChannel& channel) {
  std::array<std::int64_t, 6> steps{};
  std::ranges::transform(channel.sir, steps.begin(), utranSirStep);
  record.raw("CCTRCH ID", channel.id).raw("TSNUM", channel.timeslot).raw("SIR", steps);
}

}  // namespace

unsigned utranBlockErrorStep(double rate) noexcept {
  if (rate <= 0) return 0;
  return std::max(stepFrom(-4.095, 0.065, std::log10(rate)), 1U);
}

unsigned utranSirStep(double sir) noexcept { return stepFrom(-11, 0.5, sir); }

std::optional<Bytes> utranRrcState(UTRANMode mode, Moment time) {
  ReadingWriter packet(kRRCStateSection, kUTRANRRCStatePacket);
  packet.fields().raw("Mode Valid", 1).raw("State", static_cast<std::int64_t>(mode));
  return packet.finish(time);
}

std::optional<Bytes> utranSystemInformation(const UTRANCell& cell, Moment time) {
  ReadingWriter packet(kUTRANServingCellInfoSection, kUTRANSystemInformationPacket);
  packet.fields()
      .raw("Cell Access Restrictions", 0)
      .raw("Cell ID", cell.cellIdentity)
      .raw("Downlink UARFCN", cell.uarfcn)
      .raw("Uplink UARFCN", cell.uarfcn)
      .raw("URA ID", cell.registrationArea)
      .raw("Allowed Access", 0);
  return packet.finish(time);
}

std::optional<Bytes> utranNeighbours(std::span<const UTRANCellReport> cells, Moment time) {
  ReadingWriter packet(kUTRANNeighborsSection, kUTRANNeighborsPacket);
  const RecordTable& table = packet.table(cells.size());
  for (std::size_t i = 0; i < cells.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("UARFCN", cells[i].uarfcn)
        .raw("Cell ID", cells[i].parameterId)
        .raw("Filter RSCP", rscpStep(cells[i].rscp))
        .raw("Status", static_cast<std::int64_t>(cells[i].set))
        .raw("inJDCS", cells[i].isJointlyDetected ? 1 : 0);
  }
  return packet.finish(time);
}

std::optional<Bytes> utranGSMNeighbours(std::span<const UTRANGSMCellReport> cells, Moment time) {
  ReadingWriter packet(kUTRANGSMNeighborsSection, kUTRANGSMNeighborsPacket);
  const RecordTable& table = packet.table(cells.size());
  for (std::size_t i = 0; i < cells.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("Cell ID", cells[i].cellId)
        .raw("Band Indicator", kGSM900)
        .raw("BSIC Valid", 1)
        .raw("NCC", cells[i].bsic / 8)
        .raw("BCC", cells[i].bsic % 8)
        .raw("ARFCN", cells[i].arfcn)
        .number("RSSI", cells[i].level);
  }
  return packet.finish(time);
}

std::optional<Bytes> utranChannels(std::span<const UTRANTransportChannel> transport,
                                   std::span<const UTRANCodedChannel> coded, Moment time) {
  ReadingWriter packet(kTRCHBLERSection, kUTRANTransportChannelsPacket);
  const RecordTable& transportTable = packet.table(transport.size());
  const RecordTable& codedTable = packet.tableOf(kCCTRCHSIRSection, coded.size());
  for (std::size_t i = 0; i < transport.size(); ++i) {
    writeTransportChannel(packet.writer().record(transportTable, i), transport[i]);
  }
  for (std::size_t i = 0; i < coded.size(); ++i) {
    writeCodedChannel(packet.writer().record(codedTable, i), coded[i]);
  }
  return packet.finish(time);
}

}  // namespace kestro
