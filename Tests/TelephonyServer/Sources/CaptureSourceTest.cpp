// SPDX-License-Identifier: MIT
// Captures as sources.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "TelephonyServer/Sources/CaptureSource.h"
#include "Tests/Captures/CaptureBytes.h"
#include "Tests/Support/TemporaryDirectory.h"
#include "Tests/TelephonyServer/SourceReading.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

class CaptureSourceTest : public ::testing::Test {
 protected:
  Result<std::unique_ptr<CaptureSource>> open(const Bytes& contents,
                                              std::string_view technology = "") {
    return CaptureSource::open(_directory.write("a.pcap", contents), technology,
                               [this](std::string_view line) { _lines.emplace_back(line); });
  }

  TemporaryDirectory _directory;
  std::vector<std::string> _lines;
};

TEST_F(CaptureSourceTest, yieldsTheMessagesAtTheirTimesSinceTheFirst) {
  auto source = open(joined({captureHeader(150), twoRecords()}));
  ASSERT_TRUE(source.has_value()) << source.error().message;
  EXPECT_EQ((*source)->technology(), "LTE");
  const auto events = readToEnd(**source);
  ASSERT_EQ(events.size(), 2U);
  EXPECT_EQ(events[0].time, microseconds(0));
  EXPECT_EQ(events[0].technology, "LTE");
  EXPECT_EQ(events[0].message, (Bytes{'a', 'b', 'c'}));
  EXPECT_EQ(events[1].time, microseconds(1'500'000));
  EXPECT_EQ(events[1].message, (Bytes{'d', 'e'}));
  EXPECT_THAT(_lines, IsEmpty());
}

TEST_F(CaptureSourceTest, theTechnologyAskedForWinsOverTheFiles) {
  auto source = open(joined({captureHeader(150), twoRecords()}), "UTRAN2");
  ASSERT_TRUE(source.has_value());
  EXPECT_EQ((*source)->technology(), "UTRAN2");
  EXPECT_EQ(readEvent(**source).technology, "UTRAN2");
}

TEST_F(CaptureSourceTest, startsAgainFromTheFirstMessage) {
  auto source = open(joined({captureHeader(147), twoRecords()}));
  ASSERT_TRUE(source.has_value());
  readToEnd(**source);
  ASSERT_TRUE((*source)->restart());
  const auto events = readToEnd(**source);
  ASSERT_EQ(events.size(), 2U);
  EXPECT_EQ(events[0].time, microseconds(0));
}

TEST_F(CaptureSourceTest, aCutFileYieldsWhatIsWholeAndThenSaysSo) {
  auto contents = joined({captureHeader(147), twoRecords()});
  contents.pop_back();
  auto source = open(contents);
  ASSERT_TRUE(source.has_value());
  EXPECT_EQ(readEvent(**source).message, (Bytes{'a', 'b', 'c'}));
  const auto step = (*source)->next();
  ASSERT_FALSE(step.has_value());
  EXPECT_THAT(step.error().message, HasSubstr("record 2: truncated"));
}

TEST_F(CaptureSourceTest, messagesThatTheRecorderCutAreLeftOutAndCounted) {
  const Bytes cut = {1, 0, 0, 0, 0, 0, 0, 0, 2, 0, 0, 0, 9, 0, 0, 0, 'x', 'y'};
  auto source = open(joined({captureHeader(147), cut, twoRecords()}));
  ASSERT_TRUE(source.has_value());
  const auto events = readToEnd(**source);
  ASSERT_EQ(events.size(), 2U);
  EXPECT_EQ(events[0].message, (Bytes{'a', 'b', 'c'}));
  EXPECT_THAT(_lines,
              ElementsAre(HasSubstr("1 of 3 messages had been cut when they were recorded")));
}

}  // namespace
}  // namespace kestro
