// SPDX-License-Identifier: MIT
#include "Sources/GsmUmts/GsmUmtsPackets.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "LogGenerator/GsmUmts/CellSets.h"
#include "LogGenerator/GsmUmts/Cells.h"
#include "LogGenerator/GsmUmts/LinkQuality.h"
#include "LogGenerator/GsmUmts/MobilityManagement.h"
#include "LogGenerator/GsmUmts/RadioResource.h"
#include "Sources/ReadingWriter.h"

namespace kestro {
namespace {

constexpr std::size_t kUndescribedPayload = 32;
constexpr unsigned kBlerWindow = 200;

/// A linear Ec/N0 that is looked up as this many dB, or as near as the table comes.
std::int64_t linearEnergy(double energyPerChip) {
  const auto wanted = std::lround(std::clamp(energyPerChip, -31.0, 0.0));
  constexpr std::uint32_t kSmallest = 706;
  constexpr std::uint32_t kLargest = 524'288;
  std::uint32_t linear = kSmallest;
  while (linear < kLargest && Base::lookUpECNO(linear) < wanted) linear += linear / 64 + 1;
  return std::min(linear, kLargest);
}

std::array<std::int64_t, 3> digitsOf(unsigned code) {
  return {code / 100 % 10, code / 10 % 10, code % 10};
}

std::int64_t whole(double number) { return std::llround(number); }

std::optional<Bytes> namedStates(
    const Section& section, const PacketKind& kind,
    std::initializer_list<std::pair<std::string_view, std::string_view>> texts, Moment time) {
  ReadingWriter packet(section, kind);
  auto fields = packet.fields();
  for (const auto& [key, text] : texts) fields.text(key, text);
  return packet.finish(time);
}

}  // namespace

unsigned gsmLevelByte(double level) noexcept {
  return static_cast<unsigned>(std::lround(std::clamp(level + 110, 0.0, 63.0)));
}

// --- UMTS ----------------------------------------------------------------------------------------

std::optional<Bytes> umtsSets(std::span<const UMTSCellReport> active, double total, Moment time) {
  ReadingWriter packet(kActiveSetSection, kUMTSSetInformationPacket);
  // The display makes whole dBm of it: (level + 512) / 10 - 106, tenths of a dB.
  packet.fields().raw("Receive Level", 10 * (whole(total) + 106) - 512);
  const RecordTable& cells = packet.table(active.size());
  for (std::size_t i = 0; i < active.size(); ++i) {
    const std::int64_t energy = linearEnergy(active[i].energyPerChip);
    packet.writer()
        .record(cells, i)
        .raw("Scrambling Code", active[i].scramblingCode)
        .raw("Energy Per Chip", {energy, energy, energy});
  }
  return packet.finish(time);
}

std::optional<Bytes> umtsRanking(std::span<const UMTSCellReport> cells, Moment time) {
  ReadingWriter packet(kUMTSSetSection, kIdleModeRankingPacket);
  const RecordTable& table = packet.table(cells.size());
  for (std::size_t i = 0; i < cells.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("Downlink Frequency", cells[i].uarfcn)
        .raw("Scrambling Code", cells[i].scramblingCode)
        .number("RSCP", cells[i].rscp)
        .number("Rank Cell RSCP", cells[i].rscp)
        .number("Energy Per Chip", cells[i].energyPerChip)
        .raw("Ranking Value", whole(cells[i].rscp) + 115);
  }
  return packet.finish(time);
}

std::optional<Bytes> gsmRanking(std::span<const GSMCellReport> cells, Moment time) {
  ReadingWriter packet(kGSMSetSection, kIdleModeRankingPacket);
  const RecordTable& table = packet.table(cells.size());
  for (std::size_t i = 0; i < cells.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("ARFCN", cells[i].arfcn)
        .raw("BSIC", cells[i].bsic)
        .number("RSSI", cells[i].level)
        .raw("Ranking Value", cells[i].c1);
  }
  return packet.finish(time);
}

std::optional<Bytes> umtsBlockErrors(std::span<const TransportChannelReport> channels,
                                     Moment time) {
  ReadingWriter packet(kBLERSection, kUMTSBlockErrorsPacket);
  packet.fields().raw("Window Size", kBlerWindow);
  const RecordTable& table = packet.table(channels.size());
  for (std::size_t i = 0; i < channels.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("Transport Channel ID", channels[i].id)
        .raw("CRC Received", channels[i].blocks)
        .raw("CRC Received in Error", channels[i].errors);
  }
  return packet.finish(time);
}

std::optional<Bytes> hsdpaStatistics(std::span<const HarqProcessReport> processes,
                                     unsigned subframes, Moment time) {
  ReadingWriter packet(kHSDPAInformationSection, kHSDPAStatisticsPacket);
  packet.fields()
      .raw("Version", 1)
      .raw("Sub Frames", subframes)
      .text("Carrier Info", "Single Carrier");
  const RecordTable& table = packet.table(processes.size());
  for (std::size_t i = 0; i < processes.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("Process ID", processes[i].id)
        .raw("No Rx Bits", processes[i].bits)
        .raw("New Tx", processes[i].transmissions)
        .raw("Block Errors", processes[i].blockErrors);
  }
  return packet.finish(time);
}

// --- GSM -----------------------------------------------------------------------------------------

std::optional<Bytes> gsmServingCell(const GSMCellReport& cell, unsigned cellId, Moment time) {
  ReadingWriter packet(kGSMServingCellSection, kGSMServingCellPacket);
  packet.fields().raw("Cell ID", cellId).raw("ARFCN", cell.arfcn).raw("BSIC", cell.bsic);
  return packet.finish(time);
}

std::optional<Bytes> gsmMeasurements(const GSMCellReport& serving,
                                     std::span<const GSMCellReport> neighbours, Moment time) {
  ReadingWriter packet(kNeighboringCellsSection, kGSMMeasurementsPacket);
  packet.fieldsOf(kGSMServingCellSection)
      .raw("RSSI", gsmLevelByte(serving.level))
      .raw("C1 Value", std::max(serving.c1, 0))
      .raw("C2 Value", std::max(serving.c1, 0));
  const RecordTable& table = packet.table(neighbours.size());
  for (std::size_t i = 0; i < neighbours.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("ARFCN", neighbours[i].arfcn)
        .raw("RSSI", gsmLevelByte(neighbours[i].level))
        .raw("C1 Value", std::max(neighbours[i].c1, 0));
  }
  return packet.finish(time);
}

std::optional<Bytes> gsmColourCodes(std::span<const GSMCellReport> neighbours, Moment time) {
  ReadingWriter packet(kNeighboringCellsSection, kGSMNeighbourBSICsPacket);
  const RecordTable& table = packet.table(neighbours.size());
  for (std::size_t i = 0; i < neighbours.size(); ++i) {
    packet.writer()
        .record(table, i)
        .raw("ARFCN", neighbours[i].arfcn)
        .raw("BSIC", neighbours[i].bsic);
  }
  return packet.finish(time);
}

std::optional<Bytes> gsmDedicatedChannel(unsigned arfcn, Moment time) {
  ReadingWriter packet(kGSMServingCellSection, kGSMDedicatedChannelPacket);
  packet.fields().raw("MA Dedicated ARFCN", arfcn);
  return packet.finish(time);
}

std::optional<Bytes> gsmMobileAllocation(unsigned hoppingSequence, std::span<const unsigned> arfcns,
                                         Moment time) {
  ReadingWriter packet(kMobileAllocationSection, kGSMMobileAllocationPacket);
  packet.fields().raw("HSN", hoppingSequence);
  const RecordTable& table = packet.table(arfcns.size());
  for (std::size_t i = 0; i < arfcns.size(); ++i) {
    packet.writer().record(table, i).raw("ARFCN", arfcns[i]);
  }
  return packet.finish(time);
}

std::optional<Bytes> gsmRadioResource(std::string_view state, unsigned mode, Moment time) {
  ReadingWriter packet(kGSMRRInfoSection, kGSMRRStatePacket);
  packet.fields().text("RR State", state).raw("RR Mode", mode);
  return packet.finish(time);
}

std::optional<Bytes> gsmDiscontinuousReception(unsigned seconds, Moment time) {
  ReadingWriter packet(kGSMRRInfoSection, kGSMDiscontinuousReceptionPacket);
  packet.fields().raw("DRX Used", seconds);
  return packet.finish(time);
}

std::optional<Bytes> gsmDiscontinuousTransmission(bool isUsed, Moment time) {
  ReadingWriter packet(kGSMRRInfoSection, kGSMDiscontinuousTransmissionPacket);
  packet.fields().raw("DTX Used", isUsed ? 1 : 0);
  return packet.finish(time);
}

// --- Mobility management -------------------------------------------------------------------------

std::optional<Bytes> mmState(std::string_view state, std::string_view subState,
                             std::string_view updateStatus, Moment time) {
  return namedStates(
      kProcessCSSection, kMMStatePacket,
      {{"MM State", state}, {"MM Sub State", subState}, {"LU Reject Cause", updateStatus}}, time);
}

std::optional<Bytes> gmmState(std::string_view state, std::string_view subState,
                              std::string_view updateStatus, Moment time) {
  return namedStates(
      kProcessPSSection, kGMMStatePacket,
      {{"MM State", state}, {"MM Sub State", subState}, {"Attach Reject Cause", updateStatus}},
      time);
}

std::optional<Bytes> registrationState(std::string_view state, std::string_view selectionMode,
                                       Moment time) {
  ReadingWriter packet(kProcessCSSection, kRegistrationStatePacket);
  packet.fields().text("MM Service State", state);
  packet.fieldsOf(kServingPLMNSection).text("PLMN Sel Mod", selectionMode);
  return packet.finish(time);
}

std::optional<Bytes> servingNetwork(const NetworkArea& area, std::string_view serviceType,
                                    Moment time) {
  ReadingWriter packet(kServingPLMNSection, kServingPLMNPacket);
  packet.fields()
      .raw("Mobile Country Code", digitsOf(area.countryCode))
      .raw("Mobile Network Code", digitsOf(area.networkCode))
      .raw("Location Area Code", area.locationArea)
      .raw("Routing Area Code", area.routingArea)
      .text("Service Type", serviceType);
  return packet.finish(time);
}

std::optional<Bytes> equivalentNetwork(const NetworkArea& network, Moment time) {
  ReadingWriter packet(kEquivalentPLMNListSection, kEquivalentPLMNListPacket);
  const RecordTable& table = packet.table(1);
  packet.writer()
      .record(table, 0)
      .raw("Mobile Country Code", digitsOf(network.countryCode))
      .raw("Mobile Network Code", digitsOf(network.networkCode));
  return packet.finish(time);
}

std::optional<Bytes> undescribedPacket(const PacketKind& packet, Moment time) {
  return PacketWriter(packet.code, kPacketHeaderSize + kUndescribedPayload).finish(time);
}

}  // namespace kestro
