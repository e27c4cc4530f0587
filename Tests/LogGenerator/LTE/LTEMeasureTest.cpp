// SPDX-License-Identifier: MIT
// What the LTE packets say as numbers.
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
using ::testing::SizeIs;

class LTEMeasureTest : public MeasureFixture {
 protected:
  LTEMeasureTest() : MeasureFixture(kTqLogChannelTechnology_Ondrel_LTE) {}
};

/// A serving cell on channel 1300, and one cell that was measured and one that was detected there.
PacketBytes intraFrequencyOfTwo() {
  return packet(0xB179)
      .u16(17, 1300)
      .u16(19, 301)
      .u16(21, 9876)
      .u16(23, 165)
      .u16(25, 83)
      .u8(27, 1)
      .u8(28, 1)
      .u16(29, 10)
      .u16(31, 160)
      .u16(33, 80)
      .u16(35, 503);
}

TEST_F(LTEMeasureTest, NumbersHaveTheUnitsOfTheirFormatsAndItemsTheirIdentity) {
  const std::string serving = "Connected mode LTE Intra-frequency Measurement/";
  // 165 / 4 - 140; 83 / 8 - 20, which is not rounded as the text is; 160 / 4 - 140; 80 / 8 - 20.
  EXPECT_THAT(
      lines(intraFrequencyOfTwo()),
      ElementsAre(serving + "E-ARFCN 1300|1300", serving + "Serving Physical Cell ID 301|301",
                  serving + "Subframe Number 9876|9876",
                  serving + "Serving Filtered RSRP -98.75 dBm|-98.75 dBm",
                  serving + "Serving Filtered RSRQ -9.625 dB|-9.62 dB",
                  "Measured Neighbor Cells/Physical Cell ID [1300/10] 10|10",
                  "Measured Neighbor Cells/Filtered RSRP [1300/10] -100 dBm|-100.00 dBm",
                  "Measured Neighbor Cells/Filtered RSRQ [1300/10] -10 dB|-10.00 dB",
                  "Detected Cells/Physical Cell ID [1300/503] 503|503"));
}

TEST_F(LTEMeasureTest, ASeriesIsTheSameFromPacketToPacketWhereverItsRowStands) {
  const auto two = packet(0xB179).u16(17, 1300).u8(27, 2).u16(29, 10).u16(35, 20).length(41);
  const auto turned = packet(0xB179).u16(17, 1300).u8(27, 2).u16(29, 20).u16(35, 10).length(41);
  std::ignore = lines(two);
  const std::size_t count = measurer.series().all().size();
  std::ignore = lines(turned);
  EXPECT_EQ(measurer.series().all().size(), count);
  EXPECT_THAT(lines(turned), Contains("Measured Neighbor Cells/Physical Cell ID [1300/10] 10|10"));
  // The same cell number on another channel is another cell.
  std::ignore = lines(PacketBytes(two).u16(17, 1850));
  EXPECT_EQ(measurer.series().all().size(), count + 6);
}

TEST_F(LTEMeasureTest, ACellThatAPacketListsTwiceIsTwoItems) {
  EXPECT_THAT(lines(packet(0xB179).u16(17, 5).u8(28, 3).u16(29, 7).u16(31, 7).u16(33, 7)),
              ::testing::IsSupersetOf({"Detected Cells/Physical Cell ID [5/7] 7|7",
                                       "Detected Cells/Physical Cell ID [5/7 #2] 7|7",
                                       "Detected Cells/Physical Cell ID [5/7 #3] 7|7"}));
}

TEST_F(LTEMeasureTest, NamesOfNumbersAreNumbersOthersAreStates) {
  const auto cell = packet(0xB0C2).u8(20, 100).u8(21, 7).length(38);
  EXPECT_THAT(lines(cell), Contains("Serving Cell Info/Download Bandwidth 20 MHz|20 MHz"));
  EXPECT_THAT(lines(cell), Not(Contains(HasSubstr("Upload Bandwidth"))));  // shown as "Unknown"
  EXPECT_THAT(lines(packet(0xB186).u16(19, 1).u16(23, 1).u16(25, 10700).u16(27, 5)),
              Contains("Reselection Candidates List/Candidate RAT Type [UTRAN/10700/5] 1|UTRAN"));
}

