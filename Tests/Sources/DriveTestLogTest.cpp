// SPDX-License-Identifier: MIT
// Drive-test logs: columns, rows, values that are missing, and rows that are unusable.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "Sources/DriveTestLog.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::sys_days;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::Not;
using testing::TemporaryDirectory;

using Column = DriveTestColumn;

class DriveTestLogTest : public ::testing::Test {
 protected:
  Result<DriveTestLog> open(const std::string& contents) {
    return DriveTestLog::open(_directory.write("log.csv", contents));
  }

  /// Every row of a log that can be opened.
  std::vector<DriveTestRow> rowsOf(const std::string& contents) {
    auto log = open(contents);
    EXPECT_TRUE(log.has_value()) << log.error().message;
    std::vector<DriveTestRow> rows;
    while (true) {
      auto row = log->next();
      EXPECT_TRUE(row.has_value());
      if (!row->has_value()) break;
      rows.push_back(std::move(**row));
    }
    _problems = log->problems();
    return rows;
  }

  TemporaryDirectory _directory;
  DriveTestProblems _problems;
};

TEST_F(DriveTestLogTest, FindsColumnsByNameInAnyOrder) {
  const auto rows = rowsOf(
      "SNR,RSRP,Whatever,NetworkMode,Timestamp\n"
      "9.0,-90,x,LTE,2019.11.21_15.38.36\n");
  ASSERT_EQ(rows.size(), 1U);
  EXPECT_EQ(rows[0].line, 2U);
  EXPECT_EQ(rows[0].time, sys_days(std::chrono::year(2019) / 11 / 21) + std::chrono::hours(15) +
                              std::chrono::minutes(38) + std::chrono::seconds(36));
  EXPECT_EQ(rows[0].family, DriveTestFamily::LTE);
  EXPECT_EQ(rows[0].text(Column::NetworkMode), "LTE");
  EXPECT_EQ(rows[0].text(Column::Level), "-90");
  EXPECT_EQ(rows[0].text(Column::SignalToNoise), "9.0");
  EXPECT_EQ(rows[0].text(Column::Quality), std::nullopt);
}

TEST_F(DriveTestLogTest, NamesTheColumnsThatAreMissing) {
  const auto log = open("Timestamp,NetworkMode,RSRP,CQI\n");
  ASSERT_TRUE(log.has_value());
  EXPECT_THAT(log->missingColumns(), Contains("SNR"));
  EXPECT_THAT(log->missingColumns(), Contains("NRxRSRQ"));
  EXPECT_THAT(log->missingColumns(), Not(Contains("CQI")));
}

TEST_F(DriveTestLogTest, AMissingRequiredColumnIsAnError) {
  const auto path = _directory.pathOf("log.csv");
  for (const std::string name : {"Timestamp", "NetworkMode", "RSRP"}) {
    std::string names;
    for (const std::string other : {"Timestamp", "NetworkMode", "RSRP"}) {
      if (other != name) names += other + ",";
    }
    const auto log = open(names + "SNR\n");
    ASSERT_FALSE(log.has_value());
    EXPECT_EQ(log.error().message,
              path + ": no drive-test log: there is no column \"" + name + "\"");
  }
}

TEST_F(DriveTestLogTest, AHintNamesWhatALogWasSavedAs) {
  const std::string names = "Timestamp,NetworkMode,RSRP";
  const auto problem = [this](const std::string& contents) {
    return open(contents).error().message;
  };
  const auto inUtf16 = [](std::string_view text, bool isBigEndian) {
    std::string result = isBigEndian ? "\xFE\xFF" : "\xFF\xFE";
    for (const char c : text) result += isBigEndian ? std::string{'\0', c} : std::string{c, '\0'};
    return result;
  };
  for (const std::string& text : {names, "\"" + names + "\""}) {
    EXPECT_THAT(problem(inUtf16(text, true)),
                EndsWith(": the file is in UTF-16: save it in UTF-8"));
    EXPECT_THAT(problem(inUtf16(text, false)),
                EndsWith(": the file is in UTF-16: save it in UTF-8"));
  }
  EXPECT_THAT(problem(inUtf16(names, false).substr(2)),
              EndsWith("no column \"Timestamp\"; the file is in UTF-16: save it in UTF-8"));
  EXPECT_THAT(problem("Timestamp;NetworkMode;RSRP\n"),
              EndsWith("; its columns are separated by semicolons: save it with commas"));
  EXPECT_THAT(problem("Timestamp\tNetworkMode\tRSRP\n"),
              EndsWith("; its columns are separated by tabs: save it with commas"));
}

