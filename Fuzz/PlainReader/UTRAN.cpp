// SPDX-License-Identifier: MIT
// The packets of the UTRAN channel.
#include <string_view>

#include "Fuzz/PlainReader/PlainReader.h"

namespace kestro::plain {
namespace {

constexpr std::uint32_t kUTRANCodes[] = {0xD0E0, 0xD0E2,   0xD00A,   0xD00E,
                                         0xD00C, 0xFF0000, 0xFF0001, 0xFF0002};
constexpr std::string_view kUTRANDictionaries[] = {"RRC Info", "Serving Cell Info", "SIM Info"};
constexpr std::string_view kUTRANLists[] = {"Neighbor Cell List", "GSM Neighbor Cell List",
                                            "TRCH BLER", "CCTRCH SIR", "PDP Context Info"};

class UTRANReader : public SectionReader {
 public:
  explicit UTRANReader(const PropertyListCoding& coding)
      : SectionReader(coding, kUTRANDictionaries, kUTRANLists) {}

  [[nodiscard]] std::span<const std::uint32_t> codes() const override { return kUTRANCodes; }

 protected:
  void read(const Packet& packet, std::uint32_t code) override {
    if (code == 0xD0E0) readState(packet);
    if (code == 0xD0E2 && packet.size() >= 26) readServingCell(packet);
    if (code == 0xD00A && packet.size() >= 21) readNeighbors(packet);
    if (code == 0xD00E && packet.size() >= 17) show("GSM Neighbor Cell List", {});
    if (code == 0xD00C && packet.size() >= 17) {
      readBlockErrors(packet);
      readInterference(packet);
    }
    if (code == 0xFF0001) readCells(packet);
  }

 private:
  void readState(const Packet& packet) {
    static constexpr std::string_view kNames[] = {"Disconnected", "Connecting", "Cell Fach",
                                                  "Cell DCH",     "Cell PCH",   "Cell URA PCH"};
    const bool isValid = packet.size() >= 15 && packet.byte(13) == 1;
    const int mode = isValid ? packet.byte(14) : 255;
    section("RRC Info")
        .set("State", nameOf(static_cast<std::uint32_t>(mode), kNames, "Unknown RRC Mode"));
  }

  void readServingCell(const Packet& packet) {
    Dictionary shown = section("Serving Cell Info");
    shown.set("Cell Access Restrictions", text("%d", packet.byte(14)));
    shown.set("Cell ID", text("%d", packet.signedWord(21)));
    shown.set("Downlink UARFCN", text("%d", packet.half(19)));
    shown.set("Uplink UARFCN", text("%d", packet.half(17)));
    shown.set("URA ID", text("%d", packet.byte(15)));
    shown.set("Allowed Access", packet.byte(25) % 2 == 1 ? "Emergency Calls Only" : "All Calls");
  }

  void readCells(const Packet& packet) {
    Dictionary shown = section("Serving Cell Info");
    for (const Dictionary& cell : cellsIn(packet)) {
      if (!isCell(cell, "UTRAN2", "Serving")) continue;
      showNumber(shown, "Local Area Code", cell, "LAC");
      showNumber(shown, "Cell ID", cell, "CellId");
      showNumber(shown, "Freq Band Indicator", cell, "BandInfo");
      showNumber(shown, "Cell Scrambling Code", cell, "SCN");
      showNumber(shown, "Uplink UARFCN", cell, "UARFCN");
      showNumber(shown, "Downlink UARFCN", cell, "UARFCN");
    }
  }

  void readNeighbors(const Packet& packet) {
    const auto count = static_cast<std::size_t>(packet.byte(16) >> 1);
    std::vector<Value> rows;
    for (std::size_t i = 0; i < count; ++i) rows.emplace_back(neighbor(packet, 168 + 16 * i));
    show("Neighbor Cell List", std::move(rows));
  }

  static Dictionary neighbor(const Packet& packet, std::size_t at) {
    const int b0 = packet.byte(at);
    const int b1 = packet.byte(at + 1);
    const int b2 = packet.byte(at + 2);
    const int b3 = packet.byte(at + 3);
    Dictionary row{{"UARFCN", text("%d", b0 | (b1 & 0x3F) << 8)},
                   {"Cell ID", text("%d", b1 >> 6 | (b2 & 0x1F) << 2)},
                   {"Filter RSCP", text("%f", (b2 >> 5 | (b3 & 0x1F) << 3) * 0.00390625)}};
    static constexpr std::string_view kSets[] = {"ASET", "MSET", "DSET"};
    const int set = b3 >> 5 & 3;
    if (set != 3) row.set("Status", kSets[set]);
    row.set("inJDCS", (b3 & 0x80) != 0 ? "TRUE" : "FALSE");
    return row;
  }

  static std::size_t channelCount(const Packet& packet) {
    return static_cast<std::size_t>(packet.half(14) >> 6 & 0x3F);
  }

  void readBlockErrors(const Packet& packet) {
    std::vector<Value> rows;
    for (std::size_t i = 0; i < channelCount(packet); ++i) {
      rows.push_back(Dictionary{{"TRCH ID", text("%d", packet.byte(17 + 2 * i))},
                                {"TRCH BLER Measurement", text("%d", packet.byte(18 + 2 * i))}});
    }
    show("TRCH BLER", std::move(rows));
  }

  void readInterference(const Packet& packet) {
    const auto count = static_cast<std::size_t>(packet.byte(15) >> 4);
    std::vector<Value> rows;
    for (std::size_t i = 0; i < count; ++i) {
      const std::size_t at = 289 + 34 * channelCount(packet) + 8 * i;
      Array ratios;
      for (std::size_t k = 2; k < 8; ++k) ratios.append(text("%d", packet.byte(at + k)));
      rows.push_back(Dictionary{{"CCTRCH ID", text("%d", packet.byte(at))},
                                {"TSNUM", text("%d", packet.byte(at + 1))},
                                {"SIR", ratios}});
    }
    show("CCTRCH SIR", std::move(rows));
  }
};

}  // namespace

std::unique_ptr<PlainReader> makeUTRANReader(const PropertyListCoding& coding) {
  return std::make_unique<UTRANReader>(coding);
}

}  // namespace kestro::plain
