// SPDX-License-Identifier: MIT
// The packets of the LTE channel.
#include <string_view>

#include "Fuzz/PlainReader/PlainReader.h"

namespace kestro::plain {
namespace {

constexpr std::uint32_t kLTECodes[] = {0xB0C2, 0xB0C1,   0xB179,   0xB17F,  0xB180,
                                       0xB186, 0xFF0000, 0xFF0001, 0xFF0002};
constexpr std::string_view kLTEDictionaries[] = {
    "Serving Cell Info",         "Connected mode LTE Intra-frequency Measurement",
    "Serving Cell Measurements", "Neighbor Measurements",
    "Reselection Candidates",    "SIM Info"};
constexpr std::string_view kLTELists[] = {"Measured Neighbor Cells", "Detected Cells",
                                          "Neighbor Cells List", "Reselection Candidates List",
                                          "PDP Context Info"};

std::string_view bandwidth(int resourceBlocks) {
  switch (resourceBlocks) {
    case 6:
      return "1.4 MHz";
    case 15:
      return "3 MHz";
    case 25:
      return "5 MHz";
    case 50:
      return "10 MHz";
    case 75:
      return "15 MHz";
    case 100:
      return "20 MHz";
    default:
      return "Unknown";
  }
}

/// The `count` bits of a word from bit `first` on.
unsigned bits(std::uint32_t word, unsigned first, unsigned count) {
  return word >> first & ((1U << count) - 1);
}

std::string power(double number) { return text("%4.2f dBm", number); }
std::string quality(double number) { return text("%4.2f dB", number); }
std::string level(unsigned raw) { return text("%d dBm", static_cast<int>(raw) - 30); }
std::string minimumLevel(unsigned raw) { return text("%d dBm", 2 * static_cast<int>(raw) - 140); }
std::string plainNumber(unsigned number) { return text("%u", number); }

class LTEReader : public SectionReader {
 public:
  explicit LTEReader(const PropertyListCoding& coding)
      : SectionReader(coding, kLTEDictionaries, kLTELists) {}

  [[nodiscard]] std::span<const std::uint32_t> codes() const override { return kLTECodes; }

 protected:
  void read(const Packet& packet, std::uint32_t code) override {
    if (code == 0xB0C2 && packet.size() >= 38) readServingCell(packet);
    if (code == 0xB0C1 && packet.size() >= 22) {
      section("Serving Cell Info").set("Num Tx Antennas", text("%d", packet.byte(20)));
    }
    if (code == 0xB179 && packet.size() >= 29) readIntraFrequency(packet);
    if (code == 0xB17F && packet.size() >= 33) readServingMeasurement(packet);
    if (code == 0xB180 && packet.size() >= 21) readNeighbors(packet);
    if (code == 0xB186 && packet.size() >= 21) readReselection(packet);
    if (code == 0xFF0001) readCells(packet);
  }

 private:
  void readServingCell(const Packet& packet) {
    Dictionary shown = section("Serving Cell Info");
    shown.set("Physical Cell ID", text("%d", packet.half(14)));
    shown.set("Download Frequency", text("%d", packet.half(16)));
    shown.set("Upload Frequency", text("%d", packet.half(18)));
    shown.remove("UARFCN");
    shown.set("Download Bandwidth", bandwidth(packet.byte(20)));
    shown.set("Upload Bandwidth", bandwidth(packet.byte(21)));
    shown.set("Cell Identity", text("%d", packet.signedWord(22)));
    shown.set("Tracking Area Code", text("%d", packet.half(26)));
    shown.set("Freq Band Indicator", text("%d", packet.signedWord(28)));
  }

  void readCells(const Packet& packet) {
    Dictionary shown = section("Serving Cell Info");
    for (const Dictionary& cell : cellsIn(packet)) {
      if (!isCell(cell, "LTE", "Serving")) continue;
      showNumber(shown, "Tracking Area Code", cell, "TAC");
      showNumber(shown, "Cell Identity", cell, "CellId");
      showNumber(shown, "Physical Cell ID", cell, "PID");
      showNumber(shown, "Freq Band Indicator", cell, "BandInfo");
      showNumber(shown, "UARFCN", cell, "UARFCN");
      return;  // the first one only
    }
  }