TEST_F(DriveTestLogTest, WhatIsNoLogIsRefused) {
  const auto path = _directory.pathOf("log.csv");
  EXPECT_EQ(open("").error().message, path + ": the file is empty");
  EXPECT_EQ(open("\"Timestamp").error().message, path + ": line 1: a quoted field does not end");
  EXPECT_EQ(DriveTestLog::open("/none/log.csv").error().message,
            "/none/log.csv: No such file or directory");
  EXPECT_EQ(DriveTestLog::open(_directory.pathOf(".")).error().message,
            _directory.pathOf(".") + ": the file cannot be read");
}

TEST_F(DriveTestLogTest, AValueThatWasNotMeasuredKeepsTheLastOfItsFamily) {
  const auto rows = rowsOf(
      "Timestamp,NetworkMode,RSRP,SNR\n"
      "2019.11.21_15.38.36,LTE,-90,9.0\n"
      "2019.11.21_15.38.37,UMTS,-70,-\n"
      "2019.11.21_15.38.38,5G,-,-\n"
      "2019.11.21_15.38.39,HSPA+,-,\n"
      "2019.11.21_15.38.40,EDGE,-,-\n");
  ASSERT_EQ(rows.size(), 5U);
  EXPECT_EQ(rows[1].text(Column::Level), "-70");
  EXPECT_EQ(rows[1].text(Column::SignalToNoise), std::nullopt);
  EXPECT_EQ(rows[2].text(Column::NetworkMode), "5G");
  EXPECT_EQ(rows[2].text(Column::Level), "-90");
  EXPECT_EQ(rows[2].text(Column::SignalToNoise), "9.0");
  EXPECT_EQ(rows[3].text(Column::Level), "-70");
  EXPECT_EQ(rows[3].text(Column::SignalToNoise), std::nullopt);
  EXPECT_EQ(rows[4].text(Column::Level), std::nullopt);
  EXPECT_EQ(_problems.rows + _problems.values, 0U);
}

TEST_F(DriveTestLogTest, AnUnknownModeKeepsTheLastOnlyWhenItWasNotMeasured) {
  const auto rows = rowsOf(
      "Timestamp,NetworkMode,RSRP\n"
      "2019.11.21_15.38.35,-,-1\n"
      "2019.11.21_15.38.36,UMTS,-2\n"
      "2019.11.21_15.38.37,-,-3\n"
      "2019.11.21_15.38.38,Pigeon,-4\n");
  ASSERT_EQ(rows.size(), 2U);
  EXPECT_EQ(rows[1].text(Column::NetworkMode), "UMTS");
  EXPECT_EQ(rows[1].text(Column::Level), "-3");
  EXPECT_EQ(_problems.rows, 2U);
  EXPECT_EQ(_problems.first, "line 2: \"-\" is no network mode");
}

TEST_F(DriveTestLogTest, ATimeBeyondTheYearsOfLogsIsNone) {
  const auto rows = rowsOf(
      "Timestamp,NetworkMode,RSRP\n"
      "1969.12.31_23.59.59,LTE,-1\n"
      "1970.01.01_00.00.00,LTE,-2\n"
      "2099.12.31_23.59.59,LTE,-3\n"
      "2100.01.01_00.00.00,LTE,-4\n"
      "9999.01.01_00.00.00,LTE,-5\n");
  ASSERT_EQ(rows.size(), 2U);
  EXPECT_EQ(rows[0].text(Column::Level), "-2");
  EXPECT_EQ(rows[1].text(Column::Level), "-3");
  EXPECT_EQ(_problems.rows, 3U);
}

TEST_F(DriveTestLogTest, NetworkModesBelongToTheirFamilies) {
  EXPECT_EQ(familyOfNetworkMode("EDGE"), DriveTestFamily::GSM);
  EXPECT_EQ(familyOfNetworkMode("GPRS"), DriveTestFamily::GSM);
  for (const auto* mode : {"UMTS", "HSDPA", "HSUPA", "HSPA+"}) {
    EXPECT_EQ(familyOfNetworkMode(mode), DriveTestFamily::UMTS) << mode;
  }
  EXPECT_EQ(familyOfNetworkMode("LTE"), DriveTestFamily::LTE);
  EXPECT_EQ(familyOfNetworkMode("5G"), DriveTestFamily::LTE);
  EXPECT_EQ(familyOfNetworkMode("lte"), std::nullopt);
  EXPECT_EQ(familyOfNetworkMode(""), std::nullopt);
}

TEST_F(DriveTestLogTest, HalfLinesAndLongLinesAreLeftOutAndCounted) {
  const auto rows = rowsOf(
      "Timestamp,NetworkMode,RSRP\n"
      "2019.11.21_15.38.36,LTE\n"
      "2019.11.21_15.38.37,LTE,-91\n"
      "2019.11.21_15.38.38,LTE,-92,7\n"
      "2019.11.21_15.3");
  ASSERT_EQ(rows.size(), 1U);
  EXPECT_EQ(rows[0].text(Column::Level), "-91");
  EXPECT_EQ(_problems.rows, 3U);
  EXPECT_EQ(_problems.first, "line 2: 2 fields instead of 3");
}

