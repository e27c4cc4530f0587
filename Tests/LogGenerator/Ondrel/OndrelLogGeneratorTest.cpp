// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "LogGenerator/Ondrel/OndrelLogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Optional;
using ::testing::SizeIs;

/// The base alone, without a channel.
class CollectingGenerator : public OndrelLogGenerator {
 public:
  explicit CollectingGenerator(const GeneratorServices& services) : OndrelLogGenerator(services) {}
  void updateStateWithData(Dictionary& /*state*/, ByteView data) override { collect(data); }
  Value generateLogUsingState(Dictionary& state) override {
    handOverCollected(state);
    return {};
  }
  [[nodiscard]] Dictionary getStartCommand() const override { return {}; }
  using OndrelLogGenerator::versionReport;
};

class OndrelLogGeneratorTest : public ::testing::Test {
 protected:
  OndrelLogGeneratorTest() {
    platform.clock().setNow(Moment(std::chrono::milliseconds(1330862709'900)));  // 0x4F535A75
  }

  void addEntry(const Value& displayState) {
    if (!state.contains("History")) state.set("History", Array());
    Dictionary entry;
    if (!displayState.isNull()) entry.set("DisplayState", displayState);
    state["History"].array().append(entry);
  }

  Bytes dlf() { return generator.generateDlfFromState(state).value(); }

  std::vector<int> dlfBytes(std::size_t offset, std::size_t count) {
    const Bytes bytes = dlf();
    return {bytes.begin() + static_cast<std::ptrdiff_t>(offset),
            bytes.begin() + static_cast<std::ptrdiff_t>(offset + count)};
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  CollectingGenerator generator{generatorServices(platform)};
  Dictionary state;
};

TEST_F(OndrelLogGeneratorTest, ExportsAVersionReportAloneForAnEmptyHistory) {
  EXPECT_THAT(dlf(), SizeIs(161));
  EXPECT_THAT(dlfBytes(0, 4), ElementsAre(0xA1, 0x00, 0xFD, 0x1F));
  state.set("History", Array());
  EXPECT_THAT(dlf(), SizeIs(161));
}

TEST_F(OndrelLogGeneratorTest, ExportsEachBufferWithoutItsFirstByte) {
  addEntry(Value::data({0x01}));
  addEntry(Value::data({1, 2, 3, 4, 5, 6, 7, 8, 9, 10}));
  EXPECT_THAT(dlf(), SizeIs(170));
  EXPECT_THAT(dlfBytes(161, 9), ElementsAre(2, 3, 4, 5, 6, 7, 8, 9, 10));
}

TEST_F(OndrelLogGeneratorTest, DropsOneByteOfABufferHoweverManyPacketsItHolds) {
  addEntry(Value::data({0x01, 0xAA, 0x01, 0xBB}));
  addEntry(Value::data({0x01, 0xCC}));
  EXPECT_THAT(dlfBytes(161, 4), ElementsAre(0xAA, 0x01, 0xBB, 0xCC));
}

TEST_F(OndrelLogGeneratorTest, SkipsEntriesWithoutPackets) {
  addEntry(Value());
  addEntry(Value::data({}));
  EXPECT_THAT(dlf(), SizeIs(161));
}

TEST_F(OndrelLogGeneratorTest, AbortsAtAnEntryWhosePacketsAreNoData) {
  addEntry(Value::data({1, 2, 3}));
  addEntry("text");
  EXPECT_FALSE(generator.generateDlfFromState(state));
  EXPECT_THAT(platform.systemLog().lines(),
              ElementsAre(RecordingSystemLog::Line{
                  LogPriority::Error,
                  "Got wrong class writing history to DLF; aborting writing the DLF file"}));
}

TEST_F(OndrelLogGeneratorTest, SaysWhenTheVersionReportDoesNotFit) {
  EXPECT_FALSE(generator.versionReport(160));
  EXPECT_THAT(platform.systemLog().lines(),
              ElementsAre(RecordingSystemLog::Line{LogPriority::Error,
                                                   "Could not write DLF header (result=3)"}));
  EXPECT_THAT(generator.versionReport(161), Optional(SizeIs(161)));
}

TEST_F(OndrelLogGeneratorTest, SavesTheHistoryAloneWhenThereIsNoDlf) {
  addEntry("text");
  EXPECT_THAT(generator.getSaveContentsFromState(state), SizeIs(1));
}

TEST_F(OndrelLogGeneratorTest, SavesTheHistoryAndThenTheDlf) {
  addEntry(Value::data({1, 2, 3}));
  const Array contents = generator.getSaveContentsFromState(state);
  ASSERT_EQ(contents.size(), 2U);
  const Dictionary element = contents[1].dictionary();
  ASSERT_EQ(element.size(), 2U);
  EXPECT_EQ(element.keyAt(0), Value("Description"));
  EXPECT_EQ(element.valueAt(0), Value("DLF binary (163 bytes)"));
  EXPECT_EQ(element.keyAt(1), Value("DLF"));
  EXPECT_EQ(element.valueAt(1).bytes().size(), 163U);
}

TEST_F(OndrelLogGeneratorTest, DescribesTheDlfOfAnEmptyHistory) {
  const Array contents = generator.getSaveContentsFromState(state);
  ASSERT_EQ(contents.size(), 1U);
  EXPECT_EQ(contents[0].dictionary()["Description"], Value("DLF binary (161 bytes)"));
}

TEST_F(OndrelLogGeneratorTest, ReportsVersionDateAndWholeSeconds) {
  platform.bundle().setVersion("1.0");
  const Bytes bytes = dlf();
  EXPECT_EQ(std::string(bytes.begin() + 16, bytes.begin() + 23), std::string("Kestro\0", 7));
  EXPECT_EQ(std::string(bytes.begin() + 63, bytes.begin() + 80), "Mar  4 2012 13:05");
  EXPECT_THAT(dlfBytes(97, 4), ElementsAre(0x75, 0x5A, 0x53, 0x4F));
}

TEST_F(OndrelLogGeneratorTest, ReportsAMissingVersion) {
  platform.bundle().setVersion(std::nullopt);
  const Bytes bytes = dlf();
  EXPECT_EQ(std::string(bytes.begin() + 16, bytes.begin() + 23), std::string("(none)\0", 7));
}

TEST_F(OndrelLogGeneratorTest, ReportsAZoneWestOfGreenwich) {
  platform.clock().setTimeZone(-std::chrono::minutes(210), false);
  EXPECT_THAT(dlfBytes(101, 4), ElementsAre(0x2E, 0xFF, 0, 0));
}

TEST_F(OndrelLogGeneratorTest, TruncatesTheZoneTowardZero) {
  platform.clock().setTimeZone(std::chrono::seconds(-119), true);
  EXPECT_THAT(dlfBytes(101, 4), ElementsAre(0xFF, 0xFF, 1, 0));
}

TEST_F(OndrelLogGeneratorTest, HandsItsPacketsOverOnce) {
  generator.updateStateWithData(state, Bytes{1, 2});
  generator.updateStateWithData(state, Bytes{3});
  generator.generateLogUsingState(state);
  EXPECT_EQ(state["DisplayState"], Value::data({1, 2, 3}));
  generator.generateLogUsingState(state);
  EXPECT_EQ(state["DisplayState"], Value::data({}));
}

// --- The most that an entry keeps

constexpr std::size_t kMebibyte = std::size_t{1024} * 1024;

TEST_F(OndrelLogGeneratorTest, AnEntryKeepsSixteenMebibytesOfPackets) {
  generator.updateStateWithData(state, Bytes(10 * kMebibyte, 1));
  generator.updateStateWithData(state, Bytes(6 * kMebibyte, 2));
  generator.generateLogUsingState(state);
  EXPECT_THAT(state["DisplayState"].bytes(), SizeIs(16 * kMebibyte));
  EXPECT_THAT(platform.systemLog().lines(), IsEmpty());
}

TEST_F(OndrelLogGeneratorTest, WhatComesAfterAPacketThatDoesNotFitIsNotKeptEither) {
  generator.updateStateWithData(state, Bytes(10 * kMebibyte, 1));
  generator.updateStateWithData(state, Bytes(6 * kMebibyte + 1, 2));
  generator.updateStateWithData(state, Bytes{3});
  generator.generateLogUsingState(state);
  EXPECT_EQ(state["DisplayState"], Value::data(Bytes(10 * kMebibyte, 1)));
}

TEST_F(OndrelLogGeneratorTest, EachEntrySaysOnceHowManyPacketsItDoesNotKeep) {
  for (const unsigned extra : {3U, 1U, 0U}) {
    generator.updateStateWithData(state, Bytes(16 * kMebibyte, 1));
    for (unsigned i = 0; i < extra; ++i) generator.updateStateWithData(state, Bytes{2});
    generator.generateLogUsingState(state);
  }
  const auto line = [](std::string_view count) {
    return RecordingSystemLog::Line{
        LogPriority::Error,
        "History: packets beyond 16 MiB are not kept (" + std::string(count) + " of this entry)"};
  };
  EXPECT_THAT(platform.systemLog().lines(), ElementsAre(line("3"), line("1")));
}

}  // namespace
}  // namespace kestro
