// SPDX-License-Identifier: MIT
// Decoding GSM/UMTS packets: each log code by itself, a mixed drive, and the decoders that show
// nothing. "of_floor" is the time over that of merely formatting the values that are shown.
#include <cstdlib>

#include "Benchmarks/DecodeSpeed.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMLogGenerator.h"
#include "LogGenerator/Packets/Encode.h"

namespace kestro::benchmarks {
namespace {

using Display = LiveDisplay<Ondrel_GSMLogGenerator>;
using Texts = std::vector<std::string>;

const RecordTable& tableOf(const Section& section, LogCode code, std::size_t list = 0) {
  return readingOf(section, code)->lists[list].table;
}

PacketWriter::Fields fieldsOf(PacketWriter& writer, const Section& section, LogCode code) {
  return writer.fields(readingOf(section, code)->fields);
}

/// Adds the texts `times` over.
void repeat(Texts& texts, int times, const Texts& row) {
  for (int i = 0; i < times; ++i) texts.insert(texts.end(), row.begin(), row.end());
}

BenchmarkPacket packetOf(std::string name, PacketWriter writer, Texts texts) {
  return {std::move(name), writer.finish(Moment{}).value_or(Bytes()), std::move(texts)};
}

BenchmarkPacket connectedModeSets() {
  constexpr LogCode kCode = 0x417A;
  constexpr int kCells = 6;
  constexpr int kMembers = 3;
  PacketWriter writer(kCode, 16);
  const RecordTable& cells = tableOf(kActiveSetSection, kCode);
  fieldsOf(writer, kActiveSetSection, kCode).raw("Receive Level", -112);
  writer.setCount(cells, kCells);
  for (int i = 0; i < kCells; ++i) {
    writer.record(cells, i)
        .raw("Scrambling Code", 401)
        .raw("Set Type", i < kMembers ? 0 : 2)
        .raw("Energy Per Chip", {0, 52831, 0});
  }
  Texts texts;
  repeat(texts, kMembers, {"401", "-76 dB", "-10 dB"});
  return packetOf("0x417A", std::move(writer), texts);
}

BenchmarkPacket idleModeRanking() {
  constexpr LogCode kCode = 0x4005;
  constexpr int kCells = 6;
  PacketWriter writer(kCode, 15);
  const RecordTable& cells = tableOf(kUMTSSetSection, kCode);
  writer.setCount(cells, kCells);
  for (int i = 0; i < kCells; ++i) {
    writer.record(cells, i)
        .raw("Downlink Frequency", 10712)
        .raw("Scrambling Code", 321)
        .raw("RSCP", -70)
        .raw("Rank Cell RSCP", -91)
        .raw("Energy Per Chip", -15)
        .raw("Ranking Value", -13);
  }
  Texts texts;
  repeat(texts, kCells, {"10712", "321", "-91 dB", "-91 dB", "-7.500000 dB", "-13"});
  return packetOf("0x4005", std::move(writer), texts);
}

constexpr int kNeighbours = 6;

BenchmarkPacket bsicList() {
  constexpr LogCode kCode = 0x51FF;
  PacketWriter writer(kCode, 15);
  const RecordTable& entries = tableOf(kNeighboringCellsSection, kCode);
  writer.setCount(entries, kNeighbours);
  for (int i = 0; i < kNeighbours; ++i) {
    writer.record(entries, i).raw("ARFCN", 77 + i).raw("BSIC", 44);
  }
  return packetOf("0x51FF", std::move(writer), {});
}

BenchmarkPacket gsmMeasurements() {
  constexpr LogCode kCode = 0x5137;
  PacketWriter writer(kCode, 29);
  const RecordTable& neighbours = tableOf(kNeighboringCellsSection, kCode);
  fieldsOf(writer, kGSMRRInfoSection, kCode)
      .raw("Serving Rx Level", 48)
      .raw("Rx Quality Full", 30)
      .raw("Rx Quality Sub", 28);
  writer.setCount(neighbours, kNeighbours);
  for (int i = 0; i < kNeighbours; ++i) {
    writer.record(neighbours, i).raw("ARFCN", 80).raw("RSSI", 31).raw("C1 Value", 14);
  }
  Texts texts = {"48 dBm", "30", "28"};
  repeat(texts, kNeighbours, {"80", "31", "14", "44"});
  repeat(texts, 1, {"48", "30", "28"});
  BenchmarkPacket packet = packetOf("0x5137", std::move(writer), texts);
  packet.earlier = bsicList().bytes;
  return packet;
}

BenchmarkPacket transportChannels() {
  constexpr LogCode kCode = 0x4116;
  constexpr int kChannels = 4;
  PacketWriter writer(kCode, 16);
  const RecordTable& channels = tableOf(kBLERSection, kCode);
  fieldsOf(writer, kBLERSection, kCode).raw("Window Size", 500);
  writer.setCount(channels, kChannels);
  for (int i = 0; i < kChannels; ++i) {
    writer.record(channels, i)
        .raw("Transport Channel ID", 24)
        .raw("CRC Received", 48123)
        .raw("CRC Received in Error", 217);
  }
  Texts texts = {"500"};
  repeat(texts, kChannels, {"24", "48123", "217"});
  return packetOf("0x4116", std::move(writer), texts);
}

BenchmarkPacket hsdpaStatistics() {
  constexpr LogCode kCode = 0x4221;
  constexpr int kProcesses = 6;
  PacketWriter writer(kCode, 18);
  const RecordTable& processes = tableOf(kHSDPAInformationSection, kCode);
  fieldsOf(writer, kHSDPAInformationSection, kCode)
      .raw("Version", 3)
      .raw("Sub Frames", 100)
      .text("Carrier Info", "Single Carrier");
  writer.setCount(processes, kProcesses);
  for (int i = 0; i < kProcesses; ++i) {
    writer.record(processes, i)
        .raw("Process ID", 5)
        .raw("No Rx Bits", 1234567)
        .raw("New Tx", 88)
        .raw("Block Errors", 9);
  }
  Texts texts = {"3", "100", "Single Carrier"};
  repeat(texts, kProcesses, {"5", "1234567", "88", "9"});
  return packetOf("0x4221", std::move(writer), texts);
}

BenchmarkPacket servingPLMN() {
  PacketWriter writer(0x7135, 32);
  fieldsOf(writer, kServingPLMNSection, 0x7135)
      .raw("Mobile Country Code", {3, 1, 0})
      .raw("Mobile Network Code", {2, 6, 0})
      .raw("Location Area Code", 4660)
      .raw("Routing Area Code", 17)
      .text("Service Type", "CS_PS_SERVICE");
  return packetOf("0x7135", std::move(writer), {"310", "260", "4660", "17", "CS_PS_SERVICE"});
}

BenchmarkPacket equivalentPLMNs() {
  constexpr LogCode kCode = 0x7150;
  PacketWriter writer(kCode, 17);
  const RecordTable& networks = tableOf(kEquivalentPLMNListSection, kCode);
  writer.setCount(networks, 1);
  writer.record(networks, 0)
      .raw("Mobile Country Code", {2, 6, 2})
      .raw("Mobile Network Code", {0, 0, 2});
  return packetOf("0x7150", std::move(writer), {"262", "2"});
}

BenchmarkPacket mobileAllocation() {
  constexpr LogCode kCode = 0x51F8;
  constexpr int kFrequencies = 8;
  PacketWriter writer(kCode, 15);
  const RecordTable& frequencies = tableOf(kMobileAllocationSection, kCode);
  fieldsOf(writer, kMobileAllocationSection, kCode).raw("HSN", 33);
  writer.setCount(frequencies, kFrequencies);
  for (int i = 0; i < kFrequencies; ++i) writer.record(frequencies, i).raw("ARFCN", 514);
  Texts texts = {"33"};
  repeat(texts, kFrequencies, {"514"});
  return packetOf("0x51F8", std::move(writer), texts);
}

/// A packet with one value after the other in one section.
BenchmarkPacket plainPacket(std::string name, const Section& section, LogCode code,
                            std::span<const std::int64_t> raw, Texts texts) {
  const PacketReading& reading = *readingOf(section, code);
  PacketWriter writer(reading.packet);
  for (std::size_t i = 0; i < raw.size(); ++i) {
    writer.fields(reading.fields).raw(reading.fields[i].key, raw[i]);
  }
  return packetOf(std::move(name), std::move(writer), std::move(texts));
}

/// How often each packet comes in a drive, beside the packet.
struct DrivePacket {
  int times;
  BenchmarkPacket packet;
};

std::vector<DrivePacket> drive() {
  constexpr std::int64_t kIdentity[] = {54321, 77, 44};
  constexpr std::int64_t kChannel[] = {99};
  constexpr std::int64_t kMMState[] = {19, 8, 0};
  constexpr std::int64_t kGMMState[] = {3, 0, 0};
  constexpr std::int64_t kRegistration[] = {1};
  constexpr std::int64_t kRRState[] = {5, 1, 2, 3};
  constexpr std::int64_t kOn[] = {1};
  constexpr std::int64_t kSeconds[] = {2};
  return {
      {20, connectedModeSets()},
      {20, idleModeRanking()},
      {3, bsicList()},
      {12, gsmMeasurements()},
      {12, transportChannels()},
      {12, hsdpaStatistics()},
      {2, servingPLMN()},
      {1, equivalentPLMNs()},
      {1, mobileAllocation()},
      {3, plainPacket("0x5134", kGSMServingCellSection, 0x5134, kIdentity, {"54321", "77", "44"})},
      {2, plainPacket("0x5076", kGSMServingCellSection, 0x5076, kChannel, {"99"})},
      {3, plainPacket("0x7131", kProcessCSSection, 0x7131, kMMState,
                      {"MM_IDLE", "MM_NORMAL_SERVICE", "UPDATED", "MM_IDLE"})},
      {3, plainPacket("0x7130", kProcessPSSection, 0x7130, kGMMState,
                      {"GMM_REGISTERED", "GMM_NORMAL_SERVICE", "GMM_GU1_UPDATED"})},
      {3, plainPacket("0x7132", kProcessCSSection, 0x7132, kRegistration,
                      {"Automatic", "REG_STATE_IDLE", "REG_STATE_IDLE", "REG_STATE_IDLE"})},
      {3, plainPacket("0x512C", kGSMRRInfoSection, 0x512C, kRRState, {"RR_IDLE", "1", "2", "3"})},
      {2, plainPacket("0x5072", kGSMRRInfoSection, 0x5072, kOn, {"ON"})},
      {1, plainPacket("0x51F6", kGSMRRInfoSection, 0x51F6, kSeconds, {"2 sec"})},
  };
}

/// The drive's packets in an order in which kinds take turns.
std::vector<const BenchmarkPacket*> mixed(const std::vector<DrivePacket>& drive) {
  std::vector<const BenchmarkPacket*> packets;
  for (int round = 0; round < 20; ++round) {
    for (const DrivePacket& kind : drive) {
      if (round < kind.times) packets.push_back(&kind.packet);
    }
  }
  return packets;
}

/// One decoder alone, on a packet from which it shows nothing.
void decodeNothing(benchmark::State& state, const std::string& section, LogCode code,
                   const BenchmarkPacket& packet) {
  const auto coding = createPropertyListCoding();
  VirtualPlatform platform(*coding);
  platform.systemLog().setThreshold(LogPriority::Error);
  const Ondrel_GSMClassIndex index(generatorServices(platform));
  Base& decoder = *index.getClass(section);
  const Value list = Array();
  if (decoder.sectionKind() == SectionKind::List) decoder.updateSectionRef(list);
  for (auto _ : state) decoder.updateWithDataLogCode(packet.bytes, code);
  state.SetItemsProcessed(state.iterations());
}

void registerAll(Display& display, const std::vector<DrivePacket>& drive) {
  for (const DrivePacket& kind : drive) {
    benchmark::RegisterBenchmark(kind.packet.name.c_str(), [&](benchmark::State& state) {
      const BenchmarkPacket* packet[] = {&kind.packet};
      decodePackets(state, display, packet);
    });
  }
  benchmark::RegisterBenchmark(
      "mixed drive", [&](benchmark::State& state) { decodePackets(state, display, mixed(drive)); });
  const BenchmarkPacket& sets = drive.front().packet;
  benchmark::RegisterBenchmark("nothing shown/Detected Set", decodeNothing, "Detected Set", 0x417A,
                               sets);
  benchmark::RegisterBenchmark("nothing shown/GPRS Information", decodeNothing, "GPRS Information",
                               0x51F5, sets);
  benchmark::RegisterBenchmark("nothing shown/Coding Scheme", decodeNothing, "Coding Scheme",
                               0x417A, sets);
}

}  // namespace
}  // namespace kestro::benchmarks

int main(int argc, char** argv) {
  using namespace kestro::benchmarks;  // NOLINT(google-build-using-namespace)
  const auto packets = drive();
  Display display("Ondrel_GSM");
  for (const DrivePacket& kind : packets) {
    if (!showsWhatItMust(display, std::span(&kind.packet, 1))) return EXIT_FAILURE;
  }
  registerAll(display, packets);
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return EXIT_SUCCESS;
}