TEST_F(LTEMeasureTest, AValueThatThePacketSaysIsAbsentIsNone) {
  const auto present = packet(0xB17F).u32(25, 63U << 15).length(33);
  EXPECT_THAT(lines(present), Contains("Serving Cell Measurements/P_Max 33 dBm|33 dBm"));
  const auto absent = packet(0xB17F).u32(25, 64U << 15).length(33);
  EXPECT_THAT(lines(absent), Not(Contains(HasSubstr("P_Max"))));
}

TEST_F(LTEMeasureTest, ATooShortPacketSaysNothing) {
  EXPECT_THAT(lines(packet(0xB17F).length(32)), IsEmpty());
  EXPECT_THAT(lines(packet(0xB17F).length(33)), Not(IsEmpty()));
  EXPECT_THAT(lines(Bytes(12, 0xFF)), IsEmpty());
}

TEST_F(LTEMeasureTest, AWholeNumberIsWhatItsFormatShows) {
  // %d shows 32 bits as a signed number.
  EXPECT_THAT(lines(packet(0xB0C2).u32(22, 0xFFFFFFFF).length(38)),
              Contains("Serving Cell Info/Cell Identity -1|-1"));
}

TEST_F(LTEMeasureTest, ListedCellsAreMeasuredToo) {
  const Array cells = {
      Dictionary{{kTqCellMonitorCellRadioAccessTechnology, kTqCellMonitorRadioAccessTechnologyLTE},
                 {kTqCellMonitorCellType, kTqCellMonitorCellTypeServing},
                 {kTqCellMonitorCellId, Value::integer(1049603)},
                 {kTqCellMonitorTAC, "601"}}};
  EXPECT_THAT(linesOfList(kCellMonitorCode, cells),
              ElementsAre("Serving Cell Info/Cell Identity 1049603|1049603"));
}

TEST_F(LTEMeasureTest, SimFilesAndContextsAreTexts) {
  EXPECT_THAT(linesOfList(kSimFilesCode, Dictionary{{"kSimFile_ACC", "0008"}}),
              ElementsAre("SIM Info/EF-ACCESS CONTROL CLASS|0008"));
  EXPECT_THAT(linesOfList(kPacketDataContextsCode, Array{Dictionary{{"APN", "internet"}}}),
              ElementsAre("PDP Context Info/APN [#0]|internet"));
  EXPECT_THAT(lines(packet(kSimFilesCode).length(20)), IsEmpty());  // no property list
}

TEST_F(LTEMeasureTest, ASeriesKnowsItsPlaceInTheDisplay) {
  std::ignore = lines(intraFrequencyOfTwo());
  const auto& series = measurer.series().all();
  const auto isMeasuredRsrp = [](const Series& one) {
    return one.group->name() == "Measured Neighbor Cells/Filtered RSRP";
  };
  const auto found = std::ranges::find_if(series, isMeasuredRsrp);
  ASSERT_NE(found, series.end());
  EXPECT_THAT(found->group->path.container, ElementsAre("02;Neighbors", "Measured Neighbor Cells"));
  EXPECT_EQ(found->group->path.key, "Filtered RSRP");
  ASSERT_THAT(found->item->parts, SizeIs(2));
  EXPECT_EQ(found->item->parts[1].key, "Physical Cell ID");
  EXPECT_EQ(found->item->parts[1].text, "10");
}

TEST_F(LTEMeasureTest, SeriesEndWhereArbitraryPacketsNameTooManyCells) {
  for (unsigned channel = 0; channel < 65536; ++channel) {
    const auto cells = packet(0xB179).u16(17, channel).u8(28, 2).u16(29, 1).u16(31, 2);
    std::ignore = measurer.measure(kTqLogChannelTechnology_Ondrel_LTE, cells.bytes());
  }
  EXPECT_EQ(measurer.series().all().size(), SeriesTable::kMaximumSeries);
  // What is known is measured all the same.
  EXPECT_THAT(lines(packet(0xB179).u16(17, 1).u8(28, 1).u16(29, 1)),
              Contains("Detected Cells/Physical Cell ID [1/1] 1|1"));
  EXPECT_THAT(lines(packet(0xB179).u16(17, 65535).u8(28, 1).u16(29, 9)), SizeIs(5));
}

}  // namespace
}  // namespace kestro::testing
