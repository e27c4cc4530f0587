// SPDX-License-Identifier: MIT
// Drives through LTE cells, packet by packet.
#include "Platform/TelephonyService.h"
#include "Tests/Measurements/DriveFixture.h"
#include "Tests/Measurements/LTEPackets.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class LTEDriveTest : public DriveFixture {
 protected:
  LTEDriveTest() : DriveFixture(kTqLogChannelTechnology_Ondrel_LTE) {}
};

TEST_F(LTEDriveTest, AnotherServingCellIsAReselectionWhereNothingSaysThatThePhoneIsConnected) {
  at(0).take(lteCell(700, 14)).take(lteServing(14, -100));
  at(1'000).take(lteCell(700, 14));
  at(1'500).take(lteCell(800, 15));
  EXPECT_THAT(lines, ElementsAre("1.5 reselection LTE: 700 -> 800"));
  EXPECT_EQ(events[0].toldBy, "0xB0C2");
  EXPECT_EQ(events[0].connectedBy, "");
  EXPECT_EQ(events[0].message, 4u);
  EXPECT_EQ(events[0].fromLevel, -100);
  EXPECT_EQ(events[0].toLevel, std::nullopt);
}

TEST_F(LTEDriveTest, ItIsAHandoverWithinASecondOfTheConnectedModesMeasurement) {
  at(0).take(lteCell(700, 14));
  at(500).take(lteConnected(14, -100, 15, -97));
  at(1'500).take(lteCell(800, 15));
  EXPECT_THAT(lines, ElementsAre("1.5 handover LTE: 700 -> 800"));
  EXPECT_EQ(events[0].connectedBy, "0xB179");
  EXPECT_EQ(events[0].fromLevel, -100);
  EXPECT_EQ(events[0].toLevel, -97);  // when it was known by its pair only
}

TEST_F(LTEDriveTest, MoreThanASecondAfterItItIsAReselection) {
  at(0).take(lteCell(700, 14));
  at(499).take(lteConnected(14, -100, 15, -97));
  at(1'500).take(lteCell(800, 15));
  EXPECT_THAT(lines, ElementsAre("1.5 reselection LTE: 700 -> 800"));
}

TEST_F(LTEDriveTest, PingPongIsToldBothWays) {
  at(0).take(lteCell(700, 14));
  at(1'000).take(lteConnected(14, -100, 15, -97)).take(lteCell(800, 15));
  at(2'000).take(lteConnected(15, -100, 14, -97)).take(lteCell(700, 14));
  EXPECT_THAT(lines, ElementsAre("1 handover LTE: 700 -> 800", "2 handover LTE: 800 -> 700"));
  EXPECT_EQ(events[1].toLevel, -97);  // measured as a neighbour just before
}

TEST_F(LTEDriveTest, ALateMeasurementOfTheOldCellMakesNoPingPongButIsItsLevel) {
  at(0).take(lteCell(700, 14)).take(lteServing(14, -100));
  at(1'000).take(lteCell(800, 15)).take(lteServing(14, -104)).take(lteServing(15, -90));
  at(2'999).take(lteServing(14, -105));
  EXPECT_THAT(lines, ElementsAre("1 reselection LTE: 700 -> 800"));
  EXPECT_EQ(cell("700")->level.last(), -105);
  EXPECT_EQ(cell("700")->level.count(), 3u);
  EXPECT_EQ(cell("800")->level.last(), -90);
}

TEST_F(LTEDriveTest, TheMeasurementDecidesTwoSecondsAfterTheLastSystemInformation) {
  at(0).take(lteCell(800, 15));
  at(1'000).take(lteCell(700, 14));
  at(2'999).take(lteServing(15, -90));
  EXPECT_THAT(lines, ElementsAre("1 reselection LTE: 800 -> 700"));
  at(3'000).take(lteServing(15, -90));
  EXPECT_THAT(lines, ElementsAre("1 reselection LTE: 800 -> 700", "3 reselection LTE: 700 -> 800"));
  EXPECT_EQ(events[1].toldBy, "0xB17F");
  // The system information that follows names the same cell.
  at(3'500).take(lteCell(800, 15));
  EXPECT_EQ(lines.size(), 2u);
}

TEST_F(LTEDriveTest, ACellThatBecomesKnownWhileItServesIsNoChange) {
  at(0).take(lteServing(15, -90));
  at(2'000).take(lteServing(15, -90));
  EXPECT_THAT(cellNames(), ElementsAre("1300/15"));
  at(2'500).take(lteCell(800, 15)).take(lteServing(15, -91));
  EXPECT_THAT(lines, IsEmpty());
  EXPECT_THAT(cellNames(), ElementsAre("1300/15", "800"));
  EXPECT_EQ(cell("800")->level.last(), -91);
}

TEST_F(LTEDriveTest, ANeighbourTakesTheIdentityLastSeenForItsPair) {
  at(0).take(lteCell(700, 14));
  at(1'000).take(lteCell(800, 15));
  at(2'000).take(lteNeighbour(14, -110));
  EXPECT_THAT(cellNames(), ElementsAre("700", "800"));
  EXPECT_TRUE(cell("700")->isAssumed);
  EXPECT_FALSE(cell("800")->isAssumed);
  EXPECT_EQ(cell("700")->level.last(), -110);
  ASSERT_EQ(watch->cellValues().size(), 2u);
  EXPECT_TRUE(watch->cellValues()[0].isAssumed);
  EXPECT_FALSE(watch->cellValues()[0].isServing);
  EXPECT_TRUE(watch->cellValues()[1].isQuality);
}

TEST_F(LTEDriveTest, AnIdentityIsAssumedForTenMinutes) {
  at(0).take(lteCell(700, 14)).take(lteCell(800, 15));
  at(600'000).take(lteNeighbour(14, -110));
  EXPECT_THAT(cellNames(), ElementsAre("700", "800"));
  at(600'001).take(lteNeighbour(14, -110));
  EXPECT_THAT(cellNames(), ElementsAre("700", "800", "1300/14"));
}

TEST_F(LTEDriveTest, TheIdentitySeenLastForAPairCounts) {
  at(0).take(lteCell(700, 14)).take(lteCell(900, 14)).take(lteCell(800, 15));
  at(1'000).take(lteNeighbour(14, -110));
  EXPECT_EQ(cell("700")->level.count(), 0u);
  EXPECT_EQ(cell("900")->level.count(), 1u);
}

TEST_F(LTEDriveTest, TwoIdentitiesWithOnePairAreTwoCells) {
  at(0).take(lteCell(700, 14));
  at(1'000).take(lteCell(900, 14));
  EXPECT_THAT(lines, ElementsAre("1 reselection LTE: 700 -> 900"));
}

TEST_F(LTEDriveTest, LevelsOfTheLastTenSecondsAreToldWithAChange) {
  at(0).take(lteCell(700, 14)).take(lteServing(14, -100));
  at(10'000).take(lteCell(800, 15)).take(lteServing(15, -90));
  EXPECT_EQ(events.back().fromLevel, -100);
  at(20'001).take(lteCell(700, 14));
  EXPECT_EQ(events.back().to, "700");
  EXPECT_EQ(events.back().fromLevel, std::nullopt);
}

TEST_F(LTEDriveTest, AnUnknownNeighbourBecomesKnownWhenItServes) {
  at(0).take(lteCell(700, 14)).take(lteConnected(14, -90, 15, -95));
  EXPECT_THAT(cellNames(), ElementsAre("700", "1300/15"));
  at(1'000).take(lteCell(800, 15));
  at(2'000).take(lteCell(700, 14)).take(lteNeighbour(15, -96));
  EXPECT_THAT(cellNames(), ElementsAre("700", "1300/15", "800"));
  EXPECT_EQ(cell("1300/15")->level.count(), 1u);
  EXPECT_EQ(cell("800")->level.last(), -96);
  EXPECT_TRUE(cell("800")->isAssumed);
}

TEST_F(LTEDriveTest, ANeighbourThatIsTheServingCellIsNotAssumed) {
  at(0).take(lteCell(700, 14)).take(lteNeighbour(14, -96));
  EXPECT_FALSE(cell("700")->isAssumed);
  EXPECT_TRUE(watch->cellValues()[0].isServing);
}

TEST_F(LTEDriveTest, ACellHasItsChannelAreaBandAndLevels) {
  at(0).take(lteCell(1049603, 14, 601)).take(lteServing(14, -100, -12));
  at(1'000).take(lteServing(14, -90, -9));
  at(2'000).take(lteServing(14, -95, -10));
  const Cell& row = *cell("1049603");
  EXPECT_EQ(row.channel, 1300u);
  EXPECT_EQ(row.physical, 14u);
  EXPECT_EQ(row.area, 601u);
  EXPECT_EQ(row.band(), (ChannelBand{.band = "3", .downlinkKHz = 1'815'000}));
  EXPECT_EQ(row.baseStation(), 4100u);  // 1049603 = 256 x 4100 + 3
  EXPECT_EQ(row.sector(), 3u);
  EXPECT_EQ(row.level.last(), -95);
  EXPECT_EQ(row.level.least(), -100);
  EXPECT_EQ(row.level.median(), -95);
  EXPECT_EQ(row.level.greatest(), -90);
  EXPECT_EQ(row.quality.median(), -10);
  EXPECT_EQ(row.firstSeen, kBegin);
  EXPECT_EQ(row.lastSeen, kBegin + std::chrono::seconds(2));
}

TEST_F(LTEDriveTest, TimeServingIsThatBetweenMessagesSaveSilence) {
  using std::chrono::seconds;
  at(0).take(lteCell(700, 14));
  at(4'000).take(lteCell(700, 14));
  at(6'000).take(lteCell(800, 15));
  at(16'000).take(lteCell(800, 15));
  at(17'000).take(lteCell(800, 15));
  EXPECT_EQ(cell("700")->served, seconds(6));
  EXPECT_EQ(cell("800")->served, seconds(1));
}

TEST_F(LTEDriveTest, MessagesThatAreMissingForFiveSecondsAreToldWhenTheyAreBack) {
  at(0).take(lteCell(700, 14));
  at(4'999).take(lteCell(700, 14));
  EXPECT_THAT(lines, IsEmpty());
  at(9'999).take(lteCell(700, 14));
  EXPECT_THAT(lines, ElementsAre("9.999 messages-missing LTE:", "9.999 messages-back LTE:"));
  at(20'000).take(lteCell(700, 14));
  EXPECT_EQ(lines[2], "14.999 messages-missing LTE:");
  EXPECT_EQ(lines[3], "20 messages-back LTE:");
  EXPECT_EQ(events[2].message, 3u);
  EXPECT_EQ(events[3].message, 4u);
  EXPECT_EQ(events[3].duration, std::chrono::milliseconds(10'001));
}

TEST_F(LTEDriveTest, OfADriveThatIsGoingOnMissingMessagesAreToldAtOnce) {
  using std::chrono::milliseconds;
  at(0).take(lteCell(700, 14));
  watch->passTime(kBegin + milliseconds(4'999));
  EXPECT_THAT(lines, IsEmpty());
  watch->passTime(kBegin + milliseconds(5'500));
  watch->passTime(kBegin + milliseconds(6'500));
  EXPECT_THAT(lines, ElementsAre("5 messages-missing LTE:"));
  at(8'000).take(lteCell(700, 14));
  EXPECT_THAT(lines, ElementsAre("5 messages-missing LTE:", "8 messages-back LTE:"));
}

TEST_F(LTEDriveTest, AnotherTrackingAreaIsToldWithTheCellThatHasIt) {
  at(0).take(lteCell(700, 14, 601));
  at(1'000).take(lteCell(800, 15, 602));
  EXPECT_THAT(lines,
              ElementsAre("1 reselection LTE: 700 -> 800", "1 area LTE: tracking area 601 -> 602"));
  EXPECT_EQ(cell("700")->area, 601u);
  EXPECT_EQ(cell("800")->area, 602u);
}

TEST_F(LTEDriveTest, OfADriveTestLogOnlyTheLogsOwnValuesCount) {
  isFromDriveTest = true;
  at(0).take(lteCell(700, 14)).take(lteServing(14, -90)).take(lteConnected(14, -91, 15, -95));
  at(500).take(lteNeighbour(15, -95)).take(lteCell(800, 15)).take(lteServing(15, -99));
  EXPECT_THAT(lines, ElementsAre("0.5 reselection LTE: 700 -> 800"));
  EXPECT_THAT(cellNames(), ElementsAre("700", "800"));
  EXPECT_EQ(cell("700")->channel, std::nullopt);
  EXPECT_EQ(cell("700")->physical, std::nullopt);
  EXPECT_EQ(cell("700")->band(), ChannelBand{});
  EXPECT_EQ(cell("700")->area, 601u);
  EXPECT_EQ(cell("700")->level.last(), -91);
  EXPECT_EQ(cell("800")->level.last(), -99);
}

TEST_F(LTEDriveTest, MoreThanTheMostCellsAreCountedNotKept) {
  for (unsigned i = 0; i <= Cells::kMaximumCells; ++i) take(lteCell(i, 14));
  EXPECT_EQ(watch->cells().all().size(), Cells::kMaximumCells);
  EXPECT_GE(watch->cells().notKeptCount(), 1u);
  EXPECT_EQ(lines.back(), "0 reselection LTE: 9999 -> 10000");
  take(lteServing(14, -90));
  EXPECT_THAT(watch->cellValues(), IsEmpty());
}

TEST_F(LTEDriveTest, RulesAreBrokenAndKeptAgainByTheMessagesTimes) {
  watchWith("Measured RSRP < -110 dBm for 4 s");
  at(0).take(lteServing(14, -111));
  at(2'000).take(lteServing(14, -110));
  at(3'000).take(lteServing(14, -111));
  at(6'999).take(lteServing(14, -115));
  EXPECT_THAT(lines, IsEmpty());
  at(7'000).take(lteServing(14, -114));
  at(8'000).take(lteServing(14, -113));
  at(9'000).take(lteServing(14, -100));
  EXPECT_THAT(lines, ElementsAre("7 alarm LTE: Serving Cell Measurements/Measured RSRP Measured "
                                 "RSRP < -110 dBm for 4 s",
                                 "9 alarm-over LTE: Serving Cell Measurements/Measured RSRP "
                                 "Measured RSRP < -110 dBm for 4 s"));
  EXPECT_EQ(events[0].toLevel, -114);
  EXPECT_EQ(events[1].duration, std::chrono::seconds(6));
}

TEST_F(LTEDriveTest, EachItemOfAListIsWatchedByItself) {
  watchWith("Neighbor Cells List/Measured RSRP < -110 for 2");
  at(0).take(lteNeighbour(14, -115)).take(lteNeighbour(15, -100));
  at(1'000).take(lteNeighbour(15, -115));
  at(2'000).take(lteNeighbour(14, -115)).take(lteNeighbour(15, -115));
  EXPECT_THAT(lines, ElementsAre("2 alarm LTE: Neighbor Cells List/Measured RSRP [1300/14] "
                                 "Neighbor Cells List/Measured RSRP < -110 for 2"));
  EXPECT_TRUE(watch->alarms().hasMet(0));
}

TEST_F(LTEDriveTest, ARuleWithAnotherUnitOrNameMeetsNothing) {
  watchWith("Measured RSRP < 0 dB\nRSRP < 0");
  at(0).take(lteServing(14, -115));
  EXPECT_THAT(lines, IsEmpty());
  EXPECT_FALSE(watch->alarms().hasMet(0));
  EXPECT_FALSE(watch->alarms().hasMet(1));
}

TEST_F(LTEDriveTest, WhatIsMadeUpInADriveTestLogBreaksNoRule) {
  watchWith("E-ARFCN == 1300\nMeasured RSRP < -110");
  isFromDriveTest = true;
  at(0).take(lteServing(14, -115));
  ASSERT_EQ(events.size(), 1u);
  EXPECT_EQ(events[0].to, "Measured RSRP < -110");
  EXPECT_FALSE(watch->alarms().hasMet(0));
  isFromDriveTest = false;
  take(lteServing(14, -115));
  EXPECT_TRUE(watch->alarms().hasMet(0));
}

TEST_F(LTEDriveTest, AClockThatIsSetBackBeginsARulesTimeAnew) {
  watchWith("Measured RSRP < -110 dBm for 4 s");
  at(100'000).take(lteServing(14, -111));
  at(1'000).take(lteServing(14, -111));
  at(4'999).take(lteServing(14, -111));
  EXPECT_THAT(lines, IsEmpty());
  at(5'000).take(lteServing(14, -111));
  EXPECT_THAT(lines, ElementsAre("5 alarm LTE: Serving Cell Measurements/Measured RSRP Measured "
                                 "RSRP < -110 dBm for 4 s"));
}

}  // namespace
}  // namespace kestro::testing
