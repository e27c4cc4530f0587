// SPDX-License-Identifier: MIT
// What the texts of the IFX channel say as numbers.
#include "Platform/TelephonyService.h"
#include "Tests/Support/MeasureFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class IFXMeasureTest : public MeasureFixture {
 protected:
  IFXMeasureTest() : MeasureFixture(kTqLogChannelTechnology_IFX) {}

  [[nodiscard]] std::vector<std::string> linesOf(const Dictionary& message) {
    return lines(*coding->binary(message));
  }
};

TEST_F(IFXMeasureTest, TextsAreNumbersWithUnitsElseTexts) {
  EXPECT_THAT(linesOf({{"_sorted", "yes"},
                       {"01;Quality", Dictionary{{"RSCP", "-93 dBm"}, {"State", "CELL_DCH"}}},
                       {"02;Cell", Dictionary{{"LAC (hex)", "1201"}, {"MNC", "01"}}}}),
              ElementsAre("Quality/RSCP -93 dBm|-93 dBm", "Quality/State|CELL_DCH",
                          "Cell/LAC (hex)|1201", "Cell/MNC 1|01"));
}

TEST_F(IFXMeasureTest, ARowIsWhatIdentifiesItsCell) {
  const Dictionary one = {{"PSC", "17"}, {"RSCP", "-80 dBm"}};
  const Dictionary other = {{"Rank", "1"}, {"RSRP", "-90 dBm"}};
  EXPECT_THAT(linesOf({{"Set", Array{"header", one, other}}, {"Empty", Array{"header"}}}),
              ElementsAre("Set/PSC [17] 17|17", "Set/RSCP [17] -80 dBm|-80 dBm",
                          "Set/Rank [#1] 1|1", "Set/RSRP [#1] -90 dBm|-90 dBm"));
}

TEST_F(IFXMeasureTest, AContainerWithOneValueIsThatValue) {
  EXPECT_THAT(linesOf({{"Mode", Dictionary{{"State", "5 dB"}}},
                       {"Set", Array{"header", Dictionary{{"RSCP", "-80 dBm"}}}}}),
              ElementsAre("Mode 5 dB|5 dB", "Set/Value [#0] -80 dBm|-80 dBm"));
}

TEST_F(IFXMeasureTest, AMessageThatTheDisplayRefusesSaysNothing) {
  EXPECT_THAT(linesOf({{"RSCP", "-93 dBm"}, {"Bad", Value::integer(1)}}), IsEmpty());
  EXPECT_THAT(lines(Bytes(20, 0x42)), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
