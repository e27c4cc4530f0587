// SPDX-License-Identifier: MIT
#include "Fuzz/PlainReader/GsmUmts.h"

namespace kestro::plain {
namespace {

/// Ec/N0 in dB of its linear value.
int energyPerChip(std::uint32_t linear) {
  if (linear >= 524288) return 0;
  static constexpr std::uint32_t kThresholds[] = {
      417647, 331808, 263624, 209463, 166441, 132268, 105123, 83562, 66435, 52830, 42023,
      33440,  26621,  21205,  16903,  13486,  10771,  8615,   6902,  5542,  4461,  3603,
      2921,   2240,   1949,   1607,   1336,   1120,   949,    813,   756};
  int result = 0;
  for (const std::uint32_t threshold : kThresholds) {
    --result;
    if (linear > threshold) return result;
  }
  return linear > 705 ? -31 : 0;
}

/// The first word of three that is not zero.
std::uint32_t energyIndex(const Packet& packet, std::size_t record) {
  for (const unsigned offset : {32U, 36U, 40U}) {
    if (packet.word(record + offset) != 0) return packet.word(record + offset);
  }
  return 0;
}

Dictionary rankedUMTSCell(const Packet& packet, std::size_t at) {
  return {{"Downlink Frequency", text("%d", packet.signedHalf(at))},
          {"Scrambling Code", text("%d", packet.half(at + 2))},
          {"RSCP", text("%d dB", packet.signedByte(at + 4) - 21)},
          {"Rank Cell RSCP", text("%d dB", packet.signedHalf(at + 5))},
          {"Energy Per Chip", text("%f dB", packet.signedByte(at + 7) * 0.5)},
          {"Ranking Value", text("%d", packet.signedHalf(at + 8))}};
}

Dictionary rankedGSMCell(const Packet& packet, std::size_t at) {
  return {{"ARFCN", text("%d", packet.half(at))},
          {"BSIC", text("%d", packet.half(at + 2))},
          {"RSSI", text("%d dBm", packet.signedByte(at + 4))},
          {"Ranking Value", text("%d", packet.signedHalf(at + 5))}};
}

}  // namespace

void GsmUmtsReader::readCellSets(const Packet& packet) {
  const auto count = static_cast<std::size_t>(packet.byte(15));
  std::vector<Value> rows;
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t cell = 16 + 15 * i;
    if (packet.byte(cell + 8) >> 5 != 0) continue;
    const int energy = energyPerChip(energyIndex(packet, 16 + 15 * count + 44 * i));
    const int power = (packet.signedHalf(13) + 512) / 10 - 106 + energy;
    rows.push_back(Dictionary{
        {"Scrambling Code", text("%d", packet.byte(cell + 7) | (packet.byte(cell + 8) & 31) << 8)},
        {"RSCP", text("%d dB", power)},
        {"Energy Per Chip", text("%d dB", energy)}});
  }
  show("Active Set", std::move(rows));
  for (const char* empty : {"Detected Set", "Monitored Set", "Virtual Active Set"}) show(empty, {});
}

void GsmUmtsReader::readRanking(const Packet& packet) {
  std::vector<Value> rows;
  rows.reserve(255);
  for (int i = 0; i < packet.byte(13); ++i) {
    rows.emplace_back(rankedUMTSCell(packet, 15 + 10 * static_cast<std::size_t>(i)));
  }
  show("UMTS Set", std::move(rows));
  rows.clear();
  for (int i = 0; i < packet.byte(14); ++i) {
    rows.emplace_back(rankedGSMCell(packet, 15 + 7 * static_cast<std::size_t>(i)));
  }
  show("GSM Set", std::move(rows));
}

void GsmUmtsReader::readServingIdentity(const Packet& packet) {
  Dictionary shown = section("GSM Serving Cell");
  shown.set("Cell ID", text("%d", packet.half(17)));
  shown.set("ARFCN", text("%d", packet.half(13)));
  shown.set("BSIC", text("%d", packet.half(15)));
}

