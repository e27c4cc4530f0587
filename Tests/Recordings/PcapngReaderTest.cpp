// SPDX-License-Identifier: MIT
// Reading pcapng: sections, interfaces, packets, their comments, cuts and damage.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Recordings/PcapngFormat.h"
#include "Recordings/PcapngReader.h"
#include "Tests/Recordings/PcapngBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

constexpr std::size_t kSectionLength = 28;

PcapngText little() { return PcapngText(); }
PcapngText big() { return PcapngText(ByteOrder::Big); }

class PcapngReaderTest : public ::testing::Test {
 protected:
  Result<std::unique_ptr<PcapngReader>> open(const Bytes& contents) {
    _path = _directory.write("a.pcapng", contents);
    return PcapngReader::open(RecordedFile::open(_path).value());
  }
  /// A reader that must be there.
  std::unique_ptr<PcapngReader> reader(const PcapngText& contents) {
    auto opened = open(contents.get());
    EXPECT_TRUE(opened.has_value()) << opened.error().message;
    return *std::move(opened);
  }
  /// "LTE 1 abc", a line for each message, then "end" or the error without the path.
  std::string messagesOf(PcapngReader& reader) const {
    std::string lines;
    while (true) {
      const auto message = reader.next();
      if (!message) return lines + withoutPath(message.error().message);
      if (!*message) return lines + "end";
      lines += std::string((*message)->technology) + " " + std::to_string((*message)->number) +
               " " + std::string((*message)->bytes.begin(), (*message)->bytes.end());
      for (const std::string& comment : (*message)->comments) lines += " [" + comment + "]";
      lines += "\n";
    }
  }
  /// The same, or why the file could not be opened.
  std::string messagesIn(const PcapngText& contents) {
    const auto opened = open(contents.get());
    return opened ? messagesOf(**opened) : withoutPath(opened.error().message);
  }
  std::string withoutPath(const std::string& message) const {
    EXPECT_TRUE(message.starts_with(_path + ": ")) << message;
    return message.substr(_path.size() + 2);
  }
  /// The time of a packet of one interface; in the error's place the epoch.
  Moment timeOf(const PcapngText& interfaceOptions, std::uint64_t units) {
    const auto opened =
        reader(little().section().interface(150, interfaceOptions).packet(0, units, "a"));
    const auto message = opened->next();
    return message && *message ? (*message)->time : Moment();
  }

  TemporaryDirectory _directory;
  std::string _path;
};

PcapngText resolution(std::uint8_t value) {
  return little().option(9, std::string(1, static_cast<char>(value)));
}

PcapngText timeOffset(std::int64_t offset) {
  return little().u16(14).u16(8).number(static_cast<std::uint64_t>(offset), 8);
}

