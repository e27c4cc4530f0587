// SPDX-License-Identifier: MIT
// Snapshots read as recordings.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "Platform/Linux/LinuxPlatform.h"
#include "Recordings/SnapshotFile.h"
#include "Recordings/SnapshotReader.h"
#include "Tests/Recordings/DlfBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::seconds;
using ::testing::ElementsAre;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

Bytes message(std::uint8_t type, std::uint16_t code) {
  Bytes result = dlfRecord(code, kDlfTestTime, "x");
  result.insert(result.begin(), type);
  return result;
}

Bytes joined(const Bytes& first, const Bytes& second) {
  Bytes result = first;
  result.insert(result.end(), second.begin(), second.end());
  return result;
}

Dictionary entry(std::string_view date, const Value& state) {
  return {{"DisplayState", state}, {"Date", date}};
}

class SnapshotReaderTest : public ::testing::Test {
 protected:
  Result<std::unique_ptr<SnapshotReader>> open(const Array& data,
                                               std::string_view technology = {}) {
    const Dictionary snapshot{
        {"Timestamp", "2012-03-04 13:05:09 +0100"}, {"Data", data}, {"Description", ""}};
    return openFile(_coding->xml(snapshot).value(), technology);
  }
  Result<std::unique_ptr<SnapshotReader>> openFile(const Bytes& file,
                                                   std::string_view technology = {}) {
    _path = _directory.write("a.kestro", file);
    return SnapshotReader::open(RecordedFile::open(_path).value(),
                                {.coding = *_coding,
                                 .technologiesOfCode = technologiesOfTestCode,
                                 .technology = technology});
  }

  TemporaryDirectory _directory;
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  std::string _path;
};

TEST_F(SnapshotReaderTest, AnEntrysPacketsAreMessagesAtItsDate) {
  const Bytes first = message(1, 0xB0C2);
  const Bytes second = message(0xFF, 2);
  const auto reader =
      open({entry("2012-03-04 13:05:07 +0100", Value::data(joined(first, second))),
            entry("2012-03-04 13:05:09 +0100", Value::data(first)),
            Dictionary{{"Description", "DLF binary"}, {"DLF", Value::data(dlfVersionReport())}}})
          .value();
  EXPECT_EQ(reader->form(), RecordingForm::Snapshot);
  EXPECT_THAT(reader->technologies(), ElementsAre("LTE"));
  const Moment start{seconds(kDlfTestSecond)};
  const auto one = reader->next().value().value();
  EXPECT_EQ(one.time, start - seconds(2));
  EXPECT_EQ(one.technology, "LTE");
  EXPECT_THAT(one.bytes, ElementsAreArray(first));
  const auto two = reader->next().value().value();
  EXPECT_EQ(two.time, start - seconds(2));
  EXPECT_THAT(two.bytes, ElementsAreArray(second));
  const auto three = reader->next().value().value();
  EXPECT_EQ(three.time, start);
  EXPECT_EQ(three.number, 3U);
  EXPECT_FALSE(reader->next().value().has_value());
  EXPECT_EQ(reader->fractionRead(), 1.0);
}

TEST_F(SnapshotReaderTest, AMessageOfIFXIsEncodedAnew) {
  const Dictionary list{{"01;Mode", Dictionary{{"Band", "GSM 900"}}}};
  const auto reader = open({entry("2012-03-04 13:05:09 +0100", list)}).value();
  EXPECT_THAT(reader->technologies(), ElementsAre("IFX"));
  const auto read = reader->next().value().value();
  EXPECT_EQ(read.technology, "IFX");
  EXPECT_EQ(read.time, Moment(seconds(kDlfTestSecond)));
  EXPECT_THAT(read.bytes, ElementsAreArray(_coding->binary(list).value()));
  EXPECT_FALSE(reader->next().value().has_value());
}

