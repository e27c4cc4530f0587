// SPDX-License-Identifier: MIT
// `measure` as its users start it.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Tests/EndToEnd/PacketMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

/// Two rows of LTE, of which the second has the same levels, and one of GSM.
constexpr std::string_view kMeasuredLog =
    "Timestamp,NetworkMode,RSRP,RSRQ,RSSI,CELLHEX,LACHEX,RAWCELLID,Latitude,Longitude\n"
    "2019.11.21_15.38.30,LTE,-90,-7,-70,1,9CBA,258,51.5,-8.5\n"
    "2019.11.21_15.38.31,LTE,-90,-8,-70,1,9CBA,258,51.5,-8.5\n"
    "2019.11.21_15.38.34,EDGE,-71,-,-,2B,1A,43,51.6,-8.6\n";

class MeasureTest : public ::testing::Test {
 protected:
  static Outcome measure(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"kestro-cli", "measure"});
    return run(std::move(arguments));
  }

  TemporaryDirectory directory;
  std::string log = directory.write("log.csv", kMeasuredLog);
};

TEST_F(MeasureTest, WritesALineAValue) {
  const Outcome outcome = measure({log, "--series=Serving Cell Measurements/*RSR?"});
  EXPECT_EQ(outcome.status, 0) << outcome.errors;
  EXPECT_EQ(outcome.output,
            "time,technology,series,item,value,unit,text,message\n"
            "2019-11-21T15:38:30.000000Z,LTE,Serving Cell Measurements/Measured RSRP,,-90,dBm,"
            "-90.00 dBm,6\n"
            "2019-11-21T15:38:30.000000Z,LTE,Serving Cell Measurements/Average RSRP,,-90,dBm,"
            "-90.00 dBm,6\n"
            "2019-11-21T15:38:30.000000Z,LTE,Serving Cell Measurements/Measured RSRQ,,-7,dB,"
            "-7.00 dB,6\n"
            "2019-11-21T15:38:30.000000Z,LTE,Serving Cell Measurements/Average RSRQ,,-7,dB,"
            "-7.00 dB,6\n"
            "2019-11-21T15:38:31.000000Z,LTE,Serving Cell Measurements/Measured RSRP,,-90,dBm,"
            "-90.00 dBm,11\n"
            "2019-11-21T15:38:31.000000Z,LTE,Serving Cell Measurements/Average RSRP,,-90,dBm,"
            "-90.00 dBm,11\n"
            "2019-11-21T15:38:31.000000Z,LTE,Serving Cell Measurements/Measured RSRQ,,-8,dB,"
            "-8.00 dB,11\n"
            "2019-11-21T15:38:31.000000Z,LTE,Serving Cell Measurements/Average RSRQ,,-8,dB,"
            "-8.00 dB,11\n");
}

TEST_F(MeasureTest, LeavesOutWhatADriveTestLogsPacketsMakeUp) {
  const Outcome outcome = measure({log});
  EXPECT_THAT(outcome.output, HasSubstr("Cell Identity,,258,"));
  EXPECT_THAT(outcome.output, HasSubstr("GSM Serving Cell/Cell ID,,43,"));
  for (const char* madeUp : {"ARFCN", "Physical Cell ID,", "Bandwidth", "Mobile Country Code"}) {
    EXPECT_THAT(outcome.output, Not(HasSubstr(madeUp)));
  }
  // A simulation makes up all of it, and that is what is wanted of it.
  EXPECT_THAT(measure({"simulation:LTE", "--to=+2s"}).output, HasSubstr("Download Bandwidth,,20,"));
}

TEST_F(MeasureTest, ChangesAreValuesThatDifferFromTheSeriesLastOne) {
  const Outcome outcome =
      measure({log, "--series=Serving Cell Measurements/Measured*", "--changes"});
  EXPECT_EQ(outcome.output,
            "time,technology,series,item,value,unit,text,message\n"
            "2019-11-21T15:38:30.000000Z,LTE,Serving Cell Measurements/Measured RSRP,,-90,dBm,"
            "-90.00 dBm,6\n"
            "2019-11-21T15:38:30.000000Z,LTE,Serving Cell Measurements/Measured RSRQ,,-7,dB,"
            "-7.00 dB,6\n"
            "2019-11-21T15:38:30.000000Z,LTE,Serving Cell Measurements/Measured RSSI,,-70,dBm,"
            "-70.00 dBm,6\n"
            "2019-11-21T15:38:31.000000Z,LTE,Serving Cell Measurements/Measured RSRQ,,-8,dB,"
            "-8.00 dB,11\n");
}

TEST_F(MeasureTest, ATrackGivesEachValueItsPosition) {
  const auto track = directory.write(
      "drive.gpx",
      "<gpx xmlns='http://www.topografix.com/GPX/1/1' version='1.1' creator='x'><trk><trkseg>"
      "<trkpt lat='50' lon='8'><time>2019-11-21T15:38:30Z</time></trkpt>"
      "<trkpt lat='51' lon='9'><time>2019-11-21T15:38:32Z</time></trkpt>"
      "</trkseg></trk></gpx>");
  const Outcome outcome =
      measure({log, "--track=" + track, "--series=*/Measured RSRP", "--to=+2s"});
  EXPECT_THAT(outcome.output, StartsWith("time,technology,series,item,value,unit,text,message,"
                                         "latitude,longitude\n"));
  EXPECT_THAT(outcome.output, HasSubstr("-90.00 dBm,6,50,8\n"));
  EXPECT_THAT(outcome.output, HasSubstr("-90.00 dBm,11,50.5,8.5\n"));
  EXPECT_EQ(measure({log, "--track=/none"}).status, 1);
}

TEST_F(MeasureTest, ObjectsHaveTheLogsPositions) {
  const Outcome outcome = measure({log, "--format=ndjson", "--series=*/Cell ID"});
  const auto object = nlohmann::json::parse(outcome.output);
  EXPECT_EQ(object["series"], "GSM Serving Cell/Cell ID");
  EXPECT_EQ(object["value"], 43);
  EXPECT_EQ(object["text"], "43");
  EXPECT_EQ(object["latitude"], 51.6);
}

TEST_F(MeasureTest, AStoreTakesThePlaceOfLines) {
  const std::string store = directory.pathOf("drive.sqlite");
  for (int i = 0; i < 2; ++i) {
    const Outcome outcome = measure({log, "-o", store});
    EXPECT_EQ(outcome.status, 0) << outcome.errors;
    EXPECT_EQ(outcome.output, "");
  }
  EXPECT_THAT(TemporaryDirectory::text(store), StartsWith("SQLite format 3"));
  // A file that is no store stays.
  EXPECT_EQ(measure({log, "-o", log}).status, 1);
  EXPECT_EQ(TemporaryDirectory::text(log), kMeasuredLog);
  EXPECT_EQ(measure({log, "-o", store, "--format=csv"}).status, 2);
}

}  // namespace
}  // namespace kestro::testing
