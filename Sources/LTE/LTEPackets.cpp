// SPDX-License-Identifier: MIT
#include "Sources/LTE/LTEPackets.h"

#include <algorithm>
#include <cmath>

#include "LogGenerator/LTE/Measurements.h"
#include "LogGenerator/LTE/Reselection.h"
#include "LogGenerator/LTE/ServingCellInfo.h"
#include "Sources/ReadingWriter.h"

namespace kestro {
namespace {

constexpr unsigned kPacketVersion = 1;

/// Which neighbours are looked for: those on the frequency (1), those on others (2), or both.
std::int64_t measurementRules(const LTEServing& serving) {
  const LTEReselectionParameters& reselection = serving.reselection;
  const int level = reselection.selectionLevel(serving.now.rsrp);
  return (level < reselection.intraSearch ? 1 : 0) + (level < reselection.nonIntraSearch ? 2 : 0);
}

void writeNeighbour(PacketWriter::Fields record, const LTENeighbour& neighbour,
                    const LTEReselectionParameters& reselection) {
  record.raw("Physical Cell ID", neighbour.physicalCellId)
      .number("Measured RSSI", neighbour.now.rssi)
      .number("Measured RSRP", neighbour.now.rsrp)
      .number("Average RSRP", neighbour.average.rsrp)
      .number("Measured RSRQ", neighbour.now.rsrq)
      .number("Average RSRQ", neighbour.average.rsrq)
      .number("Srxlev", reselection.selectionLevel(neighbour.now.rsrp))
      .raw("Frequency Offset", neighbour.frequencyOffset)
      .raw("Ant 0 Frame Offset", neighbour.frameOffset)
      .raw("Ant 0 Sample Offset", neighbour.sampleOffset);
}

}  // namespace

int LTEReselectionParameters::selectionLevel(double rsrp) const noexcept {
  return static_cast<int>(std::floor(rsrp)) - minimumRsrp;
}

std::optional<Bytes> lteSystemInformation(const LTECell& cell, Moment time) {
  ReadingWriter packet(kLTEServingCellInfoSection, kLTESystemInformationPacket);
  packet.fields()
      .raw("Physical Cell ID", cell.physicalCellId)
      .raw("Download Frequency", cell.earfcn)
      .raw("Upload Frequency", cell.uplinkEarfcn)
      .raw("Download Bandwidth", cell.resourceBlocks)
      .raw("Upload Bandwidth", cell.resourceBlocks)
      .raw("Cell Identity", cell.cellIdentity)
      .raw("Tracking Area Code", cell.trackingAreaCode)
      .raw("Freq Band Indicator", cell.band);
  return packet.finish(time);
}

std::optional<Bytes> lteAntennas(const LTECell& cell, Moment time) {
  ReadingWriter packet(kLTEServingCellInfoSection, kLTEAntennasPacket);
  packet.fields().raw("Num Tx Antennas", cell.antennas);
  return packet.finish(time);
}

std::optional<Bytes> lteServingCell(const LTEServing& serving, Moment time) {
  const LTEReselectionParameters& reselection = serving.reselection;
  ReadingWriter packet(kServingCellMeasurementSection, kLTEServingCellPacket);
  packet.fields()
      .raw("Version", kPacketVersion)
      .raw("E-ARFCN", serving.cell.earfcn)
      .raw("Physical Cell ID", serving.cell.physicalCellId)
      .raw("Serving Layer Priority", reselection.priority)
      .number("Measured RSRP", serving.now.rsrp)
      .number("Average RSRP", serving.average.rsrp)
      .number("Measured RSRQ", serving.now.rsrq)
      .number("Average RSRQ", serving.average.rsrq)
      .number("Measured RSSI", serving.now.rssi)
      .number("Qrxlevmin", reselection.minimumRsrp)
      .number("P_Max", reselection.maximumPower)
      .number("Max UE Tx Power", reselection.maximumPower)
      .number("Srxlev", reselection.selectionLevel(serving.now.rsrp))
      .raw("Num of Consecutive DRX Cycles of S < 0", serving.consecutiveLowCycles)
      .number("S Intra Search", reselection.intraSearch)
      .number("S Non Intra Search", reselection.nonIntraSearch)
      .raw("Measurement Rules Updated", serving.rulesUpdated ? 1 : 0)
      .raw("Measurement Rules", measurementRules(serving));
  return packet.finish(time);
}

std::optional<Bytes> lteIntraFrequency(const LTEServing& serving,
                                       std::span<const LTENeighbour> measured,
                                       std::span<const unsigned> detectedCellIds, unsigned subframe,
                                       Moment time) {
  ReadingWriter packet(kConnectedModeMeasurementSection, kLTEIntraFrequencyPacket);
  packet.fields()
      .raw("E-ARFCN", serving.cell.earfcn)
      .raw("Serving Physical Cell ID", serving.cell.physicalCellId)
      .raw("Subframe Number", subframe)
      .number("Serving Filtered RSRP", serving.average.rsrp)
      .number("Serving Filtered RSRQ", serving.average.rsrq);
  const RecordTable& neighbours = packet.tableOf(kMeasuredNeighborCellsSection, measured.size());
  const RecordTable& detected = packet.tableOf(kDetectedCellsSection, detectedCellIds.size());
  for (std::size_t i = 0; i < measured.size(); ++i) {
    packet.writer()
        .record(neighbours, i)
        .raw("Physical Cell ID", measured[i].physicalCellId)
        .number("Filtered RSRP", measured[i].average.rsrp)
        .number("Filtered RSRQ", measured[i].average.rsrq);
  }
  for (std::size_t i = 0; i < detectedCellIds.size(); ++i) {
    packet.writer().record(detected, i).raw("Physical Cell ID", detectedCellIds[i]);
  }
  return packet.finish(time);
}

std::optional<Bytes> lteNeighbours(const LTEServing& serving,
                                   std::span<const LTENeighbour> neighbours, Moment time) {
  ReadingWriter packet(kNeighborMeasurementSection, kLTENeighborPacket);
  packet.fields()
      .raw("Version", kPacketVersion)
      .raw("E-ARFCN", serving.cell.earfcn)
      .number("Qrxlevmin", serving.reselection.minimumRsrp);
  const RecordTable& table = packet.tableOf(kNeighborCellsListSection, neighbours.size());
  for (std::size_t i = 0; i < neighbours.size(); ++i) {
    writeNeighbour(packet.writer().record(table, i), neighbours[i], serving.reselection);
  }
  return packet.finish(time);
}

std::optional<Bytes> lteReselection(const LTEServing& serving, const LTECandidate& candidate,
                                    Moment time) {
  ReadingWriter packet(kReselectionCandidatesSection, kLTEReselectionPacket);
  packet.fields()
      .raw("Version", kPacketVersion)
      .raw("Serving EARFCN", serving.cell.earfcn)
      .raw("Serving Cell ID", serving.cell.physicalCellId);
  const RecordTable& table = packet.tableOf(kReselectionCandidatesListSection, 1);
  auto record = packet.writer().record(table, 0);
  record.raw("Candidate Priority", candidate.priority)
      .text("Candidate RAT Type", candidate.technology);
  for (const auto& [key, raw] : candidate.fields) record.raw(key, raw);
  return packet.finish(time);
}

}  // namespace kestro
