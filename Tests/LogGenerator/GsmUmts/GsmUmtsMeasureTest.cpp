// SPDX-License-Identifier: MIT
// What the GSM/UMTS packets say as numbers.
#include "LogGenerator/Ondrel/CellMonitor.h"
#include "Platform/TelephonyService.h"
#include "Tests/Support/MeasureFixture.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

class GsmUmtsMeasureTest : public MeasureFixture {
 protected:
  GsmUmtsMeasureTest() : MeasureFixture(kTqLogChannelTechnology_Ondrel_GSM) {}
};

/// One neighbour on channel 62 at -80, and nothing of it but that.
PacketBytes oneNeighbour() {
  return packet(0x5137).u8(28, 1).u16(29, 62).u8(31, 80).u32(32, 7).length(43);
}

TEST_F(GsmUmtsMeasureTest, ANeighbourIsItsChannelAndTheCodeThatAnEarlierListGaveIt) {
  EXPECT_THAT(lines(oneNeighbour()), Contains("Neighboring Cells/RSSI [62] 80|80"));
  // Two entries for the channel: the last counts. The list itself shows nothing.
  EXPECT_THAT(lines(packet(0x51FF).u8(14, 2).u16(15, 62).u8(17, 12).u16(19, 62).u8(21, 41)),
              IsEmpty());
  EXPECT_THAT(lines(oneNeighbour()), Contains("Neighboring Cells/RSSI [62/41] 80|80"));
  EXPECT_THAT(lines(oneNeighbour()), Contains("Neighboring Cells/BSIC [62/41] 41|41"));
}

TEST_F(GsmUmtsMeasureTest, CodesOfNetworksAreNumbersWhoseTextKeepsTheirZeros) {
  // 0 0 1 and 0 1, whose third digit is a filler.
  const auto network = packet(0x7135).u8(15, 0x00).u8(16, 0x1F).u8(17, 0x10).length(32);
  EXPECT_THAT(lines(network), Contains("Serving PLMN/Mobile Country Code 1|001"));
  EXPECT_THAT(lines(network), Contains("Serving PLMN/Mobile Network Code 115|0115"));
}

TEST_F(GsmUmtsMeasureTest, ComputedNumbersAreNumbersToo) {
  // One cell of the active set, code 300; its energy record has 20000 first, which is above 16903:
  // -15 dB.
  const auto set = packet(0x417A).u16(13, 200).u8(15, 1).u16(23, 300).length(31).u32(63, 20000);
  // (200 + 512) / 10 - 106 - 15
  EXPECT_THAT(lines(set), ElementsAre("Active Set/Scrambling Code [300] 300|300",
                                      "Active Set/RSCP [300] -50 dB|-50 dB",
                                      "Active Set/Energy Per Chip [300] -15 dB|-15 dB"));
}

TEST_F(GsmUmtsMeasureTest, AListedLevelThatWasNotMeasuredIsNone) {
  const auto neighbour = [](std::int64_t level) {
    return Array{Dictionary{
        {kTqCellMonitorCellRadioAccessTechnology, kTqCellMonitorRadioAccessTechnologyUMTS},
        {kTqCellMonitorCellType, kTqCellMonitorCellTypeNeighbor},
        {kTqCellMonitorUARFCN, Value::integer(10613)},
        {kTqCellMonitorSCN, Value::integer(3)},
        {kTqCellMonitorRSCP, Value::integer(level)}}};
  };
  EXPECT_THAT(linesOfList(kCellMonitorCode, neighbour(-90)),
              Contains("UMTS Set/RSCP [10613/3] -90 dBm|-90 dBm"));
  EXPECT_THAT(linesOfList(kCellMonitorCode, neighbour(0x7FFF)), Not(Contains(HasSubstr("RSCP"))));
}

TEST_F(GsmUmtsMeasureTest, RowsUnderAKeyAreNamedByIt) {
  EXPECT_THAT(
      lines(packet(0x4116).u8(13, 1).u16(14, 50).u8(16, 9).u32(17, 1000).u32(21, 3)),
      ElementsAre("BLER/Window Size 50|50", "BLER/Transport Channels/Transport Channel ID [9] 9|9",
                  "BLER/Transport Channels/CRC Received [9] 1000|1000",
                  "BLER/Transport Channels/CRC Received in Error [9] 3|3"));
  // A plain number is nothing but its position.
  EXPECT_THAT(lines(packet(0x51F8).u8(13, 4).u8(14, 2).u16(15, 62).u16(17, 70)),
              ElementsAre("Mobile Allocation/HSN 4|4", "Mobile Allocation/ARFCNs/ARFCN [#0] 62|62",
                          "Mobile Allocation/ARFCNs/ARFCN [#1] 70|70"));
}

TEST_F(GsmUmtsMeasureTest, AStateHasItsNumberAndItsText) {
  EXPECT_THAT(lines(packet(0x512C).u8(13, 9).length(17)),
              Contains("GSM RR Info/RR State 9|RR_DATA_TRANSFER"));
  EXPECT_THAT(lines(packet(0x512C).u8(13, 99).length(17)),
              Contains("GSM RR Info/RR State 99|Unknown"));
}

}  // namespace
}  // namespace kestro::testing
