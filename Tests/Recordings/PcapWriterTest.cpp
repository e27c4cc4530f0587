// SPDX-License-Identifier: MIT
// Writing captures: the bytes, the limits, and disks that refuse them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "Recordings/PcapFormat.h"
#include "Recordings/PcapReader.h"
#include "Recordings/PcapWriter.h"
#include "Tests/Recordings/PcapBytes.h"
#include "Tests/Support/FileSizeLimit.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using std::chrono::seconds;
using testing::FileSizeLimit;
using ::testing::HasSubstr;
using testing::TemporaryDirectory;

class PcapWriterTest : public ::testing::Test {
 protected:
  TemporaryDirectory _directory;
  const std::string _path = _directory.pathOf("a.pcap");
};

TEST_F(PcapWriterTest, WritesTheFormatByteForByte) {
  auto writer = PcapWriter::create(_path, "UTRAN2");
  ASSERT_TRUE(writer.has_value()) << writer.error().message;
  ASSERT_TRUE(writer->write(Moment(microseconds(1'330'862'709'000'250)), Bytes{'a', 'b', 'c'}));
  ASSERT_TRUE(writer->write(Moment(microseconds(1'330'862'710'500'250)), Bytes{'d', 'e'}));
  EXPECT_EQ(TemporaryDirectory::read(_path), joined({captureHeader(151), twoRecords()}));
}

TEST_F(PcapWriterTest, TheHeaderIsThereBeforeAnyMessage) {
  const auto writer = PcapWriter::create(_path, "IFX");
  ASSERT_TRUE(writer.has_value());
  EXPECT_EQ(TemporaryDirectory::read(_path), captureHeader(147));
}

TEST_F(PcapWriterTest, AnEarlierFileIsReplaced) {
  _directory.write("a.pcap", std::string(1000, 'x'));
  const auto writer = PcapWriter::create(_path, "IFX");
  ASSERT_TRUE(writer.has_value());
  EXPECT_EQ(TemporaryDirectory::read(_path), captureHeader(147));
}

TEST_F(PcapWriterTest, TheLongestMessageIsReadBackWhole) {
  const Bytes longest(kMaximumPcapMessageSize, 0x5A);
  auto writer = PcapWriter::create(_path, "LTE");
  ASSERT_TRUE(writer.has_value());
  ASSERT_TRUE(writer->write(Moment(seconds(1)), longest));
  auto reader = PcapReader::open(_path);
  ASSERT_TRUE(reader.has_value());
  const auto message = reader->next();
  ASSERT_TRUE(message.has_value() && message->has_value());
  EXPECT_EQ(Bytes((*message)->bytes.begin(), (*message)->bytes.end()), longest);
}

TEST_F(PcapWriterTest, ALongerMessageIsRefusedAndTheFileGoesOn) {
  auto writer = PcapWriter::create(_path, "LTE");
  ASSERT_TRUE(writer.has_value());
  const auto refused = writer->write(Moment(), Bytes(kMaximumPcapMessageSize + 1));
  ASSERT_FALSE(refused.has_value());
  EXPECT_THAT(refused.error().message, HasSubstr("262145"));
  EXPECT_TRUE(writer->write(Moment(), Bytes{'x'}).has_value());
  EXPECT_EQ(TemporaryDirectory::read(_path).size(), 24U + 16U + 1U);
}

TEST_F(PcapWriterTest, TimesOutsideTheFormatAreMovedInside) {
  auto writer = PcapWriter::create(_path, "LTE");
  ASSERT_TRUE(writer.has_value());
  ASSERT_TRUE(writer->write(Moment(seconds(-5)), {}));
  ASSERT_TRUE(writer->write(Moment(seconds(std::int64_t{1} << 40)), {}));
  const Bytes records = {0,    0,    0,    0,    0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0,
                         0xFF, 0xFF, 0xFF, 0xFF, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0};
  EXPECT_EQ(TemporaryDirectory::read(_path), joined({captureHeader(150), records}));
}

TEST_F(PcapWriterTest, AnUnknownTechnologyIsRefusedBeforeTheFileIsTouched) {
  _directory.write("a.pcap", std::string_view("precious"));
  const auto writer = PcapWriter::create(_path, "5G");
  ASSERT_FALSE(writer.has_value());
  EXPECT_THAT(writer.error().message, HasSubstr("\"5G\""));
  EXPECT_EQ(TemporaryDirectory::read(_path).size(), 8U);
}

TEST_F(PcapWriterTest, AFileThatCannotBeCreatedIsAnErrorWithTheReason) {
  const auto path = _directory.pathOf("no/such/folder.pcap");
  const auto writer = PcapWriter::create(path, "IFX");
  ASSERT_FALSE(writer.has_value());
  EXPECT_EQ(writer.error().message, path + ": cannot create: No such file or directory");
}

TEST_F(PcapWriterTest, AFullDiskIsReportedAtOnce) {
  const auto writer = PcapWriter::create("/dev/full", "IFX");
  ASSERT_FALSE(writer.has_value());
  EXPECT_EQ(writer.error().message, "/dev/full: cannot write: No space left on device");
}

TEST_F(PcapWriterTest, BytesRefusedLaterAreReportedFromThenOn) {
  auto writer = PcapWriter::create(_path, "IFX");
  ASSERT_TRUE(writer.has_value());
  ASSERT_TRUE(writer->write(Moment(), Bytes{'a'}));
  {
    const FileSizeLimit limit(24 + 17 + 5);
    const auto refused = writer->write(Moment(), Bytes{'b'});
    ASSERT_FALSE(refused.has_value());
    EXPECT_EQ(refused.error().message, _path + ": cannot write: File too large");
  }
  const auto afterwards = writer->write(Moment(), Bytes{'c'});
  ASSERT_FALSE(afterwards.has_value());
  EXPECT_EQ(afterwards.error().message, _path + ": cannot write: File too large");
}

}  // namespace
}  // namespace kestro
