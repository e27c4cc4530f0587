// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/ServingCellInfo.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;

class LTEServingCellInfoTest : public DecoderFixture<LTEServingCellInfo> {
 protected:
  static PacketBytes systemInformation() {
    return packet(0xB0C2)
        .u16(14, 301)
        .u16(16, 1300)
        .u16(18, 19300)
        .u8(20, 50)
        .u8(21, 25)
        .u32(22, 27447297)
        .u16(26, 12345)
        .u32(28, 3)
        .length(38);
  }

  static Dictionary servingCell() {
    return {{"kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyLTE"},
            {"kTqCellMonitorCellType", "kTqCellMonitorCellTypeServing"},
            {"kTqCellMonitorUARFCN", Value::integer(1850)},
            {"kTqCellMonitorTAC", Value::integer(7)},
            {"kTqCellMonitorCellId", Value::integer(2)},
            {"kTqCellMonitorPID", Value::integer(40)},
            {"kTqCellMonitorBandInfo", Value::integer(20)}};
  }
};

TEST_F(LTEServingCellInfoTest, ShowsTheSystemInformation) {
  decode(systemInformation());
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Physical Cell ID", "301"), Pair("Download Frequency", "1300"),
                          Pair("Upload Frequency", "19300"), Pair("Download Bandwidth", "10 MHz"),
                          Pair("Upload Bandwidth", "5 MHz"), Pair("Cell Identity", "27447297"),
                          Pair("Tracking Area Code", "12345"), Pair("Freq Band Indicator", "3")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info")));
}

TEST_F(LTEServingCellInfoTest, ReadsTheWidestValues) {
  decode(packet(0xB0C2).length(14).length(32, 0xFF).length(38));
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Physical Cell ID", "65535"), Pair("Download Frequency", "65535"),
                          Pair("Upload Frequency", "65535"), Pair("Download Bandwidth", "Unknown"),
                          Pair("Upload Bandwidth", "Unknown"), Pair("Cell Identity", "-1"),
                          Pair("Tracking Area Code", "65535"), Pair("Freq Band Indicator", "-1")));
}

TEST_F(LTEServingCellInfoTest, NeedsThirtyEightBytesOfSystemInformation) {
  decode(systemInformation().length(37));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info")));
}

TEST_F(LTEServingCellInfoTest, NamesEveryBandwidth) {
  const std::pair<unsigned, const char*> expected[] = {
      {0, "Unknown"},  {5, "Unknown"},  {6, "1.4 MHz"},  {7, "Unknown"},   {14, "Unknown"},
      {15, "3 MHz"},   {16, "Unknown"}, {24, "Unknown"}, {25, "5 MHz"},    {26, "Unknown"},
      {49, "Unknown"}, {50, "10 MHz"},  {51, "Unknown"}, {74, "Unknown"},  {75, "15 MHz"},
      {76, "Unknown"}, {99, "Unknown"}, {100, "20 MHz"}, {101, "Unknown"}, {255, "Unknown"}};
  for (const auto& [blocks, name] : expected) {
    decode(systemInformation().u8(20, blocks).u8(21, 6));
    EXPECT_EQ(text("Download Bandwidth"), name) << blocks;
    EXPECT_EQ(text("Upload Bandwidth"), "1.4 MHz");
    decode(systemInformation().u8(20, 100).u8(21, blocks));
    EXPECT_EQ(text("Download Bandwidth"), "20 MHz");
    EXPECT_EQ(text("Upload Bandwidth"), name) << blocks;
  }
}

TEST_F(LTEServingCellInfoTest, ShowsTheAntennasAndReportsThePacketAllTheSame) {
  decode(packet(0xB0C1).u8(20, 2).length(22));
  EXPECT_THAT(entries(), ElementsAre(Pair("Num Tx Antennas", "2")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info"),
                                       errorLine("Received an unknown log message: 45249")));
}

TEST_F(LTEServingCellInfoTest, NeedsTwentyTwoBytesOfAntennas) {
  decode(packet(0xB0C1).u8(20, 2).length(21));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info")));
}

