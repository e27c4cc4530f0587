// SPDX-License-Identifier: MIT
// Drive-test logs as sources: when which row is due.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Sources/DriveTestSource.h"
#include "Tests/Sources/SourceReading.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using std::chrono::seconds;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

/// One message a row: its level's text. No message for a level of 0, two for one of 1.
class LevelEncoder : public DriveTestEncoder {
 public:
  [[nodiscard]] std::string_view technology() const override { return "IFX"; }
  [[nodiscard]] std::vector<Bytes> messages(const DriveTestRow& row) override {
    const std::string text = row.text(DriveTestColumn::Level).value_or("none");
    if (text == "0") return {};
    const Bytes bytes(text.begin(), text.end());
    if (text == "1") return {bytes, bytes};
    return {bytes};
  }
};

std::unique_ptr<DriveTestEncoder> makeEncoder(DriveTestFamily) {
  return std::make_unique<LevelEncoder>();
}

class DriveTestSourceTest : public ::testing::Test {
 protected:
  /// Opens a log with these lines; each is a second within 2019-11-21 15:38, and a level.
  std::unique_ptr<DriveTestSource> open(const std::vector<std::pair<int, std::string>>& lines) {
    std::string contents = "Timestamp,NetworkMode,RSRP\n";
    for (const auto& [second, level] : lines) {
      contents += "2019.11.21_15.38." + std::string(second < 10 ? "0" : "") +
                  std::to_string(second) + ",LTE," + level + "\n";
    }
    return openText(contents);
  }
  std::unique_ptr<DriveTestSource> openText(const std::string& contents) {
    auto source = DriveTestSource::open(
        *RecordedFile::open(_directory.write("log.csv", contents)), makeEncoder,
        [this](std::string_view line) { _lines.emplace_back(line); });
    EXPECT_TRUE(source.has_value()) << source.error().message;
    _lines.clear();  // that most columns are missing
    return std::move(*source);
  }
  static std::vector<std::int64_t> milliseconds(const std::vector<ReadEvent>& events) {
    std::vector<std::int64_t> result;
    for (const auto& event : events)
      result.push_back(event.time.value_or(microseconds(-1)) / std::chrono::milliseconds(1));
    return result;
  }

  TemporaryDirectory _directory;
  std::vector<std::string> _lines;
};

TEST_F(DriveTestSourceTest, SpreadsTheRowsOfASecondOverIt) {
  const auto source =
      open({{36, "-1"}, {36, "-2"}, {36, "-3"}, {36, "-4"}, {37, "-5"}, {37, "-6"}, {38, "-7"}});
  EXPECT_THAT(milliseconds(readToEnd(*source)), ElementsAre(0, 250, 500, 750, 1000, 1500, 2000));
}

TEST_F(DriveTestSourceTest, KeepsThePausesOfTheLog) {
  const auto source = open({{10, "-1"}, {14, "-2"}, {59, "-3"}});
  EXPECT_THAT(milliseconds(readToEnd(*source)), ElementsAre(0, 4000, 49000));
}

TEST_F(DriveTestSourceTest, TellsTheLogsOwnTimes) {
  const auto source = open({{5, "-1"}, {5, "-2"}, {6, "-3"}});
  const auto events = readToEnd(*source);
  ASSERT_EQ(events.size(), 3U);
  const Moment begin(seconds(1'574'350'685));  // 2019-11-21 15:38:05
  EXPECT_EQ(events[0].moment, begin);
  EXPECT_EQ(events[1].moment, begin + std::chrono::milliseconds(500));
  EXPECT_EQ(events[2].moment, begin + seconds(1));
}

TEST_F(DriveTestSourceTest, ARowsMessagesShareItsTime) {
  const auto source = open({{10, "1"}, {10, "-2"}});
  EXPECT_THAT(milliseconds(readToEnd(*source)), ElementsAre(0, 0, 500));
}

TEST_F(DriveTestSourceTest, ARowWithoutMessagesKeepsItsTime) {
  const auto source = open({{10, "-1"}, {10, "0"}, {10, "-2"}, {10, "0"}, {11, "-3"}});
  EXPECT_THAT(milliseconds(readToEnd(*source)), ElementsAre(0, 500, 1000));
}

TEST_F(DriveTestSourceTest, TimeDoesNotGoBackWhenTheLogsDoes) {
  const auto source = open({{10, "-1"}, {10, "-2"}, {5, "-3"}, {6, "-4"}});
  EXPECT_THAT(milliseconds(readToEnd(*source)), ElementsAre(0, 500, 500, 1000));
}

TEST_F(DriveTestSourceTest, AnEndlessSecondIsReadInPortions) {
  std::vector<std::pair<int, std::string>> lines(2 * DriveTestSource::kMaximumRowsOfASecond,
                                                 {10, "-1"});
  const auto events = readToEnd(*open(lines));
  ASSERT_EQ(events.size(), lines.size());
  for (std::size_t i = 1; i < events.size(); ++i) {
    ASSERT_GE(*events[i].time, *events[i - 1].time) << i;
  }
  EXPECT_LT(*events.back().time, seconds(3));
}

TEST_F(DriveTestSourceTest, StartsAgainFromTheFirstRow) {
  const auto source = open({{10, "-1"}, {12, "-2"}});
  const auto first = readToEnd(*source);
  ASSERT_TRUE(source->restart());
  const auto second = readToEnd(*source);
  EXPECT_EQ(milliseconds(second), milliseconds(first));
  EXPECT_EQ(second[0].message, first[0].message);
}

TEST_F(DriveTestSourceTest, StartsAgainWithoutTheValuesOfThePassBefore) {
  const auto source = open({{10, "-"}, {12, "-2"}});
  readToEnd(*source);
  ASSERT_TRUE(source->restart());
  EXPECT_EQ(readEvent(*source).message, (Bytes{'n', 'o', 'n', 'e'}));
}

TEST_F(DriveTestSourceTest, UnusableRowsAreReportedAtTheEnd) {
  const auto source = openText(
      "Timestamp,NetworkMode,RSRP\n"
      "2019.11.21_15.38.36,LTE,-90\n"
      "2019.11.21_15.38.37,LTE,bad\n"
      "half a line\n");
  EXPECT_EQ(readToEnd(*source).size(), 2U);
  EXPECT_THAT(_lines, ElementsAre(_directory.pathOf("log.csv") +
                                  ": 1 rows and 1 values could not be used; the first: line 3: "
                                  "RSRP cannot be \"bad\""));
}

TEST_F(DriveTestSourceTest, ACleanLogReportsNothing) {
  readToEnd(*open({{10, "-1"}}));
  EXPECT_THAT(_lines, IsEmpty());
}

TEST_F(DriveTestSourceTest, MissingColumnsAreReportedAtOnce) {
  const auto path = _directory.write("log.csv", std::string_view("Timestamp,NetworkMode,RSRP\n"));
  std::vector<std::string> lines;
  const auto source =
      DriveTestSource::open(*RecordedFile::open(path), makeEncoder,
                            [&lines](std::string_view line) { lines.emplace_back(line); });
  ASSERT_TRUE(source.has_value());
  EXPECT_THAT(lines, ElementsAre(HasSubstr("no columns RSRQ, SNR, RSSI, CQI,")));
}

}  // namespace
}  // namespace kestro
