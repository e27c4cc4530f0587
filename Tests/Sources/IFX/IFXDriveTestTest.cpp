// SPDX-License-Identifier: MIT
// Drive-test rows on the IFX channel, as its receiver shows them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Sources/IFX/IFXDriveTest.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using testing::TemporaryDirectory;

class IFXDriveTestTest : public ::testing::Test {
 protected:
  /// The message of a log's last row, as sent.
  Value sent(const std::string& contents) {
    auto log = DriveTestLog::open(_directory.write("log.csv", contents));
    EXPECT_TRUE(log.has_value()) << log.error().message;
    Bytes last;
    while (true) {
      const auto row = log->next();
      if (!row->has_value()) break;
      const auto messages = _encoder.messages(**row);
      EXPECT_EQ(messages.size(), 1U);
      last = messages.back();
    }
    auto parsed = _coding->parse(last);
    EXPECT_TRUE(parsed.has_value());
    return *parsed;
  }
  /// The same as a receiver displays it.
  Dictionary shown(const std::string& contents) {
    return GSMLogGenerator::processObject(sent(contents)).dictionary();
  }

  TemporaryDirectory _directory;
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  IFXDriveTestEncoder _encoder{*_coding};
};

const std::string kIFXColumns =
    "Timestamp,Longitude,Latitude,Speed,Operatorname,CellID,NetworkMode,RSRP,RSRQ,SNR,CQI,RSSI,"
    "DL_bitrate,UL_bitrate,State,CELLHEX,NODEHEX,LACHEX,RAWCELLID,NRxRSRP,NRxRSRQ\n";

TEST_F(IFXDriveTestTest, AnLTERowShowsTheLogsOwnNumbersWithTheirUnits) {
  const auto display = shown(kIFXColumns +
                             "2020.01.02_03.04.05,-8.46,51.88,17,B,1,LTE,-90,-7,9.0,12,-72,36,6,D,"
                             "1,53E42,9CBA,87966209,-95.0,-16.0\n");
  const Dictionary expected{
      {"_sorted", "yes"},
      {"01;Mode", Dictionary{{"Time", "2020-01-02 03:04:05"},
                             {"Network Mode", "LTE"},
                             {"Operator", "B"},
                             {"State", "D"}}},
      {"02;Serving Cell", Dictionary{{"Cell ID", "1"},
                                     {"Cell ID (hex)", "1"},
                                     {"eNodeB (hex)", "53E42"},
                                     {"TAC (hex)", "9CBA"},
                                     {"Whole Cell ID", "87966209"}}},
      {"03;Radio Quality", Dictionary{{"Technology", "LTE"},
                                      {"RSRP", "-90 dBm"},
                                      {"RSRQ", "-7 dB"},
                                      {"SNR", "9.0 dB"},
                                      {"RSSI", "-72 dBm"},
                                      {"CQI", "12"}}},
      {"04;Neighbour Cells",
       Array{Dictionary{{"Rank", "1"}, {"RSRP", "-95.0 dBm"}, {"RSRQ", "-16.0 dB"}}}},
      {"05;Throughput", Dictionary{{"Downlink", "36 kbit/s"}, {"Uplink", "6 kbit/s"}}},
      {"06;Position",
       Dictionary{{"Latitude", "51.88"}, {"Longitude", "-8.46"}, {"Speed", "17 km/h"}}}};
  EXPECT_EQ(Value(display), Value(expected));
}

TEST_F(IFXDriveTestTest, AUMTSRowNamesItsQuantitiesDifferently) {
  const auto display = shown(kIFXColumns +
                             "2020.01.02_03.04.05,-,-,-,B,52212,HSPA+,-67,-2,-,-,-,2608,153,D,"
                             "CBF4,C,75AA,838644,-,-\n");
  EXPECT_EQ(display["03;Radio Quality"],
            Value(Dictionary{{"Technology", "UMTS"}, {"RSCP", "-67 dBm"}, {"Ec/N0", "-2 dB"}}));
  const auto cell = display["02;Serving Cell"].dictionary();
  EXPECT_EQ(cell["RNC (hex)"], Value("C"));
  EXPECT_EQ(cell["LAC (hex)"], Value("75AA"));
}

TEST_F(IFXDriveTestTest, AGSMRowShowsItsLevelOnly) {
  const auto display = shown(kIFXColumns +
                             "2020.01.02_03.04.05,-,-,-,B,34124,EDGE,-51,0,-,-,-,0,3,D,"
                             "854C,-,3FE,34124,-,-\n");
  EXPECT_EQ(display["03;Radio Quality"],
            Value(Dictionary{{"Technology", "GSM"}, {"RxLev", "-51 dBm"}}));
}

TEST_F(IFXDriveTestTest, WhatWasNeverMeasuredIsLeftOut) {
  const auto display = shown("Timestamp,NetworkMode,RSRP,NRxRSRP\n2020.01.02_03.04.05,LTE,-90,-\n");
  EXPECT_EQ(display["02;Serving Cell"], Value(Dictionary()));
  EXPECT_EQ(display["04;Neighbour Cells"], Value(Array()));
}

TEST_F(IFXDriveTestTest, ANeighbourOfWhichOneValueIsKnownStaysNamed) {
  const auto display =
      shown("Timestamp,NetworkMode,RSRP,NRxRSRP\n2020.01.02_03.04.05,LTE,-90,-95.0\n");
  EXPECT_EQ(display["04;Neighbour Cells"],
            Value(Array{Dictionary{{"Rank", "1"}, {"RSRP", "-95.0 dBm"}}}));
}

TEST_F(IFXDriveTestTest, ListsBeginWithAHeaderThatReceiversDrop) {
  const auto message = sent("Timestamp,NetworkMode,RSRP\n2020.01.02_03.04.05,LTE,-90\n");
  const auto list = message.dictionary()["04;Neighbour Cells"].array();
  ASSERT_EQ(list.size(), 1U);
  EXPECT_TRUE(list[0].isText());
}

}  // namespace
}  // namespace kestro