TEST_F(DriveTestLogTest, MalformedQuotesAreLeftOutAndCounted) {
  const auto rows = rowsOf(
      "Timestamp,NetworkMode,RSRP\n"
      "2019.11.21_15.38.36,L\"TE,-90\n"
      "\"2019.11.21_15.38.37\",\"LTE\",\"-91\"\n");
  ASSERT_EQ(rows.size(), 1U);
  EXPECT_EQ(rows[0].text(Column::Level), "-91");
  EXPECT_EQ(_problems.rows, 1U);
}

TEST_F(DriveTestLogTest, TimesThatAreNoneAreLeftOut) {
  std::string log = "Timestamp,NetworkMode,RSRP\n";
  for (const std::string time :
       {"2019.13.21_15.38.36", "2019.02.29_15.38.36", "2019.11.21_24.00.00", "2019.11.21_15.60.00",
        "2019-11-21 15:38:36", "2019.11.21_15.38.3x", "2019.11.21_15.38.36Z", "-", ""}) {
    log += time + ",LTE,-90\n";
  }
  EXPECT_EQ(rowsOf(log).size(), 0U);
  EXPECT_EQ(_problems.rows, 9U);
}

TEST_F(DriveTestLogTest, ValuesThatAreNoneCountAsNotMeasured) {
  const auto rows = rowsOf(
      "Timestamp,NetworkMode,RSRP,RSSI,LACHEX,Operatorname\n"
      "2019.11.21_15.38.36,LTE,-90,-72,9CBA,B\n"
      "2019.11.21_15.38.37,LTE,-9o,nan,XYZ,\x01\n");
  ASSERT_EQ(rows.size(), 2U);
  EXPECT_EQ(rows[1].text(Column::Level), "-90");
  EXPECT_EQ(rows[1].text(Column::TotalPower), "-72");
  EXPECT_EQ(rows[1].text(Column::Area), "9CBA");
  EXPECT_EQ(rows[1].text(Column::Operator), "B");
  EXPECT_EQ(_problems.rows, 0U);
  EXPECT_EQ(_problems.values, 4U);
  EXPECT_EQ(_problems.first, "line 3: RSRP cannot be \"-9o\"");
}

TEST_F(DriveTestLogTest, LevelsThatNoReceiverMeasuresAreNone) {
  const auto rows = rowsOf(
      "Timestamp,NetworkMode,RSRP,RSRQ,SNR,RSSI,NRxRSRP,NRxRSRQ,DL_bitrate\n"
      "2019.11.21_15.38.36,LTE,-1000,1000,4,-72,-99,-14,10\n"
      "2019.11.21_15.38.37,LTE,-1000.5,1001,-9e20,1e308,2147483647,-2000,9000000\n");
  ASSERT_EQ(rows.size(), 2U);
  EXPECT_EQ(rows[1].text(Column::Level), "-1000");
  EXPECT_EQ(rows[1].text(Column::Quality), "1000");
  EXPECT_EQ(rows[1].text(Column::SignalToNoise), "4");
  EXPECT_EQ(rows[1].text(Column::TotalPower), "-72");
  EXPECT_EQ(rows[1].text(Column::NeighbourLevel), "-99");
  EXPECT_EQ(rows[1].text(Column::NeighbourQuality), "-14");
  EXPECT_EQ(rows[1].text(Column::DownlinkRate), "9000000");
  EXPECT_EQ(_problems.values, 6U);
  EXPECT_EQ(_problems.first, "line 3: RSRP cannot be \"-1000.5\"");
}

TEST_F(DriveTestLogTest, WhatIsReportedOfGarbageIsALineOfText) {
  rowsOf("Timestamp,NetworkMode,RSRP\n\"a\nb\x1B[2J\",LTE,-90\n");
  EXPECT_EQ(_problems.first, "line 2: \"a?b?[2J\" is no time");
}

TEST_F(DriveTestLogTest, EveryPrefixOfALogIsReadToItsEnd) {
  const std::string whole =
      "Timestamp,NetworkMode,RSRP\n"
      "2019.11.21_15.38.36,LTE,-90\n"
      "2019.11.21_15.38.37,UMTS,-91\n";
  for (std::size_t length = 0; length <= whole.size(); ++length) {
    const bool isHeaderWhole = length >= 26;
    auto log = open(whole.substr(0, length));
    ASSERT_EQ(log.has_value(), isHeaderWhole) << length;
    if (!isHeaderWhole) continue;
    std::size_t rows = 0;
    while (true) {
      const auto row = log->next();
      ASSERT_TRUE(row.has_value()) << length;
      if (!row->has_value()) break;
      ++rows;
    }
    EXPECT_LE(rows + log->problems().rows, 2U) << length;
  }
}

}  // namespace
}  // namespace kestro