TEST_F(PcapngReaderTest, YieldsAMessageWithItsTimeAndComment) {
  const auto opened = open(smallestPcapng());
  ASSERT_TRUE(opened.has_value()) << opened.error().message;
  PcapngReader& reader = **opened;
  EXPECT_EQ(reader.form(), RecordingForm::Pcapng);
  EXPECT_THAT(reader.technologies(), ElementsAre("LTE"));
  const auto message = reader.next().value().value();
  EXPECT_EQ(message.time, Moment(microseconds(1'330'862'709'000'250)));
  EXPECT_EQ(message.technology, "LTE");
  EXPECT_EQ(message.number, 1U);
  EXPECT_THAT(message.bytes, ElementsAre('a', 'b', 'c'));
  EXPECT_FALSE(message.isCut());
  EXPECT_THAT(message.comments, ElementsAre("hi"));
  EXPECT_FALSE(reader.next().value().has_value());
  EXPECT_EQ(reader.messageCount(), 1U);
  EXPECT_EQ(reader.fractionRead(), 1.0);
  EXPECT_THAT(reader.closingNotes(), IsEmpty());
  EXPECT_EQ(reader.madeUp(), "");
}

TEST_F(PcapngReaderTest, LinkTypesNameTheTechnologies) {
  const std::vector<std::pair<std::uint8_t, std::string_view>> expected = {
      {147, "IFX"}, {148, "Ondrel_GSM"}, {149, "Ondrel_CDMA"}, {150, "LTE"}, {151, "UTRAN2"}};
  for (const auto& [linkType, technology] : expected) {
    const auto opened = open(smallestPcapng(linkType));
    ASSERT_TRUE(opened.has_value()) << opened.error().message;
    EXPECT_EQ((*opened)->next().value().value().technology, technology);
  }
}

TEST_F(PcapngReaderTest, TheTechnologyChangesFromMessageToMessage) {
  const auto opened = reader(little()
                                 .section()
                                 .interface(150)
                                 .interface(147)
                                 .packet(1, 1, "a")
                                 .packet(0, 2, "b")
                                 .interface(148)
                                 .packet(2, 3, "c")
                                 .packet(1, 4, "d"));
  EXPECT_THAT(opened->technologies(), ElementsAre("LTE"));
  EXPECT_EQ(messagesOf(*opened), "IFX 1 a\nLTE 2 b\nOndrel_GSM 3 c\nIFX 4 d\nend");
  EXPECT_THAT(opened->technologies(), ElementsAre("LTE", "IFX", "Ondrel_GSM"));
}

TEST_F(PcapngReaderTest, BothByteOrdersAreReadAlsoInOneFile) {
  PcapngText file = little().section().interface(150).packet(0, 5'000'000'000, "a");
  const PcapngText second =
      big().section().interface(151).packet(0, 5'000'000'001, "b", big().option(1, "note"));
  const auto opened = reader(file.bytes(second.get()));
  EXPECT_EQ(opened->next().value().value().time, Moment(microseconds(5'000'000'000)));
  const auto message = opened->next().value().value();
  EXPECT_EQ(message.time, Moment(microseconds(5'000'000'001)));
  EXPECT_EQ(message.technology, "UTRAN2");
  EXPECT_THAT(message.comments, ElementsAre("note"));
}

TEST_F(PcapngReaderTest, ASectionKnowsNothingOfTheInterfacesBefore) {
  const auto file = little().section().interface(150).packet(0, 1, "a").section().packet(0, 2, "b");
  EXPECT_EQ(messagesIn(file), "LTE 1 a\noffset 112: a packet of interface 0, of which there are 0");
}

TEST_F(PcapngReaderTest, OtherLinkTypesArePassedOverAndCounted) {
  const auto opened = reader(little()
                                 .section()
                                 .interface(1)
                                 .packet(0, 1, "ethernet")
                                 .interface(149)
                                 .packet(1, 2, "a")
                                 .packet(0, ~std::uint64_t{0}, "ethernet")
                                 .packet(1, 3, "b"));
  EXPECT_EQ(messagesOf(*opened), "Ondrel_CDMA 1 a\nOndrel_CDMA 2 b\nend");
  EXPECT_EQ(opened->passedOverCount(), 2U);
}

TEST_F(PcapngReaderTest, AFileOfOtherLinkTypesOnlyIsRefused) {
  for (const unsigned linkType : {1U, 146U, 152U}) {
    const auto file = little().section().interface(linkType).interface(2).packet(0, 1, "a");
    EXPECT_EQ(messagesIn(file), "link type " + std::to_string(linkType) +
                                    " stands for no technology (147 to 151 do)");
  }
}

TEST_F(PcapngReaderTest, AFileWithoutInterfacesHasNoMessages) {
  EXPECT_EQ(messagesIn(little().section()), "end");
}

TEST_F(PcapngReaderTest, TimesOfEveryResolutionBecomeMicroseconds) {
  struct Row {
    std::uint8_t resolution;
    std::uint64_t units;
    std::int64_t microseconds;
  };
  const std::vector<Row> rows = {
      {0, 3, 3'000'000},                        // seconds
      {1, 15, 1'500'000},                       // tenths
      {3, 1'234, 1'234'000},                    // ms
      {6, 1'234'567, 1'234'567},                // µs
      {7, 19, 1},                               // 100 ns, rounded down
      {9, 1'000'002'999, 1'000'002},            // ns
      {12, 18'000'000'999'999, 18'000'000},     // ps
      {25, 18'446'744'073'709'551'615U, 1},     // 10^-25 s: 1.8 µs
      {26, 18'446'744'073'709'551'615U, 0},     // 0.18 µs
      {127, 18'446'744'073'709'551'615U, 0},    // next to nothing
      {0x80, 7, 7'000'000},                     // 2^0 s
      {0x81, 7, 3'500'000},                     // 2^-1 s
      {0x80 + 20, (1U << 20U) + 1, 1'000'000},  // 1 s and 0.95 µs
      {0x80 + 32, 0x0000'0002'8000'0000, 2'500'000},
      {0x80 + 63, 0xC000'0000'0000'0000, 1'500'000},
      {0xFF, ~std::uint64_t{0}, 0},  // 2^-127 s
  };
  for (const Row& row : rows) {
    EXPECT_EQ(timeOf(resolution(row.resolution), row.units), Moment(microseconds(row.microseconds)))
        << unsigned{row.resolution};
  }
  EXPECT_EQ(timeOf(little(), 42), Moment(microseconds(42))) << "without the option";
}

TEST_F(PcapngReaderTest, ATimeOffsetIsAddedInSeconds) {
  EXPECT_EQ(timeOf(timeOffset(1'330'862'709), 250), Moment(microseconds(1'330'862'709'000'250)));
  EXPECT_EQ(timeOf(timeOffset(-2), 1'500'000), Moment(microseconds(-500'000)));
  EXPECT_EQ(timeOf(resolution(0).bytes(timeOffset(-1'000).get()), 1'001),
            Moment(microseconds(1'000'000)));
}

TEST_F(PcapngReaderTest, ATimeOutsideTheYears1To9999IsDamage) {
  // 253,402,300,800 s is the first second of the year 10000; -62,135,596,800 s that of the year 1.
  EXPECT_EQ(timeOf(resolution(0), 253'402'300'799), Moment(std::chrono::seconds(253'402'300'799)));
  EXPECT_EQ(timeOf(timeOffset(-62'135'596'800), 0), Moment(std::chrono::seconds(-62'135'596'800)));
  struct Row {
    PcapngText options;
    std::uint64_t units;
  };
  const std::vector<Row> rows = {
      {resolution(0), 253'402'300'800},
      {resolution(0), ~std::uint64_t{0}},
      {resolution(0x80), ~std::uint64_t{0}},
      {little(), ~std::uint64_t{0}},
      {timeOffset(-62'135'596'801), 999'999},
      {timeOffset(std::numeric_limits<std::int64_t>::min()), 0},
      {resolution(0).bytes(timeOffset(std::numeric_limits<std::int64_t>::max()).get()),
       ~std::uint64_t{0}},
  };
  for (const Row& row : rows) {
    const auto opened =
        reader(little().section().interface(150, row.options).packet(0, row.units, "a"));
    const auto message = opened->next();
    ASSERT_FALSE(message.has_value()) << row.units;
    EXPECT_THAT(message.error().message,
                ::testing::EndsWith(": a time outside the years 1 to 9999"));
  }
}

TEST_F(PcapngReaderTest, ASimplePacketHasTheTimeOfThePacketBefore) {
  const auto opened = reader(little()
                                 .section()
                                 .interface(150)
                                 .block(3, little().u32(1).padded("a"))
                                 .packet(0, 77, "b")
                                 .block(3, little().u32(5).padded("cdefg")));
  EXPECT_EQ(opened->next().value().value().time, Moment());
  EXPECT_TRUE(opened->next().value().has_value());
  const auto last = opened->next().value().value();
  EXPECT_EQ(last.time, Moment(microseconds(77)));
  EXPECT_THAT(last.bytes, ElementsAre('c', 'd', 'e', 'f', 'g'));
  EXPECT_FALSE(last.isCut());
}

TEST_F(PcapngReaderTest, ASimplePacketIsCutWhereItsInterfaceSays) {
  const auto opened = reader(little()
                                 .section()
                                 .interface(150, little(), 2)
                                 .block(3, little().u32(9).padded("ab"))
                                 .block(3, little().u32(1).padded("c")));
  const auto message = opened->next().value().value();
  EXPECT_THAT(message.bytes, ElementsAre('a', 'b'));
  EXPECT_EQ(message.originalLength, 9U);
  EXPECT_THAT(opened->next().value().value().bytes, ElementsAre('c'));
  EXPECT_EQ(opened->cutMessageCount(), 1U);
}

TEST_F(PcapngReaderTest, AnObsoletePacketHasAShortInterfaceNumber) {
  const auto body =
      little().u16(1).u16(0xFFFF).u32(0).u32(9).u32(1).u32(4).padded("a").option(1, "old");
  const auto opened = reader(little().section().interface(150).interface(151).block(2, body));
  const auto message = opened->next().value().value();
  EXPECT_EQ(message.technology, "UTRAN2");
  EXPECT_EQ(message.time, Moment(microseconds(9)));
  EXPECT_EQ(message.originalLength, 4U);
  EXPECT_THAT(message.comments, ElementsAre("old"));
}

TEST_F(PcapngReaderTest, OtherBlocksArePassedOverHoweverLong) {
  const std::string long20MiB(std::size_t{20} * 1024 * 1024, 'x');
  const auto file = little()
                        .section()
                        .block(4, little())
                        .interface(150)
                        .block(0x80000BAD, little().padded(long20MiB))
                        .packet(0, 1, "a")
                        .block(5, little().u32(0));
  EXPECT_EQ(messagesIn(file), "LTE 1 a\nend");
}

TEST_F(PcapngReaderTest, AllCommentsAreReadInTheirOrder) {
  const auto options = little()
                           .option(1, "one")
                           .option(2, "flags")
                           .option(1, "")
                           .option(1, "three!")
                           .end()
                           .option(1, "behind the end");
  EXPECT_EQ(
      messagesIn(little().section().interface(150).packet(0, 1, "a", options).packet(0, 2, "b")),
      "LTE 1 a [one] [] [three!]\nLTE 2 b\nend");
}

TEST_F(PcapngReaderTest, ASectionsCommentsAreNotesOfTheNextMessage) {
  const auto opened = reader(little()
                                 .section(little().option(4, "program").option(1, "first").end())
                                 .interface(150)
                                 .interface(1)
                                 .packet(1, 1, "ethernet", little().option(1, "not ours"))
                                 .packet(0, 1, "a", little().option(1, "own"))
                                 .section(little().option(1, "last").option(1, "words")));
  EXPECT_EQ(messagesOf(*opened), "LTE 1 a [first] [own]\nend");
  EXPECT_THAT(opened->closingNotes(), ElementsAre("last", "words"));
}

TEST_F(PcapngReaderTest, WhatIsMadeUpIsToldSectionBySection) {
  const auto opened = reader(little()
                                 .section(little().option(1, "made-up: simulation"))
                                 .interface(150)
                                 .packet(0, 1, "a")
                                 .section(little()
                                              .option(1, "made-up: simulation")
                                              .option(1, "made-up: simulation")
                                              .option(1, "made-up: sim")
                                              .option(1, "made-up: "))
                                 .interface(150)
                                 .packet(0, 2, "b")
                                 .section()
                                 .interface(150)
                                 .packet(0, 3, "c"));
  EXPECT_EQ(opened->madeUp(), "simulation");
  ASSERT_TRUE(*opened->next());
  EXPECT_EQ(opened->madeUp(), "simulation");
  ASSERT_TRUE(*opened->next());
  EXPECT_EQ(opened->madeUp(), "simulation; sim");
  EXPECT_EQ(messagesOf(*opened), "LTE 3 c\nend");
  EXPECT_EQ(opened->madeUp(), "");
  EXPECT_THAT(opened->closingNotes(), IsEmpty());
}

TEST_F(PcapngReaderTest, WhatIsWholeIsReadAtEveryLength) {
  const auto head = little().section().interface(150);
  const auto first = PcapngText(head).packet(0, 1, "abc", little().option(1, "hi"));
  const auto second = PcapngText(first).block(4, little().u32(0));
  const auto whole = PcapngText(second).packet(0, 2, "de").get();
  const std::vector<std::size_t> ends = {kSectionLength, head.get().size(), first.get().size(),
                                         second.get().size(), whole.size()};
  for (std::size_t length = 1; length <= whole.size(); ++length) {
    const bool isWhole = std::ranges::find(ends, length) != ends.end();
    std::size_t begin = 0;
    for (const std::size_t end : ends) {
      if (end <= length) begin = end;
    }
    std::string expected = length >= first.get().size() ? "LTE 1 abc [hi]\n" : "";
    if (length == whole.size()) expected += "LTE 2 de\n";
    expected += isWhole ? "end" : "offset " + std::to_string(begin) + ": truncated: a block of ";
    const std::string got = messagesIn(little().bytes(ByteView(whole).subspan(0, length)));
    EXPECT_EQ(got.substr(0, expected.size()), expected) << length;
  }
}

TEST_F(PcapngReaderTest, ACutBlockTellsBothLengths) {
  Bytes file = smallestPcapng();
  file.resize(file.size() - 1);
  EXPECT_EQ(messagesIn(little().bytes(file)),
            "offset 68: truncated: a block of 48 bytes, of which 47 are there");
}

TEST_F(PcapngReaderTest, ABlocksLengthsMustBePossibleAndEqual) {
  const PcapngText begin = little().section().interface(150).packet(0, 1, "a");
  const std::string read = "LTE 1 a\noffset 84: ";
  const auto after = [&](const PcapngText& text) {
    return messagesIn(PcapngText(begin).bytes(text.get()));
  };
  const auto notALength = [&](int length) {
    return read + "a block of " + std::to_string(length) + " bytes, which is no length of one";
  };
  EXPECT_EQ(after(little().u32(6).u32(0).u32(0)), notALength(0));
  EXPECT_EQ(after(little().u32(4).u32(8).u32(8)), notALength(8));
  EXPECT_EQ(after(little().u32(4).u32(14).padded("12").u32(14)), notALength(14));
  EXPECT_EQ(after(little().u32(4).u32(16).u32(0).u32(20)),
            read + "a block of 16 bytes that ends as one of 20");
  EXPECT_EQ(after(little().u32(6).u32(32).padded(std::string(20, 'x')).u32(0)),
            read + "a block of 32 bytes that ends as one of 0");
  EXPECT_EQ(after(little().u32(6).u32(0x80000000).u32(0)),
            read + "a block of 2147483648 bytes; the longest is 16777216");
  EXPECT_EQ(after(little().u32(4).u32(0x80000000).u32(0)),
            read + "truncated: a block of 2147483648 bytes, of which 12 are there");
}

TEST_F(PcapngReaderTest, AShortOrImpossiblePacketIsDamage) {
  const PcapngText begin = little().section().interface(150).packet(0, 1, "a");
  const auto after = [&](std::uint32_t type, const PcapngText& body) {
    return messagesIn(PcapngText(begin).block(type, body));
  };
  const std::string read = "LTE 1 a\noffset 84: ";
  EXPECT_EQ(after(6, little().padded(std::string(16, '\0'))), read + "a packet that is too short");
  EXPECT_EQ(after(2, little().padded(std::string(16, '\0'))), read + "a packet that is too short");
  EXPECT_EQ(after(3, little()), read + "a packet that is too short");
  EXPECT_EQ(after(6, little().u32(1).u32(0).u32(0).u32(0).u32(0)),
            read + "a packet of interface 1, of which there are 1");
  EXPECT_EQ(after(6, little().u32(0).u32(0).u32(0).u32(5).u32(5).padded("abcd")),
            read + "a packet of 5 bytes where 4 are left");
  EXPECT_EQ(after(6, little().u32(0).u32(0).u32(0).u32(0xFFFFFFFF).u32(5).padded("abcd")),
            read + "a packet of 4294967295 bytes where 4 are left");
  EXPECT_EQ(after(3, little().u32(9).padded("abcdefgh")),
            read + "a packet of 9 bytes where 8 are left");
}

TEST_F(PcapngReaderTest, AnOptionBeyondItsBlockIsDamage) {
  const auto tooLong = little().u16(1).u16(5).padded("abcd");
  EXPECT_EQ(messagesIn(little().section().interface(150).packet(0, 1, "a", tooLong)),
            "offset 48: an option of 5 bytes where 4 are left");
  EXPECT_EQ(messagesIn(little().section(tooLong).interface(150)),
            "offset 0: an option of 5 bytes where 4 are left");
  EXPECT_EQ(messagesIn(little().section().interface(150, tooLong)),
            "offset 28: an option of 5 bytes where 4 are left");
}

TEST_F(PcapngReaderTest, AnInterfacesTimesMustBeOfTheirSizes) {
  EXPECT_EQ(messagesIn(little().section().interface(150, little().option(9, "ab"))),
            "offset 28: a time resolution that is no byte");
  EXPECT_EQ(messagesIn(little().section().interface(150, little().option(14, "abcd"))),
            "offset 28: a time offset that is not of 8 bytes");
  EXPECT_EQ(messagesIn(little().section().block(1, little().u32(150))),
            "offset 28: an interface that is too short");
}

TEST_F(PcapngReaderTest, ASectionHeaderMustBeKnown) {
  EXPECT_EQ(messagesIn(little().u32(0x0A0D0D0A).u32(28).u32(0x1A2B3C4E)),
            "offset 0: a section header of no known byte order");
  EXPECT_EQ(messagesIn(little().block(0x0A0D0D0A, little().u32(0x1A2B3C4D).u16(1).u16(0))),
            "offset 0: a section header that is too short");
  const auto version2 = little().u32(0x1A2B3C4D).u16(2).u16(1).u32(0).u32(0);
  EXPECT_EQ(messagesIn(little().block(0x0A0D0D0A, version2)),
            "offset 0: a section of version 2.1; 1.x is read");
  EXPECT_EQ(messagesIn(little().interface(150)), "offset 0: no section header");
}

TEST_F(PcapngReaderTest, DamageEndsTheReadingForGood) {
  const auto opened = reader(little().section().interface(150).packet(7, 1, "a").packet(0, 2, "b"));
  const auto first = opened->next();
  ASSERT_FALSE(first.has_value());
  const auto again = opened->next();
  ASSERT_FALSE(again.has_value());
  EXPECT_EQ(again.error().message, first.error().message);
}

TEST_F(PcapngReaderTest, InterfacesAreLimited) {
  PcapngText file = little().section();
  for (std::size_t i = 0; i < kMostPcapngInterfaces; ++i) file.interface(150);
  EXPECT_EQ(messagesIn(PcapngText(file).packet(65'535, 1, "a")), "LTE 1 a\nend");
  EXPECT_EQ(messagesIn(PcapngText(file).interface(150)),
            "offset 1310748: more than 65536 interfaces");
}

TEST_F(PcapngReaderTest, CommentsThatWaitAreLimitedInNumberAndBytes) {
  const std::string refusal = ": more than 10000 comments or 8388608 bytes of them for one packet";
  PcapngText many = little().section().interface(150);
  for (std::size_t i = 0; i < kMostPcapngComments; ++i) many.section(little().option(1, ""));
  EXPECT_EQ(messagesIn(many), "end");
  EXPECT_THAT(messagesIn(many.section(little().option(1, ""))), ::testing::EndsWith(refusal));

  PcapngText large = little().section().interface(150);
  for (int i = 0; i < 128; ++i) large.section(little().option(1, std::string(65'535, 'x')));
  EXPECT_EQ(messagesIn(PcapngText(large).section(little().option(1, std::string(128, 'x')))),
            "end");
  EXPECT_THAT(messagesIn(large.section(little().option(1, std::string(129, 'x')))),
              ::testing::EndsWith(refusal));
}

}  // namespace
}  // namespace kestro
