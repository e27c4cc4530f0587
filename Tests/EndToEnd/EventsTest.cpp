// SPDX-License-Identifier: MIT
// `cells` and `events` as their users start them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {
namespace {

using ::testing::HasSubstr;

/// LTE, GSM and LTE again, 4 s and 10 s apart.
constexpr std::string_view kDriveLog =
    "Timestamp,NetworkMode,RSRP,RSRQ,RSSI,CELLHEX,LACHEX,RAWCELLID,Latitude,Longitude\n"
    "2019.11.21_15.38.30,LTE,-90,-7,-70,1,9CBA,258,51.5,-8.5\n"
    "2019.11.21_15.38.34,EDGE,-71,-,-,2B,1A,43,51.6,-8.6\n"
    "2019.11.21_15.38.44,LTE,-111,-8,-71,2,9CBA,259,51.7,-8.7\n";

class EventsTest : public ::testing::Test {
 protected:
  static Outcome cli(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), "kestro-cli");
    return run(std::move(arguments));
  }

  TemporaryDirectory directory;
  std::string log = directory.write("log.csv", kDriveLog);
};

TEST_F(EventsTest, CellsAreATableByDefault) {
  const Outcome outcome = cli({"cells", log});
  EXPECT_EQ(outcome.status, 0) << outcome.errors;
  EXPECT_EQ(
      outcome.output,
      "Technology  Cell   Area    Level    Least   Median  Greatest  Quality  First seen      "
      "             Serving s\n"
      "LTE         258   40122   -90.00   -90.00   -90.00    -90.00    -7.00  "
      "2019-11-21T15:38:30.000000Z       4.00\n"
      "GSM         43       26   -71.00   -71.00   -71.00    -71.00           "
      "2019-11-21T15:38:34.000000Z       0.00\n"
      "LTE         259   40122  -111.00  -111.00  -111.00   -111.00    -8.00  "
      "2019-11-21T15:38:44.000000Z       0.00\n");
}

TEST_F(EventsTest, CellsAsCsvHaveAllColumns) {
  const Outcome outcome = cli({"cells", log, "--format=csv", "--to=+3s"});
  EXPECT_EQ(outcome.output,
            "technology,cell,cell_identity,base_station,sector,channel,physical_identity,band,"
            "frequency_mhz,area,network,level_last,level_least,level_median,level_greatest,"
            "level_count,quality_last,quality_least,quality_median,quality_greatest,quality_count,"
            "first_seen,last_seen,serving_s,assumed,input\n"
            "LTE,258,258,1,2,,,,,40122,,-90,-90,-90,-90,2,-7,-7,-7,-7,2,"
            "2019-11-21T15:38:30.000000Z,2019-11-21T15:38:30.000000Z,0,0,\n");
}

TEST_F(EventsTest, EventsAsJsonTellChangesAndGaps) {
  const Outcome outcome = cli({"events", log, "--format=json"});
  EXPECT_EQ(outcome.status, 0) << outcome.errors;
  std::vector<std::string> told;
  for (const nlohmann::json& event : nlohmann::json::parse(outcome.output)) {
    told.push_back(event["time"].get<std::string>().substr(17, 2) + " " +
                   event["event"].get<std::string>() + " " + event.value("from", "") + " " +
                   event.value("to", ""));
  }
  EXPECT_THAT(told, ::testing::ElementsAre("34 technology LTE GSM", "34 reselection 258 43",
                                           "39 messages-missing  ", "44 messages-back  ",
                                           "44 technology GSM LTE", "44 reselection 43 259"));
}

TEST_F(EventsTest, RulesComeFromAFileAndFromOptions) {
  const auto rules = directory.write("rules.txt", "# weak\nMeasured RSRP < -110 dBm\n");
  const Outcome outcome =
      cli({"events", log, "--rules=" + rules, "--rule=Nothing > 1", "--format=csv"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_THAT(outcome.output,
              HasSubstr("2019-11-21T15:38:44.000000Z,alarm,LTE,Serving Cell Measurements/Measured "
                        "RSRP,,Measured RSRP < -110 dBm,,,-111,0xB17F,,0,"));
  EXPECT_THAT(outcome.errors,
              HasSubstr("kestro-cli: rule \"Nothing > 1\": no series of this name came up\n"));
}

TEST_F(EventsTest, AWrongRuleIsRefusedWithItsPlace) {
  const auto rules = directory.write("rules.txt", "a < 1\nb < x\n");
  const Outcome outcome = cli({"events", log, "--rules=" + rules});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + rules + ":2:5: expected a number, found \"x\"\n");
  EXPECT_EQ(outcome.output, "");
  const Outcome wrongOption = cli({"events", log, "--rule=a =< 1"});
  EXPECT_EQ(wrongOption.status, 2);
  EXPECT_THAT(wrongOption.errors, HasSubstr("rule:1:3: expected one of < <= > >= == !="));
  EXPECT_THAT(cli({"events", log, "--rules=/none"}).errors, HasSubstr("/none: No such file"));
}

TEST_F(EventsTest, SeveralInputsAreDrivesOfTheirOwn) {
  const auto other = directory.write("other.csv", kDriveLog);
  const Outcome outcome = cli({"cells", log, other, "--format=json"});
  const nlohmann::json cells = nlohmann::json::parse(outcome.output);
  ASSERT_EQ(cells.size(), 6u);
  EXPECT_EQ(cells[0]["input"], log);
  EXPECT_EQ(cells[3]["input"], other);
  EXPECT_EQ(cells[3]["cell_identity"], 258);
}

TEST_F(EventsTest, AnInputThatCannotBeReadIsStatusOne) {
  for (const std::string command : {"cells", "events"}) {
    const Outcome outcome = cli({command, "/none"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.errors, "kestro-cli: /none: No such file or directory\n");
    EXPECT_EQ(outcome.output, "");
  }
}

}  // namespace
}  // namespace kestro::testing
