// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Model/Snapshot.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Recordings/SnapshotFile.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using namespace std::string_view_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

/// 2012-03-04 12:05:09 UTC
constexpr Moment kOpened{std::chrono::seconds(1'330'862'709)};
constexpr const char* kPathWhenOpened =
    "/var/mobile/Library/Logs/CrashReporter/KestroSnapshot-1330862709.kestro";

class SnapshotTest : public ::testing::Test {
 protected:
  SnapshotTest() {
    platform.clock().setNow(kOpened);
    platform.clock().setTimeZone(1h, false);
  }

  Snapshot open(const Value& saveContents) { return {platform.clock(), saveContents}; }

  std::string fileText(const Value& saveContents, std::string_view description) {
    const Bytes file = open(saveContents).file(*coding, description).value();
    return {file.begin(), file.end()};
  }

  /// The names of the files on the device.
  std::vector<std::string> paths() {
    std::vector<std::string> result;
    for (const auto& [path, contents] : platform.deviceRoot().files()) result.push_back(path);
    return result;
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
};

TEST_F(SnapshotTest, IsAnXmlListOfTimestampDataAndDescription) {
  EXPECT_EQ(fileText(Array{Dictionary{{"Description", "Snapshot (x)"}}}, "tunnel"),
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
            "<plist version=\"1.0\">\n"
            "<dict>\n"
            "\t<key>Timestamp</key>\n"
            "\t<string>2012-03-04 13:05:09 +0100</string>\n"
            "\t<key>Data</key>\n"
            "\t<array>\n"
            "\t\t<dict>\n"
            "\t\t\t<key>Description</key>\n"
            "\t\t\t<string>Snapshot (x)</string>\n"
            "\t\t</dict>\n"
            "\t</array>\n"
            "\t<key>Description</key>\n"
            "\t<string>tunnel</string>\n"
            "</dict>\n"
            "</plist>\n");
}

TEST_F(SnapshotTest, AnEmptyHistoryIsAnEmptyArray) {
  EXPECT_EQ(
      Value(open(Array()).dictionary("d")),
      Value(Dictionary{
          {"Timestamp", "2012-03-04 13:05:09 +0100"}, {"Data", Array()}, {"Description", "d"}}));
}

TEST_F(SnapshotTest, AnEmptyDescriptionIsAnEmptyString) {
  EXPECT_EQ(open(Array()).dictionary("")["Description"], Value(""));
}

TEST_F(SnapshotTest, WithoutSaveContentsThereIsATimestampOnly) {
  EXPECT_EQ(Value(open(Value()).dictionary("lost")),
            Value(Dictionary{{"Timestamp", "2012-03-04 13:05:09 +0100"}}));
  EXPECT_TRUE(open(Value()).file(*coding, "lost"));
}

TEST_F(SnapshotTest, TheTimestampIsThatOfTheOpening) {
  const Snapshot snapshot = open(Array());
  platform.clock().setNow(kOpened + 40s);
  EXPECT_EQ(snapshot.dictionary("")["Timestamp"], Value("2012-03-04 13:05:09 +0100"));
}

TEST_F(SnapshotTest, TheFileNameIsThatOfTheSaving) {
  const Snapshot snapshot = open(Array());
  platform.clock().setNow(kOpened + 40'999ms);
  EXPECT_TRUE(snapshot.save(platform, ""));
  EXPECT_THAT(
      paths(),
      ElementsAre("/var/mobile/Library/Logs/CrashReporter/KestroSnapshot-1330862749.kestro"));
  EXPECT_THAT(platform.systemLog().lines(), IsEmpty());
}

TEST_F(SnapshotTest, TimesBefore1970HaveWholeSecondsToo) {
  EXPECT_EQ(snapshotPath(Moment(-1ms)),
            "/var/mobile/Library/Logs/CrashReporter/KestroSnapshot--1.kestro");
}

TEST_F(SnapshotTest, TheLaterOfTwoInOneSecondStays) {
  ASSERT_TRUE(open(Array()).save(platform, "first"));
  platform.clock().setNow(kOpened + 999ms);
  ASSERT_TRUE(open(Array()).save(platform, "second"));
  ASSERT_THAT(paths(), ElementsAre(kPathWhenOpened));
  const Bytes& file = platform.deviceRoot().files().begin()->second;
  EXPECT_THAT(std::string(file.begin(), file.end()), HasSubstr("<string>second</string>"));
}

TEST_F(SnapshotTest, AFailedWriteHasItsLine) {
  platform.deviceRoot().setWriteFailure("no such directory");
  EXPECT_FALSE(open(Array()).save(platform, ""));
  EXPECT_THAT(
      platform.systemLog().lines(),
      ElementsAre(RecordingSystemLog::Line{
          LogPriority::Error, std::string("Unable to write snapshot to ") + kPathWhenOpened}));
}

TEST_F(SnapshotTest, WhatCannotBeSerialisedIsAFailedWrite) {
  const Array outOfRange{Value::date(Moment(std::chrono::hours(71'000'000)))};  // the year 10069
  EXPECT_FALSE(open(outOfRange).file(*coding, ""));
  EXPECT_FALSE(open(outOfRange).save(platform, ""));
  EXPECT_EQ(platform.systemLog().lines().size(), 1U);
  EXPECT_THAT(paths(), IsEmpty());
}

TEST_F(SnapshotTest, ABadTextIsReplacedAndTheRestSaved) {
  const std::string file =
      fileText(Array{Dictionary{{"Display", Dictionary{{"A", "x\xFF"}, {"B", "good"}}}}}, "\0!"sv);
  EXPECT_THAT(file, HasSubstr("<string>x\uFFFD</string>"));
  EXPECT_THAT(file, HasSubstr("<string>good</string>"));
  EXPECT_THAT(file, HasSubstr("<string>\uFFFD!</string>"));
}

TEST_F(SnapshotTest, ItsFileReadsAsItsDictionary) {
  const Array history{Dictionary{{"DisplayState", Value::data({1, 2, 3})}}};
  const auto read = parseSnapshot(*coding, open(history).file(*coding, "d").value());
  ASSERT_TRUE(read);
  EXPECT_EQ(Value(*read), Value(open(history).dictionary("d")));
}

TEST_F(SnapshotTest, KeepsACopyOfTheSaveContents) {
  Array history{"before"};
  const Snapshot snapshot = open(history);
  history.append("after");
  EXPECT_EQ(snapshot.entries().size(), 1U);
  EXPECT_EQ(snapshot.dictionary("")["Data"], Value(Array{"before"}));
}

TEST_F(SnapshotTest, ListsItsEntriesByTheirDescriptions) {
  const Snapshot snapshot =
      open(Array{Dictionary{{"Description", "Snapshot (x)"}}, Dictionary(), "no entry"});
  ASSERT_EQ(snapshot.entries().size(), 3U);
  EXPECT_EQ(entryDescription(snapshot.entries()[0]), "Snapshot (x)");
  EXPECT_EQ(entryDescription(snapshot.entries()[1]), "");
  EXPECT_EQ(entryDescription(snapshot.entries()[2]), "");
  EXPECT_TRUE(open(Value()).entries().empty());
}

}  // namespace
}  // namespace kestro