TEST_F(SnapshotReaderTest, ThePacketsTechnologyIsFoundOrAskedFor) {
  const Array data{entry("2012-03-04 13:05:09 +0100", Value::data(message(1, 0x4101)))};
  const auto undecided = open(data);
  ASSERT_FALSE(undecided.has_value());
  EXPECT_EQ(undecided.error().message, _path +
                                           ": UTRAN2 and Ondrel_GSM have the codes of all packets; "
                                           "--technology must say which it is");
  EXPECT_EQ(open(data, "UTRAN2").value()->next().value().value().technology, "UTRAN2");
}

TEST_F(SnapshotReaderTest, PrefixesAreLeftOut) {
  const Bytes packet = message(1, 0xB0C2);
  const auto reader = open({entry("", Value::data(joined({0x81, 0x33}, packet)))}).value();
  EXPECT_THAT(reader->next().value().value().bytes, ElementsAreArray(packet));
}

TEST_F(SnapshotReaderTest, WhatDoesNotFrameIsNamedBehindAllElse) {
  const Bytes packet = message(1, 0xB0C2);
  const auto reader = open({entry("", Value::data(joined(packet, {1, 12, 0, 5, 5}))),
                            entry("", Value::data(packet))})
                          .value();
  EXPECT_TRUE(reader->next().value().has_value());
  EXPECT_TRUE(reader->next().value().has_value());
  for (int i = 0; i < 2; ++i) {
    const auto end = reader->next();
    ASSERT_FALSE(end.has_value());
    EXPECT_EQ(end.error().message,
              _path + ": entry 1: the last 5 bytes are no packets and are left out");
  }
}

TEST_F(SnapshotReaderTest, ABadDateIsThatBefore) {
  const Value packet = Value::data(message(1, 0xB0C2));
  const auto reader = open({entry("yesterday", packet), entry("2012-03-04 12:05:11 +0000", packet),
                            Dictionary{{"DisplayState", packet}}})
                          .value();
  const Moment stamp{seconds(kDlfTestSecond)};
  EXPECT_EQ(reader->next().value().value().time, stamp);
  EXPECT_EQ(reader->next().value().value().time, stamp + seconds(2));
  EXPECT_EQ(reader->next().value().value().time, stamp + seconds(2));
}

TEST_F(SnapshotReaderTest, ASnapshotWithoutHistoryHasNoMessages) {
  const auto reader = open({Dictionary{}}).value();
  EXPECT_THAT(reader->technologies(), IsEmpty());
  EXPECT_FALSE(reader->next().value().has_value());
}

TEST_F(SnapshotReaderTest, WhatIsNoSnapshotIsRefused) {
  const auto other = openFile(_coding->xml(Dictionary{{"a", "b"}}).value());
  ASSERT_FALSE(other.has_value());
  EXPECT_EQ(other.error().message, _path + ": no snapshot: it has no \"Timestamp\"");
  const auto cut = openFile({'<', '?', 'x', 'm', 'l'});
  ASSERT_FALSE(cut.has_value());
  EXPECT_TRUE(cut.error().message.starts_with(_path + ": ")) << cut.error().message;
}

TEST(MomentOfDate, CountsTheZone) {
  EXPECT_EQ(momentOfDate("2012-03-04 13:05:09 +0100"), Moment(seconds(kDlfTestSecond)));
  EXPECT_EQ(momentOfDate("2012-03-04 08:35:09 -0330"), Moment(seconds(kDlfTestSecond)));
  EXPECT_EQ(momentOfDate("1970-01-01 00:00:00 +0000"), Moment());
}

TEST(MomentOfDate, OtherTextsAreNone) {
  for (const std::string_view text :
       {"", "2012-03-04 13:05:09", "2012-03-04 13:05:09 +01:0", "2012-13-04 13:05:09 +0100",
        "2012-02-30 13:05:09 +0100", "2012-03-04 24:05:09 +0100", "2012-03-04 13:60:09 +0100",
        "2012-03-04 13:05:61 +0100", "2012/03/04 13:05:09 +0100", "0000-03-04 13:05:09 +0100",
        "2012-03-04 13:05:09 *0100", "2012-03-0x 13:05:09 +0100"}) {
    EXPECT_EQ(momentOfDate(text), std::nullopt) << text;
  }
}

}  // namespace
}  // namespace kestro
