// SPDX-License-Identifier: MIT
// Drive-test rows on the GSM/UMTS channel, as its receiver shows them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Platform/TelephonyService.h"
#include "Sources/AutoDriveTest.h"
#include "Sources/GsmUmts/GsmUmtsDriveTest.h"
#include "Tests/Support/DisplayReader.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

const std::string kGsmUmtsColumns =
    "Timestamp,NetworkMode,RSRP,RSRQ,RSSI,CELLHEX,LACHEX,RAWCELLID\n";

class GsmUmtsDriveTestTest : public ::testing::Test {
 protected:
  void show(const std::string& rows) {
    auto log = DriveTestLog::open(_directory.write("log.csv", kGsmUmtsColumns + rows));
    ASSERT_TRUE(log.has_value()) << log.error().message;
    for (auto row = log->next(); row->has_value(); row = log->next()) {
      packets = _encoder.messages(**row);
      for (const Bytes& packet : packets) display.receive(packet);
    }
  }

  TemporaryDirectory _directory;
  testing::DisplayReader display{kTqLogChannelTechnology_Ondrel_GSM};
  GsmUmtsDriveTestEncoder _encoder{display.coding()};
  std::vector<Bytes> packets;
};

TEST_F(GsmUmtsDriveTestTest, ShowsAUMTSRowInTheActiveSet) {
  show("2020.01.02_03.04.05,HSPA+,-89,-7,-82,1234,9CBA,1000\n");
  const Dictionary cell = display.row("Active Set", 0);
  EXPECT_EQ(cell["Scrambling Code"], Value("488"));  // 1000 modulo 512
  EXPECT_EQ(cell["RSCP"], Value("-89 dB"));
  EXPECT_EQ(cell["Energy Per Chip"], Value("-7 dB"));
  EXPECT_EQ(display.text("Serving PLMN", "Location Area Code"), "40122");  // 0x9CBA
}

TEST_F(GsmUmtsDriveTestTest, ShowsAGSMRowAsTheServingCell) {
  show("2020.01.02_03.04.05,EDGE,-75,-,-,1234,9CBA,1000\n");
  EXPECT_EQ(display.text("GSM Serving Cell", "Cell ID"), "4660");  // 0x1234
  EXPECT_EQ(display.text("GSM Serving Cell", "RSSI"), "35 dBm");   // -75 + 110
  EXPECT_EQ(display.text("GSM RR Info", "RR State"), "RR_IDLE");
}

TEST_F(GsmUmtsDriveTestTest, ClampsTheGSMLevel) {
  show("2020.01.02_03.04.05,GPRS,-120,-,-,1234,9CBA,1000\n");
  EXPECT_EQ(display.text("GSM Serving Cell", "RSSI"), "0 dBm");
  show("2020.01.02_03.04.05,GPRS,-40,-,-,1234,9CBA,1000\n");
  EXPECT_EQ(display.text("GSM Serving Cell", "RSSI"), "63 dBm");
}

TEST_F(GsmUmtsDriveTestTest, EmptiesTheActiveSetOnGSM) {
  show(
      "2020.01.02_03.04.05,UMTS,-89,-7,-82,1234,9CBA,1000\n"
      "2020.01.02_03.04.06,EDGE,-75,-,-,1234,9CBA,1000\n");
  EXPECT_TRUE(display.section("Active Set").array().empty());
}

TEST_F(GsmUmtsDriveTestTest, SendsNothingForLTERows) {
  show("2020.01.02_03.04.05,LTE,-89,-7,-82,1234,9CBA,1000\n");
  EXPECT_THAT(packets, IsEmpty());
}

TEST_F(GsmUmtsDriveTestTest, FollowsTheLogFromTechnologyToTechnology) {
  AutoDriveTestEncoder encoder(display.coding(), DriveTestFamily::LTE);
  auto log = DriveTestLog::open(_directory.write(
      "log.csv", kGsmUmtsColumns + "2020.01.02_03.04.05,5G,-89,-7,-82,1,9CBA,1000\n"
                                   "2020.01.02_03.04.06,UMTS,-89,-7,-82,1,9CBA,1000\n"
                                   "2020.01.02_03.04.07,LTE,-89,-7,-82,1,9CBA,1000\n"));
  std::vector<std::string_view> technologies = {encoder.technology()};
  for (auto row = log->next(); row->has_value(); row = log->next()) {
    EXPECT_FALSE(encoder.messages(**row).empty());
    technologies.push_back(encoder.technology());
  }
  EXPECT_THAT(technologies, ElementsAre("LTE", "LTE", "Ondrel_GSM", "LTE"));
}

}  // namespace
}  // namespace kestro
