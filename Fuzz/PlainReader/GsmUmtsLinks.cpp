// SPDX-License-Identifier: MIT
#include "Fuzz/PlainReader/GsmUmts.h"

namespace kestro::plain {
namespace {

constexpr std::uint32_t kGSMCodes[] = {
    0x417A, 0x51F5, 0x7135, 0x51F6, 0x51FB, 0x51FD,   0x51F4,   0x5137,  0x5134, 0x5076,
    0x51F8, 0x51FF, 0x7130, 0x7132, 0x4005, 0x7131,   0x7150,   0x512C,  0x5072, 0x4125,
    0x4031, 0x4127, 0x4157, 0x4116, 0x4221, 0xFF0000, 0xFF0001, 0xFF0002};
constexpr std::string_view kGSMDictionaries[] = {"Coding Scheme",
                                                 "GPRS Information",
                                                 "GSM Serving Cell",
                                                 "Mobile Allocation",
                                                 "Process PS",
                                                 "Process CO",
                                                 "UMTS RR Measurement",
                                                 "Cell Change Counters",
                                                 "Serving PLMN",
                                                 "GSM RR Info",
                                                 "Process CS",
                                                 "UMTS RR Info",
                                                 "BLER",
                                                 "HSDPA Info",
                                                 "SIM Info"};
constexpr std::string_view kGSMLists[] = {
    "Active Set",    "Neighboring Cells",   "PDP Context Info",  "Detected Set",
    "GSM Set",       "Non-Ranked GSM Set",  "UMTS Set",          "Equivalent PLMN List",
    "Monitored Set", "Non-Ranked UMTS Set", "Virtual Active Set"};

Array harqProcesses(const Packet& packet, std::size_t start, int count) {
  Array rows;
  for (int i = 0; i < count; ++i) {
    const std::size_t at = start + 9 * static_cast<std::size_t>(i);
    rows.append(Dictionary{{"Process ID", text("%d", packet.byte(at))},
                           {"No Rx Bits", text("%u", packet.word(at + 1))},
                           {"New Tx", text("%d", packet.half(at + 5))},
                           {"Block Errors", text("%d", packet.half(at + 7))}});
  }
  return rows;
}

}  // namespace

GsmUmtsReader::GsmUmtsReader(const PropertyListCoding& coding)
    : SectionReader(coding, kGSMDictionaries, kGSMLists) {}

std::span<const std::uint32_t> GsmUmtsReader::codes() const { return kGSMCodes; }

void GsmUmtsReader::read(const Packet& packet, std::uint32_t code) {
  const auto is = [&](std::uint32_t wanted, std::size_t length) {
    return code == wanted && packet.size() >= length;
  };
  if (is(0x417A, 16)) readCellSets(packet);
  if (is(0x4005, 15)) readRanking(packet);
  if (is(0x5134, 26)) readServingIdentity(packet);
  if (is(0x5137, 29)) readMeasurements(packet);
  if (is(0x51FF, 15)) readIdentities(packet);
  if (is(0x51F8, 15)) readMobileAllocation(packet);
  if (is(0x7131, 16)) readMobilityManagement(packet);
  if (is(0x7132, 16)) readRegistration(packet);
  if (is(0x7130, 16)) readPacketMobilityManagement(packet);
  if (is(0x7135, 32)) readServingNetwork(packet);
  if (is(0x7150, 17)) readEquivalentNetworks(packet);
  if (is(0x4116, 16)) readBlockErrors(packet);
  if (is(0x4221, 18)) readHsdpa(packet);
  if (is(0x512C, 17)) readRadioResource(packet);
  if (is(0x5137, 29)) readLevels(packet);
  // Only the low 8 bits of the channel.
  if (is(0x5076, 17)) {
    section("GSM Serving Cell").set("MA Dedicated ARFCN", text("%d", packet.byte(13)));
  }
  if (is(0x51F6, 24)) section("GSM RR Info").set("DRX Used", text("%d sec", packet.byte(16)));
  if (is(0x5072, 20)) {
    section("GSM RR Info").set("DTX Used", packet.byte(19) != 0 ? "ON" : "OFF");
  }
  if (code != 0xFF0001) return;
  const std::vector<Dictionary> cells = cellsIn(packet);
  readUMTSNeighbors(cells);
  readGSMNeighbors(cells);
  readServingCells(cells);
}

void GsmUmtsReader::readBlockErrors(const Packet& packet) {
  Array rows;
  for (int i = 0; i < packet.byte(13); ++i) {
    const std::size_t at = 16 + 9 * static_cast<std::size_t>(i);
    rows.append(Dictionary{{"Transport Channel ID", text("%d", packet.byte(at))},
                           {"CRC Received", text("%d", packet.signedWord(at + 1))},
                           {"CRC Received in Error", text("%d", packet.signedWord(at + 5))}});
  }
  Dictionary shown = section("BLER");
  shown.set("Window Size", text("%d", packet.half(14)));
  shown.set("Transport Channels", rows);
}

void GsmUmtsReader::readHsdpa(const Packet& packet) {
  static constexpr std::string_view kCarriers[] = {"Single Carrier", "MIMO", "Dual Carrier",
                                                   "Reserved"};
  Dictionary shown = section("HSDPA Info");
  shown.set("Version", text("%d", packet.byte(13)));
  shown.set("Sub Frames", text("%d", packet.half(14) & 0x3FF));
  shown.set("Carrier Info", kCarriers[packet.byte(15) >> 2 & 3]);
  const int primary = packet.byte(16);
  const int secondary = packet.byte(17);
  if (primary != 0) shown.set("Primary HARQ Process", harqProcesses(packet, 18, primary));
  if (secondary == 0) return;
  const std::size_t start = 18 + 162 * static_cast<std::size_t>(primary);
  shown.set("Secondary HARQ Process", harqProcesses(packet, start, secondary));
}

void GsmUmtsReader::readLevels(const Packet& packet) {
  Dictionary shown = section("GSM RR Info");
  shown.set("Serving Rx Level", text("%d", packet.byte(15)));
  shown.set("Rx Quality Full", text("%d", packet.signedWord(16)));
  shown.set("Rx Quality Sub", text("%d", packet.signedWord(20)));
}

std::unique_ptr<PlainReader> makeGsmUmtsReader(const PropertyListCoding& coding) {
  return std::make_unique<GsmUmtsReader>(coding);
}

}  // namespace kestro::plain