  void readIntraFrequency(const Packet& packet) {
    Dictionary shown = section("Connected mode LTE Intra-frequency Measurement");
    shown.set("E-ARFCN", text("%d", packet.half(17)));
    shown.set("Serving Physical Cell ID", text("%d", packet.half(19)));
    shown.set("Subframe Number", text("%d", packet.half(21)));
    shown.set("Serving Filtered RSRP", power(packet.half(23) * 0.25 - 140));
    shown.set("Serving Filtered RSRQ", quality(packet.half(25) * 0.125 - 20));
    const auto measured = static_cast<std::size_t>(packet.byte(27));
    const auto detected = static_cast<std::size_t>(packet.byte(28));
    std::vector<Value> rows;
    for (std::size_t at = 29; at < 29 + 6 * measured; at += 6) {
      rows.push_back(Dictionary{{"Physical Cell ID", text("%d", packet.half(at))},
                                {"Filtered RSRP", power(packet.half(at + 2) * 0.25 - 140)},
                                {"Filtered RSRQ", quality(packet.half(at + 4) * 0.125 - 20)}});
    }
    show("Measured Neighbor Cells", std::move(rows));
    rows.clear();
    const std::size_t start = 29 + 6 * measured;
    for (std::size_t at = start; at < start + 2 * detected; at += 2) {
      rows.push_back(Dictionary{{"Physical Cell ID", text("%d", packet.half(at))}});
    }
    show("Detected Cells", std::move(rows));
  }

  void readServingMeasurement(const Packet& packet) {
    Dictionary shown = section("Serving Cell Measurements");
    shown.set("Version", text("%d", packet.byte(13)));
    shown.set("E-ARFCN", text("%d", packet.half(17)));
    const auto cell = static_cast<unsigned>(packet.half(19));
    shown.set("Physical Cell ID", plainNumber(bits(cell, 0, 9)));
    shown.set("Serving Layer Priority", plainNumber(bits(cell, 9, 4)));
    readServingLevels(packet.word(21), packet.word(25), shown);
    readServingRules(packet.word(29), shown);
  }

  static void readServingLevels(std::uint32_t signal, std::uint32_t limits, Dictionary& shown) {
    shown.set("Measured RSRP", power(bits(signal, 0, 9) * 0.25 - 140));
    shown.set("Average RSRP", power(bits(signal, 9, 9) * 0.25 - 140));
    shown.set("Measured RSRQ", quality(bits(signal, 18, 7) * 0.25 - 30));
    shown.set("Average RSRQ", quality(bits(signal, 25, 7) * 0.25 - 30));
    shown.set("Measured RSSI", power(bits(limits, 0, 9) * 0.5 - 140));
    shown.set("Qrxlevmin", minimumLevel(bits(limits, 9, 6)));
    const unsigned maximum = bits(limits, 15, 7);
    shown.set("P_Max", maximum == 64 ? "Not Present" : level(maximum));
    shown.set("Max UE Tx Power", level(bits(limits, 22, 6)));  // 6 bits are never 64
  }

  static void readServingRules(std::uint32_t rules, Dictionary& shown) {
    shown.set("Srxlev", level(bits(rules, 0, 7)));
    shown.set("Num of Consecutive DRX Cycles of S < 0", plainNumber(bits(rules, 7, 6)));
    const unsigned intra = bits(rules, 13, 6);
    shown.set("S Intra Search", intra == 32 ? "Not Present" : text("%u dB", 2 * intra));
    const unsigned other = bits(rules, 19, 6);
    shown.set("S Non Intra Search", other == 32 ? "Not Present" : text("%u dBm", 2 * other));
    shown.set("Measurement Rules Updated", bits(rules, 25, 1) == 1 ? "True" : "False");
    shown.set("Measurement Rules", plainNumber(bits(rules, 26, 4)));
  }

