// SPDX-License-Identifier: MIT
// Drive-test rows on the LTE channel, as its receiver shows them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "LogGenerator/Packets/PacketHeader.h"
#include "Platform/TelephonyService.h"
#include "Sources/LTE/LTEDriveTest.h"
#include "Tests/Support/DisplayReader.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

const std::string kLTEColumns =
    "Timestamp,NetworkMode,RSRP,RSRQ,RSSI,LACHEX,RAWCELLID,NRxRSRP,NRxRSRQ\n";

class LTEDriveTestTest : public ::testing::Test {
 protected:
  /// Shows every row of a log; the codes that the last one sent.
  void show(const std::string& rows) {
    auto log = DriveTestLog::open(_directory.write("log.csv", kLTEColumns + rows));
    ASSERT_TRUE(log.has_value()) << log.error().message;
    for (auto row = log->next(); row->has_value(); row = log->next()) {
      codes.clear();
      for (const Bytes& packet : _encoder.messages(**row)) {
        codes.push_back(logCodeOf(PacketView(packet)));
        display.receive(packet);
      }
    }
  }

  TemporaryDirectory _directory;
  testing::DisplayReader display{kTqLogChannelTechnology_Ondrel_LTE};
  LTEDriveTestEncoder _encoder{display.coding()};
  std::vector<LogCode> codes;
};

TEST_F(LTEDriveTestTest, ShowsTheLogsOwnNumbers) {
  show("2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,87966209,-95.0,-16.0\n");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRP"), "-90.00 dBm");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRQ"), "-7.00 dB");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSSI"), "-72.00 dBm");
  EXPECT_EQ(display.text("Serving Cell Info", "Cell Identity"), "87966209");
  EXPECT_EQ(display.text("Serving Cell Info", "Tracking Area Code"), "40122");  // 0x9CBA
  EXPECT_EQ(display.text("Serving Cell Info", "Physical Cell ID"), "65");       // modulo 504
  EXPECT_EQ(display.text("Serving Cell Measurements", "Physical Cell ID"), "65");
}

TEST_F(LTEDriveTestTest, ShowsTheNeighbourInBothLists) {
  show("2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,87966209,-95.0,-16.0\n");
  const Dictionary measured = display.row("Measured Neighbor Cells", 0);
  EXPECT_EQ(measured["Physical Cell ID"], Value("66"));
  EXPECT_EQ(measured["Filtered RSRP"], Value("-95.00 dBm"));
  EXPECT_EQ(measured["Filtered RSRQ"], Value("-16.00 dB"));
  EXPECT_EQ(display.row("Neighbor Cells List", 0)["Measured RSRP"], Value("-95.00 dBm"));
}

TEST_F(LTEDriveTestTest, FollowsTheRows) {
  show(
      "2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,87966209,-95.0,-16.0\n"
      "2020.01.02_03.04.06,5G,-101,-12,-80,9CBB,87966210,-99.5,-18.0\n");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRP"), "-101.00 dBm");
  EXPECT_EQ(display.text("Serving Cell Info", "Cell Identity"), "87966210");
  EXPECT_EQ(display.text("Serving Cell Info", "Tracking Area Code"), "40123");
  EXPECT_EQ(display.row("Neighbor Cells List", 0)["Measured RSRP"], Value("-99.50 dBm"));
}

TEST_F(LTEDriveTestTest, SendsFilesAndContextsOnce) {
  show("2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,87966209,-,-\n");
  EXPECT_THAT(codes, ElementsAre(0xB0C2, 0xB0C1, 0xFF0001, 0xFF0000, 0xFF0002, 0xB17F, 0xB179));
  show("2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,87966209,-95,-16\n");
  EXPECT_THAT(codes, ElementsAre(0xB0C2, 0xB0C1, 0xFF0001, 0xB17F, 0xB179, 0xB180));
}

TEST_F(LTEDriveTestTest, MakesUpTheRssiOfALogThatHasHadNone) {
  show("2020.01.02_03.04.05,LTE,-90,-7,-,9CBA,87966209,-,-\n");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRP"), "-90.00 dBm");
  // -90 + 7 + 7.8 = -75.2, to the next half dBm
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSSI"), "-75.00 dBm");
  show("2020.01.02_03.04.06,LTE,-90,-7,-72,9CBA,87966209,-,-\n");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSSI"), "-72.00 dBm");
}

TEST_F(LTEDriveTestTest, ARssiThatTheLogHasHadStays) {
  show(
      "2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,87966209,-,-\n"
      "2020.01.02_03.04.06,LTE,-100,-9,-,9CBA,87966209,-,-\n");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRP"), "-100.00 dBm");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSSI"), "-72.00 dBm");
}

TEST_F(LTEDriveTestTest, SendsNoPacketOneOfWhoseValuesTheLogHasNotHadYet) {
  show("2020.01.02_03.04.05,LTE,-90,-,-72,9CBA,87966209,-,-\n");
  EXPECT_THAT(codes, ElementsAre(0xB0C2, 0xB0C1, 0xFF0001, 0xFF0000, 0xFF0002));
}

TEST_F(LTEDriveTestTest, SendsNothingOfACellWithoutItsIdentity) {
  show("2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,-,-95.0,-16.0\n");
  EXPECT_THAT(codes, ElementsAre(0xFF0000, 0xFF0002));
}

TEST_F(LTEDriveTestTest, KeepsTheLastValueForADash) {
  show(
      "2020.01.02_03.04.05,LTE,-90,-7,-72,9CBA,87966209,-95.0,-16.0\n"
      "2020.01.02_03.04.06,LTE,-91,-,-,-,-,-,-\n");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRP"), "-91.00 dBm");
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRQ"), "-7.00 dB");
  EXPECT_EQ(display.text("Serving Cell Info", "Cell Identity"), "87966209");
}

TEST_F(LTEDriveTestTest, LeavesOutAPacketThatCannotCarryItsValue) {
  show("2020.01.02_03.04.05,LTE,-190,-7,-72,9CBA,87966209,-95.0,-16.0\n");
  EXPECT_EQ(_encoder.leftOutCount(), 2U);  // what would say the serving cell's level
  EXPECT_EQ(display.text("Serving Cell Measurements", "Measured RSRP"), "(none)");
  EXPECT_EQ(display.text("Serving Cell Info", "Cell Identity"), "87966209");
}

TEST_F(LTEDriveTestTest, SendsNothingForRowsOfOtherTechnologies) {
  show("2020.01.02_03.04.05,HSPA+,-90,-7,-72,9CBA,87966209,-,-\n");
  EXPECT_THAT(codes, IsEmpty());
}

}  // namespace
}  // namespace kestro
