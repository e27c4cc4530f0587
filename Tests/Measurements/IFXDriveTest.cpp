// SPDX-License-Identifier: MIT
// Drives as IFX messages, which are property lists.
#include "Platform/TelephonyService.h"
#include "Tests/Measurements/DriveFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;

/// What a message's sections hold; one with a single entry would be shown as its value.
struct Shown {
  Dictionary mode{{"Radio Access", "UMTS"}, {"Bearer", "HSPA+"}};
  Dictionary serving;
  Dictionary quality;
};

class IFXDriveTest : public DriveFixture {
 public:
  IFXDriveTest() : DriveFixture(kTqLogChannelTechnology_IFX) {}

  DriveFixture& takeShown(const Shown& shown) {
    const Dictionary root{{"_sorted", "_sorted"},
                          {"01;Mode", shown.mode},
                          {"02;Serving Cell", shown.serving},
                          {"03;Radio Quality", shown.quality}};
    return takeBytes(*coding->binary(root));
  }
};

TEST_F(IFXDriveTest, TextsBecomeCells) {
  at(0).takeBytes({});
  takeShown({.serving = {{"MCC", "001"},
                         {"MNC", "01"},
                         {"LAC", "602"},
                         {"Cell ID", "20152"},
                         {"UARFCN", "10613"},
                         {"PSC", "381"}},
             .quality = {{"RSCP", "-89 dBm"}, {"Ec/N0", "-12.5 dB"}}});
  at(1'000);
  takeShown({.mode = {{"Radio Access", "GSM"}, {"Bearer", "EDGE"}},
             .serving = {{"LAC", "602"}, {"Cell ID", "1001"}, {"ARFCN", "42"}, {"BSIC", "2-5"}},
             .quality = {{"RxLev", "-80 dBm"}, {"RxQual", "0"}}});
  EXPECT_THAT(lines,
              ElementsAre("1 technology GSM: UMTS -> GSM", "1 reselection GSM: 20152 -> 1001"));
  EXPECT_EQ(events[0].toldBy, "message");
  const Cell& umts = *cell("20152");
  EXPECT_EQ(umts.channel, 10613u);
  EXPECT_EQ(umts.physical, 381u);
  EXPECT_EQ(umts.area, 602u);
  EXPECT_EQ(umts.network, "001-01");
  EXPECT_EQ(umts.level.last(), -89);
  EXPECT_EQ(umts.quality.last(), -12.5);
  EXPECT_EQ(cell("1001")->physical, 21u);  // 8 x 2 + 5
  EXPECT_EQ(cell("1001")->level.last(), -80);
}

TEST_F(IFXDriveTest, ADriveTestLogsIdentitiesAndAreasAreReadAsItWritesThem) {
  isFromDriveTest = true;
  Shown shown{.mode = {{"Network Mode", "LTE"}, {"State", "D"}},
              .serving = {{"Cell ID", "1"},
                          {"Cell ID (hex)", "1"},
                          {"eNodeB (hex)", "53E42"},
                          {"TAC (hex)", "9CBA"},
                          {"Whole Cell ID", "87966209"}},
              .quality = {{"Technology", "LTE"}, {"RSRP", "-90 dBm"}, {"RSRQ", "-7 dB"}}};
  at(0);
  takeShown(shown);
  shown.serving.set("Whole Cell ID", "795114");
  shown.serving.set("TAC (hex)", "53E4");
  at(1'000);
  takeShown(shown);
  EXPECT_THAT(lines, ElementsAre("1 reselection LTE: 87966209 -> 795114",
                                 "1 area LTE: tracking area 40122 -> 21476"));
  EXPECT_EQ(cell("87966209")->level.last(), -90);
}

}  // namespace
}  // namespace kestro::testing
