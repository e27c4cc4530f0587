// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/ServingCellInfo.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;

class UTRANServingCellInfoTest : public DecoderFixture<UTRANServingCellInfo> {
 protected:
  static PacketBytes systemInformation() {
    return packet(0xD0E2)
        .u8(14, 17)
        .u8(15, 200)
        .u16(17, 9700)
        .u16(19, 10650)
        .u32(21, 268435455)
        .u8(25, 0);
  }

  static Dictionary servingCell(std::int64_t cellId) {
    return {
        {"kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyUTRAN2"},
        {"kTqCellMonitorCellType", "kTqCellMonitorCellTypeServing"},
        {"kTqCellMonitorUARFCN", Value::integer(10054)},
        {"kTqCellMonitorSCN", Value::integer(77)},
        {"kTqCellMonitorBandInfo", Value::integer(1)},
        {"kTqCellMonitorCellId", Value::integer(cellId)},
        {"kTqCellMonitorLAC", Value::integer(4321)}};
  }
};

TEST_F(UTRANServingCellInfoTest, ShowsTheSystemInformation) {
  decode(systemInformation());
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Cell Access Restrictions", "17"), Pair("Cell ID", "268435455"),
                          Pair("Downlink UARFCN", "10650"), Pair("Uplink UARFCN", "9700"),
                          Pair("URA ID", "200"), Pair("Allowed Access", "All Calls")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Info")));
}

TEST_F(UTRANServingCellInfoTest, ReadsTheWidestValues) {
  decode(packet(0xD0E2).length(26, 0xFF));
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Cell Access Restrictions", "255"), Pair("Cell ID", "-1"),
                          Pair("Downlink UARFCN", "65535"), Pair("Uplink UARFCN", "65535"),
                          Pair("URA ID", "255"), Pair("Allowed Access", "Emergency Calls Only")));
}

TEST_F(UTRANServingCellInfoTest, ReadsTheAllowedAccessFromTheLowestBit) {
  const std::pair<unsigned, const char*> expected[] = {{0x00, "All Calls"},
                                                       {0x01, "Emergency Calls Only"},
                                                       {0x02, "All Calls"},
                                                       {0x03, "Emergency Calls Only"},
                                                       {0xFE, "All Calls"}};
  for (const auto& [byte, name] : expected) {
    decode(systemInformation().u8(25, byte));
    EXPECT_EQ(text("Allowed Access"), name) << byte;
  }
}

TEST_F(UTRANServingCellInfoTest, NeedsTwentySixBytesOfSystemInformation) {
  decode(systemInformation().length(25));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Info")));
}

TEST_F(UTRANServingCellInfoTest, ShowsTheServingCellOfTheCellMonitor) {
  decodeList(kCellMonitorCode, Array{servingCell(5)});
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Local Area Code", "4321"), Pair("Cell ID", "5"),
                          Pair("Freq Band Indicator", "1"), Pair("Cell Scrambling Code", "77"),
                          Pair("Uplink UARFCN", "10054"), Pair("Downlink UARFCN", "10054")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Info")));
}

TEST_F(UTRANServingCellInfoTest, TheLastOfSeveralServingCellsRemains) {
  Dictionary second = servingCell(6);
  second.remove("kTqCellMonitorLAC");
  second.set("kTqCellMonitorSCN", Value::integer(78));
  decodeList(kCellMonitorCode, Array{servingCell(5), second});
  EXPECT_EQ(text("Cell ID"), "6");
  EXPECT_EQ(text("Cell Scrambling Code"), "78");
  EXPECT_EQ(text("Local Area Code"), "4321");
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Info"),
                                       failedToRetrieve("Serving Cell Info", "LAC")));
}

TEST_F(UTRANServingCellInfoTest, IgnoresCellsOfAnotherKind) {
  Dictionary neighbor = servingCell(5);
  neighbor.set("kTqCellMonitorCellType", "kTqCellMonitorCellTypeNeighbor");
  Dictionary other = servingCell(5);
  other.set("kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyUMTS");
  Dictionary withoutType = servingCell(5);
  withoutType.remove("kTqCellMonitorCellType");
  Dictionary withoutTechnology = servingCell(5);
  withoutTechnology.remove("kTqCellMonitorCellRadioAccessTechnology");
  decodeList(kCellMonitorCode, Array{neighbor, other, withoutType, withoutTechnology, "no cell"});
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Info")));
}

TEST_F(UTRANServingCellInfoTest, ReportsEveryValueThatItMisses) {
  decode(systemInformation());
  takeLines();
  decodeList(kCellMonitorCode,
             Array{Dictionary{{"kTqCellMonitorCellRadioAccessTechnology",
                               "kTqCellMonitorRadioAccessTechnologyUTRAN2"},
                              {"kTqCellMonitorCellType", "kTqCellMonitorCellTypeServing"},
                              {"kTqCellMonitorLAC", "7"},
                              {"kTqCellMonitorSCN", Value::real(1.5)}}});
  EXPECT_THAT(
      takeLines(),
      ElementsAre(warningLine("Serving Cell Info"), failedToRetrieve("Serving Cell Info", "LAC"),
                  failedToRetrieve("Serving Cell Info", "Cell ID"),
                  failedToRetrieve("Serving Cell Info", "Freq Band Indicator"),
                  failedToRetrieve("Serving Cell Info", "Cell Scrambling Code"),
                  failedToRetrieve("Serving Cell Info", "UARFCN")));
  EXPECT_EQ(text("Cell ID"), "268435455");
  EXPECT_EQ(text("Uplink UARFCN"), "9700");
  EXPECT_FALSE(section().contains("Local Area Code"));
}

TEST_F(UTRANServingCellInfoTest, ShowsTheLowThirtyTwoBitsOfANumberSigned) {
  decodeList(kCellMonitorCode, Array{servingCell(4294967295)});
  EXPECT_EQ(text("Cell ID"), "-1");
}

TEST_F(UTRANServingCellInfoTest, TheLaterSourceWins) {
  decode(systemInformation());
  decodeList(kCellMonitorCode, Array{servingCell(5)});
  EXPECT_EQ(text("Cell ID"), "5");
  EXPECT_EQ(text("Downlink UARFCN"), "10054");
  EXPECT_EQ(text("URA ID"), "200");
  decode(systemInformation());
  EXPECT_EQ(text("Cell ID"), "268435455");
  EXPECT_EQ(text("Downlink UARFCN"), "10650");
  EXPECT_EQ(text("Local Area Code"), "4321");
}

TEST_F(UTRANServingCellInfoTest, ReportsAPayloadThatIsNoPropertyList) {
  decode(packet(kCellMonitorCode).length(20, 0x55));
  decode(packet(kCellMonitorCode));
  const Line unparsable = errorLine("Cell Info Array data could not be constructed");
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Info"), unparsable,
                                       warningLine("Serving Cell Info"), unparsable));
  EXPECT_THAT(entries(), IsEmpty());
}

TEST_F(UTRANServingCellInfoTest, PassesOverAnEmptyListAndOverARootThatIsNone) {
  decodeList(kCellMonitorCode, Array{});
  decodeList(kCellMonitorCode, servingCell(5));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("Serving Cell Info"), warningLine("Serving Cell Info")));
}

}  // namespace
}  // namespace kestro::testing