  void readNeighbors(const Packet& packet) {
    Dictionary shown = section("Neighbor Measurements");
    shown.set("Version", text("%d", packet.byte(13)));
    shown.set("E-ARFCN", text("%d", packet.half(17)));
    shown.set("Qrxlevmin", text("%d dBm", 2 * (packet.byte(19) % 64) - 140));
    const std::size_t count = bits(static_cast<std::uint32_t>(packet.half(19)), 6, 5) + 1;
    std::vector<Value> rows;
    for (std::size_t at = 21; at < 21 + 20 * count; at += 20) {
      rows.emplace_back(neighbor(packet, at));
    }
    show("Neighbor Cells List", std::move(rows));
  }

  static Dictionary neighbor(const Packet& packet, std::size_t at) {
    const std::uint32_t first = packet.word(at);
    const auto second = static_cast<std::uint32_t>(packet.half(at + 4));
    const auto third = static_cast<std::uint32_t>(packet.half(at + 6));
    const std::string frame = text("%d", packet.half(at + 12) & 0x7FF);
    const std::string sample = plainNumber(bits(packet.word(at + 12), 11, 19));
    return {{"Physical Cell ID", plainNumber(bits(first, 0, 9))},
            {"Measured RSSI", power(bits(first, 9, 8) * 0.5 - 140)},
            {"Measured RSRP", power(bits(first, 17, 9) * 0.5 - 140)},
            {"Average RSRP", power(bits(second, 0, 9) * 0.5 - 140)},
            {"Measured RSRQ", quality(bits(second, 9, 7) * 0.25 - 30)},
            {"Average RSRQ", quality(bits(third, 0, 7) * 0.25 - 30)},
            {"Srxlev", level(bits(third, 7, 7))},
            {"Frequency Offset", text("%d", packet.half(at + 8))},
            {"Ant 0 Frame Offset", frame},
            {"Ant 0 Sample Offset", sample},
            {"Ant 1 Frame Offset", frame},
            {"Ant 1 Sample Offset", sample}};
  }

  void readReselection(const Packet& packet) {
    Dictionary shown = section("Reselection Candidates");
    shown.set("Version", text("%d", packet.byte(13)));
    shown.set("Serving EARFCN", text("%d", packet.half(15)));
    shown.set("Serving Cell ID", text("%d", packet.half(17)));
    const auto count = static_cast<std::size_t>(packet.byte(19));
    std::vector<Value> rows;
    for (std::size_t i = 0; i < count; ++i) rows.emplace_back(candidate(packet, 21 + 4 * i));
    show("Reselection Candidates List", std::move(rows));
  }

  static Dictionary candidate(const Packet& packet, std::size_t at) {
    static constexpr std::string_view kNames[] = {"LTE", "UTRAN", "GERAN", "CDMA1XRTT", "CDMAHRPD"};
    const int technology = packet.half(at + 2);
    Dictionary row{
        {"Candidate Priority", text("%d", packet.half(at))},
        {"Candidate RAT Type", nameOf(static_cast<std::uint32_t>(technology), kNames, "??")}};
    addTechnology(packet, at + 4, technology, row);
    return row;
  }

  static void addTechnology(const Packet& packet, std::size_t at, int technology, Dictionary& row) {
    if (technology == 0) {
      row.set("E ARFCN", text("%d", packet.half(at)));
      row.set("Cell ID", text("%d", packet.half(at + 2) >> 7));
    } else if (technology == 1) {
      row.set("U ARFCN", text("%d", packet.half(at)));
      row.set("PSC", text("%d", packet.half(at + 2)));
    } else if (technology == 2) {
      row.set("ARFCN", text("%d", packet.half(at)));
      row.set("Band", text("%d", packet.byte(at + 2)));
      row.set("BSIC ID", text("%d", packet.byte(at + 3)));
    } else if (technology <= 4) {
      row.set("Band", text("%d", packet.byte(at)));
      row.set("Channel", text("%d", packet.half(at + 4)));
      row.set("Pilot", text("%d", packet.half(at + 6)));
    }
  }
};

}  // namespace

std::unique_ptr<PlainReader> makeLTEReader(const PropertyListCoding& coding) {
  return std::make_unique<LTEReader>(coding);
}

}  // namespace kestro::plain
