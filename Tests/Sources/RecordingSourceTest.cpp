// SPDX-License-Identifier: MIT
// Recordings as sources.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Sources/RecordingSource.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Sources/SourceReading.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

class RecordingSourceTest : public ::testing::Test {
 protected:
  Result<std::unique_ptr<RecordingSource>> open(const Bytes& contents,
                                                std::string_view technology = "") {
    return RecordingSource::open(*RecordedFile::open(_directory.write("a.pcap", contents)),
                                 {.coding = *_coding, .technology = technology},
                                 [this](std::string_view line) { _lines.emplace_back(line); });
  }

  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  TemporaryDirectory _directory;
  std::vector<std::string> _lines;
};

TEST_F(RecordingSourceTest, YieldsTheMessagesAtTheirTimesSinceTheFirst) {
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
  EXPECT_EQ(events[0].moment, Moment(microseconds(1'330'862'709'000'250)));
  EXPECT_EQ(events[1].moment, Moment(microseconds(1'330'862'710'500'250)));
  EXPECT_THAT(_lines, IsEmpty());
}

TEST_F(RecordingSourceTest, TheTechnologyAskedForWinsOverTheFiles) {
  auto source = open(joined({captureHeader(150), twoRecords()}), "UTRAN2");
  ASSERT_TRUE(source.has_value());
  EXPECT_EQ((*source)->technology(), "UTRAN2");
  EXPECT_EQ(readEvent(**source).technology, "UTRAN2");
}

TEST_F(RecordingSourceTest, StartsAgainFromTheFirstMessage) {
  auto source = open(joined({captureHeader(147), twoRecords()}));
  ASSERT_TRUE(source.has_value());
  readToEnd(**source);
  ASSERT_TRUE((*source)->restart());
  const auto events = readToEnd(**source);
  ASSERT_EQ(events.size(), 2U);
  EXPECT_EQ(events[0].time, microseconds(0));
}

TEST_F(RecordingSourceTest, ACutFileYieldsWhatIsWholeAndThenSaysSo) {
  auto contents = joined({captureHeader(147), twoRecords()});
  contents.pop_back();
  auto source = open(contents);
  ASSERT_TRUE(source.has_value());
  EXPECT_EQ(readEvent(**source).message, (Bytes{'a', 'b', 'c'}));
  const auto step = (*source)->next();
  ASSERT_FALSE(step.has_value());
  EXPECT_THAT(step.error().message, HasSubstr("record 2: truncated"));
}

TEST_F(RecordingSourceTest, MessagesThatTheRecorderCutAreLeftOutAndCounted) {
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
