// SPDX-License-Identifier: MIT
// Reading captures: whole, cut, damaged, and what is none.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Recordings/PcapReader.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using ::testing::HasSubstr;
using ::testing::StartsWith;
using testing::TemporaryDirectory;

constexpr std::size_t kHeaderLength = 24;
constexpr std::size_t kFirstRecordLength = 16 + 3;

class PcapReaderTest : public ::testing::Test {
 protected:
  Result<PcapReader> open(const Bytes& contents) {
    return PcapReader::open(_directory.write("a.pcap", contents));
  }
  static std::string textOf(const RecordedMessage& message) {
    return {message.bytes.begin(), message.bytes.end()};
  }

  TemporaryDirectory _directory;
};

TEST_F(PcapReaderTest, YieldsEveryMessageWithItsNumberAndTime) {
  auto reader = open(joined({captureHeader(147), twoRecords()}));
  ASSERT_TRUE(reader.has_value()) << reader.error().message;

  const auto first = reader->next();
  ASSERT_TRUE(first.has_value() && first->has_value());
  EXPECT_EQ((*first)->number, 1U);
  EXPECT_EQ((*first)->time, Moment(microseconds(1'330'862'709'000'250)));
  EXPECT_EQ(textOf(**first), "abc");

  const auto second = reader->next();
  ASSERT_TRUE(second.has_value() && second->has_value());
  EXPECT_EQ((*second)->number, 2U);
  EXPECT_EQ((*second)->time, Moment(microseconds(1'330'862'710'500'250)));
  EXPECT_EQ(textOf(**second), "de");

  const auto end = reader->next();
  ASSERT_TRUE(end.has_value());
  EXPECT_FALSE(end->has_value());
  EXPECT_EQ(reader->messageCount(), 2U);
  EXPECT_EQ(reader->cutMessageCount(), 0U);
}

TEST_F(PcapReaderTest, LinkTypeNamesTheTechnology) {
  const std::vector<std::pair<std::uint8_t, std::string_view>> expected = {
      {147, "IFX"}, {148, "Ondrel_GSM"}, {149, "Ondrel_CDMA"}, {150, "LTE"}, {151, "UTRAN2"}};
  for (const auto& [linkType, technology] : expected) {
    const auto reader = open(captureHeader(linkType));
    ASSERT_TRUE(reader.has_value()) << reader.error().message;
    EXPECT_EQ(reader->technology(), technology);
  }
}

TEST_F(PcapReaderTest, AnotherLinkTypeIsRefusedByNumber) {
  for (const int linkType : {1, 146, 152}) {
    const auto reader = open(captureHeader(static_cast<std::uint8_t>(linkType)));
    ASSERT_FALSE(reader.has_value());
    EXPECT_THAT(reader.error().message, HasSubstr("link type " + std::to_string(linkType)));
  }
}

TEST_F(PcapReaderTest, ACaptureWithoutMessagesIsAtItsEnd) {
  auto reader = open(captureHeader(150));
  ASSERT_TRUE(reader.has_value());
  const auto message = reader->next();
  ASSERT_TRUE(message.has_value());
  EXPECT_FALSE(message->has_value());
}

TEST_F(PcapReaderTest, WholeRecordsBeforeACutAreYieldedAtEveryLength) {
  const auto whole = joined({captureHeader(147), twoRecords()});
  for (std::size_t length = kHeaderLength; length < whole.size(); ++length) {
    auto reader = open(Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(length)));
    ASSERT_TRUE(reader.has_value()) << length;
    const std::size_t firstEnd = kHeaderLength + kFirstRecordLength;
    const std::uint64_t wholeRecords = length >= firstEnd ? 1 : 0;
    for (std::uint64_t i = 0; i < wholeRecords; ++i) {
      const auto message = reader->next();
      ASSERT_TRUE(message.has_value() && message->has_value()) << length;
      EXPECT_EQ(textOf(**message), "abc");
    }
    const auto last = reader->next();
    const bool cutsBetweenRecords = length == kHeaderLength || length == firstEnd;
    ASSERT_EQ(last.has_value(), cutsBetweenRecords) << length;
    if (last.has_value()) {
      EXPECT_FALSE(last->has_value()) << length;
    } else {
      EXPECT_THAT(last.error().message,
                  HasSubstr("record " + std::to_string(wholeRecords + 1) + ": truncated"));
    }
  }
}

TEST_F(PcapReaderTest, ACutFileHeaderIsRefusedAtEveryLength) {
  const auto header = captureHeader(147);
  for (std::size_t length = 0; length < header.size(); ++length) {
    const auto reader =
        open(Bytes(header.begin(), header.begin() + static_cast<std::ptrdiff_t>(length)));
    ASSERT_FALSE(reader.has_value()) << length;
    EXPECT_THAT(reader.error().message, StartsWith(_directory.pathOf("a.pcap")));
  }
}

TEST_F(PcapReaderTest, AnEmptyFileIsCalledEmpty) {
  const auto reader = open({});
  ASSERT_FALSE(reader.has_value());
  EXPECT_EQ(reader.error().message, _directory.pathOf("a.pcap") + ": the file is empty");
}

TEST_F(PcapReaderTest, WhatIsNoCaptureIsRefused) {
  const auto path = _directory.write("a.txt", std::string_view("Timestamp,Longitude,Latitude\n"));
  const auto reader = PcapReader::open(path);
  ASSERT_FALSE(reader.has_value());
  EXPECT_THAT(reader.error().message, StartsWith(path + ": unknown file format"));
}

TEST_F(PcapReaderTest, AMissingFileIsNamedOnce) {
  const auto path = _directory.pathOf("none.pcap");
  const auto reader = PcapReader::open(path);
  ASSERT_FALSE(reader.has_value());
  EXPECT_EQ(reader.error().message, path + ": No such file or directory");
}

TEST_F(PcapReaderTest, ADirectoryIsRefused) {
  const auto reader = PcapReader::open(_directory.pathOf(""));
  ASSERT_FALSE(reader.has_value());
  EXPECT_THAT(reader.error().message, HasSubstr("Is a directory"));
}

TEST_F(PcapReaderTest, AnImpossibleRecordLengthEndsTheReadingForGood) {
  const Bytes record = {0, 0, 0, 0, 0, 0, 0, 0, 0xFF, 0xFF, 0xFF, 0x7F, 0xFF, 0xFF, 0xFF, 0x7F};
  auto reader = open(joined({captureHeader(147), record, twoRecords()}));
  ASSERT_TRUE(reader.has_value());
  const auto first = reader->next();
  ASSERT_FALSE(first.has_value());
  EXPECT_THAT(first.error().message, HasSubstr("record 1: "));
  const auto again = reader->next();
  ASSERT_FALSE(again.has_value());
  EXPECT_EQ(again.error().message, first.error().message);
}

TEST_F(PcapReaderTest, SecondsAreUnsignedUpTo2106) {
  // 2038-01-19 03:14:08, the first second beyond 31 bits, and 2106-02-07 06:28:15.999999, the last.
  const Bytes records = {0,    0,    0,    0x80, 0,    0,    0,    0, 1, 0, 0, 0, 1, 0, 0, 0, 'a',
                         0xFF, 0xFF, 0xFF, 0xFF, 0x3F, 0x42, 0x0F, 0, 1, 0, 0, 0, 1, 0, 0, 0, 'b'};
  auto reader = open(joined({captureHeader(147), records}));
  ASSERT_TRUE(reader.has_value());
  for (const Moment expected :
       {Moment(std::chrono::seconds(2'147'483'648)), Moment(microseconds(4'294'967'295'999'999))}) {
    const auto message = reader->next();
    ASSERT_TRUE(message.has_value() && message->has_value());
    EXPECT_EQ((*message)->time, expected);
  }
}

TEST_F(PcapReaderTest, SecondsAreUnsignedInTheOtherByteOrderToo) {
  const Bytes file = {0xA1, 0xB2, 0xC3, 0xD4, 0, 2, 0, 4, 0, 0, 0, 0, 0, 0, 0, 0, 0, 4, 0, 0,  0,
                      0,    0,    147,  0x80, 0, 0, 0, 0, 0, 0, 7, 0, 0, 0, 1, 0, 0, 0, 1, 'x'};
  auto reader = open(file);
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  const auto message = reader->next();
  ASSERT_TRUE(message.has_value() && message->has_value());
  EXPECT_EQ((*message)->time, Moment(microseconds(2'147'483'648'000'007)));
}

TEST_F(PcapReaderTest, AMillionMicrosecondsAreDamageOfTheirRecord) {
  // 1,000,000 µs, and 4,294,967,295 µs, which the library hands over as -1.
  for (const Bytes& field : {Bytes{0x40, 0x42, 0x0F, 0}, Bytes{0xFF, 0xFF, 0xFF, 0xFF}}) {
    const Bytes lengths = {1, 0, 0, 0, 1, 0, 0, 0, 'x'};
    auto reader = open(
        joined({captureHeader(147), twoRecords(), {1, 0, 0, 0}, field, lengths, twoRecords()}));
    ASSERT_TRUE(reader.has_value());
    for (int i = 0; i < 2; ++i) EXPECT_TRUE(reader->next().has_value());
    for (int i = 0; i < 2; ++i) {
      const auto third = reader->next();
      ASSERT_FALSE(third.has_value());
      EXPECT_EQ(third.error().message, _directory.pathOf("a.pcap") +
                                           ": record 3: a time of more than 999999 microseconds");
    }
    EXPECT_EQ(reader->messageCount(), 2U);
  }
}

TEST_F(PcapReaderTest, AMessageThatTheRecorderCutIsCounted) {
  const Bytes record = {1, 0, 0, 0, 0, 0, 0, 0, 2, 0, 0, 0, 9, 0, 0, 0, 'a', 'b'};
  auto reader = open(joined({captureHeader(147), record}));
  ASSERT_TRUE(reader.has_value());
  const auto message = reader->next();
  ASSERT_TRUE(message.has_value() && message->has_value());
  EXPECT_TRUE((*message)->isCut());
  EXPECT_EQ((*message)->originalLength, 9U);
  EXPECT_EQ(textOf(**message), "ab");
  EXPECT_EQ(reader->cutMessageCount(), 1U);
}

TEST_F(PcapReaderTest, BigEndianAndNanosecondFilesGiveMicroseconds) {
  const Bytes file = {0xA1, 0xB2, 0x3C, 0x4D, 0, 2, 0, 4, 0, 0, 0, 0, 0, 0, 0, 0, 0, 4, 0, 0, 0, 0,
                      0, 147,
                      // 1 s and 2,999 ns, one byte
                      0, 0, 0, 1, 0, 0, 0x0B, 0xB7, 0, 0, 0, 1, 0, 0, 0, 1, 'x'};
  auto reader = open(file);
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  const auto message = reader->next();
  ASSERT_TRUE(message.has_value() && message->has_value());
  EXPECT_EQ((*message)->time, Moment(microseconds(1'000'002)));
}

}  // namespace
}  // namespace kestro
