// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "Platform/Linux/LinuxPlatform.h"
#include "Recordings/SnapshotFile.h"

namespace kestro {
namespace {

using namespace std::string_view_literals;
using ::testing::HasSubstr;

constexpr std::string_view kSmallestFile =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<plist version=\"1.0\">\n"
    "<dict>\n"
    "\t<key>Timestamp</key>\n"
    "\t<string>2012-03-04 13:05:09 +0100</string>\n"
    "</dict>\n"
    "</plist>\n";

class SnapshotFileTest : public ::testing::Test {
 protected:
  [[nodiscard]] std::string fileText(const Dictionary& snapshot) const {
    const Bytes file = snapshotFile(*coding, snapshot).value();
    return {file.begin(), file.end()};
  }

  [[nodiscard]] Result<Dictionary> parse(std::string_view text) const {
    return parseSnapshot(*coding, Bytes(text.begin(), text.end()));
  }

  /// Why a text is no snapshot; "(accepted)" when it is one.
  [[nodiscard]] std::string refusal(std::string_view text) const {
    const auto snapshot = parse(text);
    return snapshot ? "(accepted)" : snapshot.error().message;
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
};

// --- Writing

TEST_F(SnapshotFileTest, IsAnXmlListOfTheDictionary) {
  EXPECT_EQ(fileText({{"Timestamp", "2012-03-04 13:05:09 +0100"}}), kSmallestFile);
}

TEST_F(SnapshotFileTest, KeepsTheOrderOfTheDictionary) {
  const std::string file =
      fileText({{"Timestamp", "t"}, {"Data", Array()}, {"Description", "d"}, {"A", "last"}});
  EXPECT_LT(file.find("<key>Timestamp</key>"), file.find("<key>Data</key>"));
  EXPECT_LT(file.find("<key>Data</key>"), file.find("<key>Description</key>"));
  EXPECT_LT(file.find("<key>Description</key>"), file.find("<key>A</key>"));
}

TEST_F(SnapshotFileTest, WhatXmlCannotHoldIsReplacedAndTheRestWritten) {
  const std::string file = fileText({{"Timestamp", "t"}, {"A", "x\xFF"}, {"B", "\0!"sv}});
  EXPECT_THAT(file, HasSubstr("<string>x\uFFFD</string>"));
  EXPECT_THAT(file, HasSubstr("<string>\uFFFD!</string>"));
  EXPECT_THAT(file, HasSubstr("<string>t</string>"));
}

TEST_F(SnapshotFileTest, TheDeepestMessageIsWrittenAllTheSame) {
  Array message;
  for (int level = 1; level < 128; ++level) message = Array{message};
  const std::string file =
      fileText({{"Timestamp", "t"}, {"Data", Array{Dictionary{{"DisplayState", message}}}}});
  EXPECT_EQ(refusal(file), "(accepted)");
}

TEST_F(SnapshotFileTest, ADateBeyondTheYearsOfAFileIsAFailure) {
  const auto file = snapshotFile(
      *coding, {{"Data", Value::date(Moment(std::chrono::hours(71'000'000)))}});  // 10069
  ASSERT_FALSE(file);
  EXPECT_EQ(file.error().message, "the snapshot cannot be serialised");
}

// --- Reading

TEST_F(SnapshotFileTest, ReadsADictionaryWithATimestamp) {
  const auto snapshot = parse(kSmallestFile);
  ASSERT_TRUE(snapshot);
  EXPECT_EQ(Value(*snapshot), Value(Dictionary{{"Timestamp", "2012-03-04 13:05:09 +0100"}}));
}

TEST_F(SnapshotFileTest, ReadsWhatWasWritten) {
  const Dictionary snapshot{{"Timestamp", "t"},
                            {"Data", Array{Dictionary{{"DisplayState", Value::data({1, 2, 3})}}}},
                            {"Description", "d"}};
  const auto read = parse(fileText(snapshot));
  ASSERT_TRUE(read);
  EXPECT_EQ(Value(*read), Value(snapshot));
}

TEST_F(SnapshotFileTest, RefusesWhatIsNoSnapshot) {
  EXPECT_THAT(refusal(""), HasSubstr("property list"));
  EXPECT_THAT(refusal("garbage"), HasSubstr("property list"));
  EXPECT_EQ(refusal("<plist version=\"1.0\"><array/></plist>"),
            "no snapshot: the list is no dictionary but of type array");
  EXPECT_EQ(refusal("<plist version=\"1.0\"><dict/></plist>"),
            "no snapshot: it has no \"Timestamp\"");
  EXPECT_EQ(refusal("<plist version=\"1.0\"><dict><key>Timestamp</key><true/></dict></plist>"),
            "no snapshot: it has no \"Timestamp\"");
}

TEST_F(SnapshotFileTest, EveryCutFileIsRefused) {
  const std::size_t end = kSmallestFile.rfind("</plist>") + 8;
  for (std::size_t length = 0; length < end; ++length) {
    EXPECT_NE(refusal(kSmallestFile.substr(0, length)), "(accepted)") << length;
  }
  EXPECT_EQ(refusal(kSmallestFile.substr(0, end)), "(accepted)");
}

TEST_F(SnapshotFileTest, ReadsWhatIsTooLargeForAMessage) {
  Array message;
  for (int i = 0; i < 199'999; ++i) message.append(Value::boolean(true));
  Array history;
  for (int i = 0; i < 5; ++i) {
    history.append(Dictionary{{"DisplayState", message}, {"Display", message}});
  }
  EXPECT_EQ(refusal(fileText({{"Timestamp", "t"}, {"Data", history}})), "(accepted)");
}

TEST_F(SnapshotFileTest, ReadsDisplaysOfManyKeys) {
  Dictionary message;
  for (int i = 0; i < 3'200; ++i) message.set("key " + std::to_string(i), "value");
  Array history;
  for (int i = 0; i < 5; ++i) {
    history.append(Dictionary{{"DisplayState", message}, {"Display", message}});
  }
  const Dictionary snapshot{{"Timestamp", "t"}, {"Data", history}};
  const auto read = parse(fileText(snapshot));
  ASSERT_TRUE(read) << read.error().message;
  EXPECT_EQ(Value(*read), Value(snapshot));
}

TEST_F(SnapshotFileTest, ReadsTheLargestMessageOfKeysAlone) {
  Dictionary message;  // 200,000 nodes, as many as a message may have
  for (int i = 0; i < 99'999; ++i) message.set("key " + std::to_string(i), "");
  EXPECT_EQ(refusal(fileText({{"Timestamp", "t"}, {"Data", Array{message}}})), "(accepted)");
}

TEST_F(SnapshotFileTest, ReadsATextOfMarkupAlone) {
  EXPECT_EQ(refusal(fileText({{"Timestamp", "t"}, {"Data", std::string(200'000, '&')}})),
            "(accepted)");
}

TEST_F(SnapshotFileTest, FindsTheDlfLog) {
  const Dictionary dlf{{"Description", "DLF binary (2 bytes)"}, {"DLF", Value::data({7, 8})}};
  EXPECT_EQ(dlfOfSnapshot({{"Data", Array{Dictionary{{"Display", "x"}}, dlf}}}),
            Value::data({7, 8}));
}

TEST_F(SnapshotFileTest, FindsNoDlfLogWhereThereIsNone) {
  EXPECT_TRUE(dlfOfSnapshot({}).isNull());
  EXPECT_TRUE(dlfOfSnapshot({{"Data", "text"}}).isNull());
  EXPECT_TRUE(dlfOfSnapshot({{"Data", Array{"text", Dictionary{{"DLF", "text"}}}}}).isNull());
}

}  // namespace
}  // namespace kestro