void GsmUmtsReader::readMeasurements(const Packet& packet) {
  Dictionary shown = section("GSM Serving Cell");
  shown.set("RSSI", text("%d dBm", packet.byte(15)));
  shown.set("C1 Value", text("%d", packet.half(16)));
  shown.set("C2 Value", text("%d", packet.half(20)));
  std::vector<Value> rows;
  for (int i = 0; i < packet.byte(28); ++i) {
    const std::size_t at = 29 + 14 * static_cast<std::size_t>(i);
    Dictionary row{{"ARFCN", text("%d", packet.half(at))},
                   {"RSSI", text("%d", packet.byte(at + 2))},
                   {"C1 Value", text("%d", packet.signedWord(at + 3))}};
    const auto identity = _identities.find(packet.half(at));
    if (identity != _identities.end()) row.set("BSIC", text("%d", identity->second));
    rows.emplace_back(row);
  }
  show("Neighboring Cells", std::move(rows));
}

void GsmUmtsReader::readIdentities(const Packet& packet) {
  _identities.clear();
  for (int i = 0; i < packet.byte(14); ++i) {
    const std::size_t at = 15 + 4 * static_cast<std::size_t>(i);
    _identities[packet.half(at)] = packet.byte(at + 2);
  }
}

void GsmUmtsReader::readMobileAllocation(const Packet& packet) {
  Array channels;
  for (int i = 0; i < packet.byte(14); ++i) {
    channels.append(text("%d", packet.half(15 + 2 * static_cast<std::size_t>(i))));
  }
  Dictionary shown = section("Mobile Allocation");
  shown.set("HSN", text("%d", packet.byte(13)));
  shown.set("ARFCNs", channels);
}

// --- The cell-monitor list -----------------------------------------------------------------------

void GsmUmtsReader::readUMTSNeighbors(const std::vector<Dictionary>& cells) {
  std::vector<Value> rows;
  for (const Dictionary& cell : cells) {
    if (!isCell(cell, "UMTS", "Neighbor")) continue;
    Dictionary row;
    showNumber(row, "UARFCN", cell, "UARFCN");
    showNumber(row, "Scrambling Code", cell, "SCN");
    showLevel(row, "RSCP", cell, "RSCP", "%d dBm");
    showLevel(row, "Energy Per Chip", cell, "ECN0", "%d dB");
    rows.emplace_back(row);
  }
  show("UMTS Set", std::move(rows));
}

void GsmUmtsReader::readGSMNeighbors(const std::vector<Dictionary>& cells) {
  std::vector<Value> rows;
  for (const Dictionary& cell : cells) {
    if (!isCell(cell, "GSM", "Neighbor")) continue;
    Dictionary row;
    showNumber(row, "ARFCN", cell, "ARFCN");
    showLevel(row, "RSSI", cell, "RSSI", "%d dBm", 2);
    rows.emplace_back(row);
  }
  show("Neighboring Cells", std::move(rows));
}

void GsmUmtsReader::readServingCells(const std::vector<Dictionary>& cells) {
  bool hasCell = false;
  bool hasNetwork = false;
  for (const Dictionary& cell : cells) {
    const bool isGSM = isCell(cell, "GSM", "Serving");
    if (isGSM && !hasCell) {
      Dictionary shown = section("GSM Serving Cell");
      showNumber(shown, "Cell ID", cell, "CellId");
      showNumber(shown, "ARFCN", cell, "ARFCN");
      hasCell = true;
    }
    if ((isGSM || isCell(cell, "UMTS", "Serving")) && !hasNetwork) {
      Dictionary shown = section("Serving PLMN");
      showNumber(shown, "Mobile Country Code", cell, "MCC");
      showNumber(shown, "Mobile Network Code", cell, "MNC");
      showNumber(shown, "Location Area Code", cell, "LAC");
      hasNetwork = true;
    }
  }
}

}  // namespace kestro::plain