TEST_F(LTEServingCellInfoTest, ShowsTheServingCellOfTheCellMonitor) {
  decodeList(kCellMonitorCode, Array{servingCell()});
  EXPECT_THAT(entries(), ElementsAre(Pair("Tracking Area Code", "7"), Pair("Cell Identity", "2"),
                                     Pair("Physical Cell ID", "40"),
                                     Pair("Freq Band Indicator", "20"), Pair("UARFCN", "1850")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info")));
}

TEST_F(LTEServingCellInfoTest, SystemInformationTakesTheChannelOfTheCellMonitorAway) {
  decodeList(kCellMonitorCode, Array{servingCell()});
  decode(systemInformation());
  EXPECT_THAT(keysOf(section()),
              ElementsAre("Tracking Area Code", "Cell Identity", "Physical Cell ID",
                          "Freq Band Indicator", "Download Frequency", "Upload Frequency",
                          "Download Bandwidth", "Upload Bandwidth"));
  EXPECT_EQ(text("Download Frequency"), "1300");
}

TEST_F(LTEServingCellInfoTest, KeysOfBothSourcesStandSideBySide) {
  decode(packet(0xB0C1).u8(20, 4).length(22));
  decode(systemInformation());
  decodeList(kCellMonitorCode, Array{servingCell()});
  EXPECT_EQ(text("Num Tx Antennas"), "4");
  EXPECT_EQ(text("Upload Frequency"), "19300");
  EXPECT_EQ(text("UARFCN"), "1850");
  EXPECT_EQ(text("Tracking Area Code"), "7");
}

TEST_F(LTEServingCellInfoTest, ReportsEveryValueThatItMisses) {
  decode(systemInformation());
  takeLines();
  Dictionary cell = servingCell();
  for (const char* key : {"kTqCellMonitorTAC", "kTqCellMonitorCellId", "kTqCellMonitorPID",
                          "kTqCellMonitorBandInfo", "kTqCellMonitorUARFCN"}) {
    cell.remove(key);
  }
  decodeList(kCellMonitorCode, Array{cell});
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info"),
                                       failedToRetrieve("Serving Cell Info", "TAC"),
                                       failedToRetrieve("Serving Cell Info", "Cell ID"),
                                       failedToRetrieve("Serving Cell Info", "Physical Cell ID"),
                                       failedToRetrieve("Serving Cell Info", "Freq Band Indicator"),
                                       failedToRetrieve("Serving Cell Info", "UARFCN")));
  EXPECT_EQ(text("Tracking Area Code"), "12345");
}

TEST_F(LTEServingCellInfoTest, GoesOnAfterAValueThatItMisses) {
  Dictionary cell = servingCell();
  cell.set("kTqCellMonitorCellId", "2");
  decodeList(kCellMonitorCode, Array{cell});
  EXPECT_THAT(keysOf(section()), ElementsAre("Tracking Area Code", "Physical Cell ID",
                                             "Freq Band Indicator", "UARFCN"));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info"),
                                       failedToRetrieve("Serving Cell Info", "Cell ID")));
}

TEST_F(LTEServingCellInfoTest, TakesTheFirstServingCell) {
  Dictionary second = servingCell();
  second.set("kTqCellMonitorTAC", Value::integer(8));
  Dictionary neighbor = servingCell();
  neighbor.set("kTqCellMonitorCellType", "kTqCellMonitorCellTypeNeighbor");
  Dictionary other = servingCell();
  other.set("kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyGSM");
  decodeList(kCellMonitorCode, Array{neighbor, other, servingCell(), second});
  EXPECT_EQ(text("Tracking Area Code"), "7");
}

TEST_F(LTEServingCellInfoTest, IsSilentWithoutAServingCell) {
  Dictionary neighbor = servingCell();
  neighbor.set("kTqCellMonitorCellType", "kTqCellMonitorCellTypeNeighbor");
  Dictionary untyped = servingCell();
  untyped.remove("kTqCellMonitorCellType");
  decodeList(kCellMonitorCode, Array{neighbor, untyped});
  decodeList(kCellMonitorCode, Array{});
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info"),
                                       warningLine("LTE Serving Cell Info")));
}

TEST_F(LTEServingCellInfoTest, ReportsAPayloadThatIsNoPropertyList) {
  decode(packet(kCellMonitorCode).append(Bytes{'x', 'y', 'z'}));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info"),
                                       errorLine("Cell Info Array data could not be constructed"),
                                       errorLine("Failed to get Cell Array\n")));
}

TEST_F(LTEServingCellInfoTest, ReportsARootThatIsNoArray) {
  decodeList(kCellMonitorCode, servingCell());
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info"),
                                       errorLine("Failed to get Cell Array\n")));
}

TEST_F(LTEServingCellInfoTest, APacketOfNoMoreThanTheHeaderCarriesNoList) {
  for (const std::size_t size : {11U, 12U, 13U}) {
    decode(packet(kCellMonitorCode).length(size));
    EXPECT_THAT(takeLines(), ElementsAre(warningLine("LTE Serving Cell Info"),
                                         errorLine("Cell Info Array data could not be constructed"),
                                         errorLine("Failed to get Cell Array\n")));
  }
}

}  // namespace
}  // namespace kestro::testing
