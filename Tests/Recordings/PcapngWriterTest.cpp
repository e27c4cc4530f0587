// SPDX-License-Identifier: MIT
// Writing pcapng: the bytes, the limits, and disks that refuse them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "Recordings/PcapFormat.h"
#include "Recordings/PcapngReader.h"
#include "Recordings/PcapngWriter.h"
#include "Tests/Recordings/PcapngBytes.h"
#include "Tests/Support/FileSizeLimit.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using ::testing::ElementsAre;
using testing::FileSizeLimit;
using ::testing::HasSubstr;
using testing::TemporaryDirectory;

const Bytes kAbc = {'a', 'b', 'c'};

RecordedMessage messageOf(std::string_view technology, Moment time = Moment()) {
  return {.time = time, .technology = technology, .bytes = kAbc, .originalLength = kAbc.size()};
}

class PcapngWriterTest : public ::testing::Test {
 protected:
  [[nodiscard]] Bytes file() const { return TemporaryDirectory::read(_path); }
  [[nodiscard]] std::unique_ptr<PcapngReader> reader() const {
    return PcapngReader::open(RecordedFile::open(_path).value()).value();
  }

  TemporaryDirectory _directory;
  const std::string _path = _directory.pathOf("a.pcapng");
};

TEST_F(PcapngWriterTest, WritesTheFormatByteForByteAtOnce) {
  auto writer = PcapngWriter::create(_path).value();
  const Bytes whole = smallestPcapng();
  EXPECT_EQ(file(), Bytes(whole.begin(), whole.begin() + 28));
  const std::vector<std::string> comments = {"hi"};
  RecordedMessage message = messageOf("LTE", Moment(microseconds(1'330'862'709'000'250)));
  message.comments = comments;
  ASSERT_TRUE(writer.write(message));
  EXPECT_EQ(file(), whole);
}

TEST_F(PcapngWriterTest, ATechnologyHasOneInterfaceFromItsFirstMessageOn) {
  auto writer = PcapngWriter::create(_path).value();
  for (const char* technology : {"LTE", "IFX", "LTE", "IFX"}) {
    ASSERT_TRUE(writer.write(messageOf(technology)));
  }
  const auto options = [](std::string_view name) {
    return PcapngText().option(2, name).option(9, "\6").end();
  };
  EXPECT_EQ(file(), PcapngText()
                        .section()
                        .interface(150, options("LTE"), 262'144)
                        .packet(0, 0, "abc")
                        .interface(147, options("IFX"), 262'144)
                        .packet(1, 0, "abc")
                        .packet(0, 0, "abc")
                        .packet(1, 0, "abc")
                        .get());
}

TEST_F(PcapngWriterTest, WhatIsMadeUpStandsInTheSectionHeader) {
  auto writer = PcapngWriter::create(_path, "simulation").value();
  EXPECT_EQ(file(),
            PcapngText().section(PcapngText().option(1, "made-up: simulation").end()).get());
  ASSERT_TRUE(writer.write(messageOf("LTE")));
  const std::size_t before = file().size();
  ASSERT_TRUE(writer.setMadeUp("simulation"));
  EXPECT_EQ(file().size(), before);
  ASSERT_TRUE(writer.setMadeUp(""));
  ASSERT_TRUE(writer.write(messageOf("LTE")));
  EXPECT_EQ(reader()->madeUp(), "simulation");
  const Bytes whole = file();
  const Bytes second = PcapngText().section().get();
  EXPECT_TRUE(std::equal(second.begin(), second.end(),
                         whole.begin() + static_cast<std::ptrdiff_t>(before)));
}

TEST_F(PcapngWriterTest, ClosingNotesAreASectionOfTheirOwn) {
  auto writer = PcapngWriter::create(_path).value();
  ASSERT_TRUE(writer.writeClosingNotes({}));
  EXPECT_EQ(file(), PcapngText().section().get());
  const std::vector<std::string> notes = {"last", "words"};
  ASSERT_TRUE(writer.writeClosingNotes(notes));
  const auto options = PcapngText().option(1, "last").option(1, "words").end();
  EXPECT_EQ(file(), PcapngText().section().section(options).get());
}

TEST_F(PcapngWriterTest, ALongCommentIsSplitBetweenCharacters) {
  // 65,534 bytes, a character of two bytes across the limit, and one more.
  const std::string start(65'534, 'x');
  const std::vector<std::string> comments = {start + "\u00E4y", std::string(65'535, 'z'),
                                             std::string(65'536, '\x80')};
  auto writer = PcapngWriter::create(_path).value();
  RecordedMessage message = messageOf("LTE");
  message.comments = comments;
  ASSERT_TRUE(writer.write(message));
  const auto opened = reader();
  const auto read = opened->next().value().value();
  EXPECT_THAT(read.comments, ElementsAre(start, "\u00E4y", std::string(65'535, 'z'),
                                         std::string(65'531, '\x80'), std::string(5, '\x80')));
}

TEST_F(PcapngWriterTest, TheLongestMessageIsReadBackWholeAndNoLongerOneWritten) {
  const Bytes longest(kMaximumPcapMessageSize + 1, 0x5A);
  auto writer = PcapngWriter::create(_path).value();
  RecordedMessage message = messageOf("LTE");
  message.bytes = longest;
  const auto refused = writer.write(message);
  ASSERT_FALSE(refused.has_value());
  EXPECT_EQ(refused.error().message,
            _path + ": a message of 262145 bytes is longer than a capture can hold (262144)");
  EXPECT_EQ(file(), PcapngText().section().get());

  message.bytes = ByteView(longest).first(kMaximumPcapMessageSize);
  message.originalLength = message.bytes.size() + 9;
  ASSERT_TRUE(writer.write(message));
  const auto opened = reader();
  const auto read = opened->next().value().value();
  EXPECT_EQ(Bytes(read.bytes.begin(), read.bytes.end()), Bytes(longest.begin(), longest.end() - 1));
  EXPECT_EQ(read.originalLength, 262'153U);
}

TEST_F(PcapngWriterTest, AnUnknownTechnologyIsRefused) {
  auto writer = PcapngWriter::create(_path).value();
  const auto refused = writer.write(messageOf("NR"));
  ASSERT_FALSE(refused.has_value());
  EXPECT_EQ(refused.error().message, _path + ": \"NR\" is no technology to record");
  EXPECT_EQ(file(), PcapngText().section().get());
}

TEST_F(PcapngWriterTest, ATimeOutsideTheYears1970To9999IsWrittenAsTheNearest) {
  auto writer = PcapngWriter::create(_path).value();
  ASSERT_TRUE(writer.write(messageOf("LTE", Moment(microseconds(-1)))));
  ASSERT_TRUE(writer.write(messageOf("LTE", Moment::max())));
  const auto opened = reader();
  EXPECT_EQ(opened->next().value().value().time, Moment());
  EXPECT_EQ(opened->next().value().value().time, Moment(microseconds(253'402'300'799'999'999)));
}

TEST_F(PcapngWriterTest, AFullDiskIsReportedAndStaysTheError) {
  auto writer = PcapngWriter::create(_path).value();
  ASSERT_TRUE(writer.write(messageOf("LTE")));
  const std::size_t whole = file().size();
  {
    const FileSizeLimit limit(whole + 5);
    const auto refused = writer.write(messageOf("LTE"));
    ASSERT_FALSE(refused.has_value());
    EXPECT_THAT(refused.error().message, HasSubstr(_path + ": cannot write: File too large"));
  }
  EXPECT_FALSE(writer.write(messageOf("LTE")).has_value());
  EXPECT_EQ(file().size(), whole + 5);
  const auto opened = reader();
  EXPECT_TRUE(opened->next().value().has_value());
  EXPECT_FALSE(opened->next().has_value());
}

TEST_F(PcapngWriterTest, WhatCannotBeCreatedIsNamed) {
  const std::string path = _directory.pathOf("none/a.pcapng");
  const auto refused = PcapngWriter::create(path);
  ASSERT_FALSE(refused.has_value());
  EXPECT_EQ(refused.error().message, path + ": cannot create: No such file or directory");
}

}  // namespace
}  // namespace kestro
