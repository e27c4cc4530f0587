// SPDX-License-Identifier: MIT
// Reading DLF logs: with and without type bytes, their technology, cuts and damage.
#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <initializer_list>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Recordings/DlfReader.h"
#include "Tests/Recordings/DlfBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::microseconds;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using testing::TemporaryDirectory;

/// A version report and the parts behind it.
Bytes logOf(std::initializer_list<Bytes> parts) {
  Bytes log = dlfVersionReport();
  for (const Bytes& part : parts) log.insert(log.end(), part.begin(), part.end());
  return log;
}

/// `bytes` with one byte in front.
Bytes behind(std::uint8_t type, Bytes bytes) {
  bytes.insert(bytes.begin(), type);
  return bytes;
}

class DlfReaderTest : public ::testing::Test {
 protected:
  Result<std::unique_ptr<DlfReader>> open(const Bytes& log, std::string_view technology = {}) {
    _path = _directory.write("a.dlf", log);
    return openPath(_path, technology);
  }
  Result<std::unique_ptr<DlfReader>> openPath(const std::string& path,
                                              std::string_view technology) {
    return DlfReader::open(RecordedFile::open(path).value(),
                           {.coding = *_coding,
                            .technologiesOfCode = technologiesOfTestCode,
                            .technology = technology});
  }
  /// The messages' bytes; the error, if one ends them, goes to `_error`.
  std::vector<Bytes> messagesOf(DlfReader& reader) {
    std::vector<Bytes> messages;
    while (true) {
      const auto message = reader.next();
      _error = message ? "" : message.error().message;
      if (!message || !*message) return messages;
      messages.emplace_back((*message)->bytes.begin(), (*message)->bytes.end());
    }
  }
  std::vector<Bytes> messagesIn(const Bytes& log) { return messagesOf(*open(log, "LTE").value()); }

  TemporaryDirectory _directory;
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  std::string _path;
  std::string _error;
};

TEST_F(DlfReaderTest, ARecordIsAMessageBehindItsTypeAtItsOwnTime) {
  const Bytes record = dlfRecord(0xB0C2, kDlfTestTime + 250, "xy");
  const auto reader = open(logOf({record})).value();
  EXPECT_EQ(reader->form(), RecordingForm::Dlf);
  EXPECT_THAT(reader->technologies(), ElementsAre("LTE"));
  const auto message = reader->next().value().value();
  EXPECT_EQ(message.time, Moment(microseconds(1'330'862'709'000'250)));
  EXPECT_EQ(message.technology, "LTE");
  EXPECT_EQ(message.number, 1U);
  EXPECT_FALSE(message.isCut());
  EXPECT_THAT(message.bytes, ElementsAre(1, 14, 0, 0xC2, 0xB0, 0x3A, 0xC8, 0x03, 0x9F, 0x69, 0xBA,
                                         0x04, 0, 'x', 'y'));
  EXPECT_FALSE(reader->next().value().has_value());
}

TEST_F(DlfReaderTest, WithoutTypeBytesCodes0To2AreExtraPackets) {
  for (std::uint16_t code = 0; code <= 3; ++code) {
    const Bytes record = dlfRecord(code, kDlfTestTime, "x");
    EXPECT_THAT(messagesIn(logOf({record})), ElementsAre(behind(code <= 2 ? 0xFF : 0x01, record)))
        << code;
  }
}

TEST_F(DlfReaderTest, TypeBytesInsideEntriesAreRead) {
  // Two entries as exported: only the first packet of each has no type byte.
  const Bytes first = dlfRecord(0xB0C2, kDlfTestTime, "one");
  const Bytes second = dlfRecord(0xB0C3, kDlfTestTime + 1'000'000, std::string(300, 'x'));
  const Bytes extra = dlfRecord(0xB0C4, kDlfTestTime + 1'500'000);
  const Bytes fourth = dlfRecord(2, kDlfTestTime + 2'000'000);
  EXPECT_THAT(
      messagesIn(logOf({first, behind(1, second), behind(0xFF, extra), fourth, behind(1, first)})),
      ElementsAre(behind(1, first), behind(1, second), behind(0xFF, extra), behind(0xFF, fourth),
                  behind(1, first)));
  EXPECT_EQ(_error, "");
}

TEST_F(DlfReaderTest, ALengthThatLooksLikeATypeByteIsStillALength) {
  // 0x0101 and 0x0CFF bytes: read as a type byte, lengths of 1 and of 12 and more would follow.
  for (const std::size_t length : {std::size_t{0x0101}, std::size_t{0x0C01}, std::size_t{0x0CFF}}) {
    const Bytes record = dlfRecord(0xB0C2, kDlfTestTime, std::string(length - 12, '\0'));
    const Bytes next = dlfRecord(0xB0C3, kDlfTestTime);
    EXPECT_THAT(messagesIn(logOf({record, next, behind(1, record), next})),
                ElementsAre(behind(1, record), behind(1, next), behind(1, record), behind(1, next)))
        << length;
  }
}

TEST_F(DlfReaderTest, ATypeByteThatLooksLikeALengthIsStillAType) {
  // As a record's length, the type byte and the length's first byte make 0x0C01: 3,073 bytes, and
  // as many follow. With a time the times tell which it is, without one the codes, and where nobody
  // knows codes, what would follow the 3,073 bytes.
  for (const std::uint64_t time : {kDlfTestTime, std::uint64_t{0}}) {
    const Bytes record = dlfRecord(0xB0C2, time);
    Bytes log = logOf({record});
    std::vector<Bytes> expected = {behind(1, record)};
    for (int i = 0; i < 600; ++i) {
      expected.push_back(behind(1, record));
      log.insert(log.end(), expected.back().begin(), expected.back().end());
    }
    EXPECT_EQ(messagesIn(log), expected);
    const auto reader = DlfReader::open(RecordedFile::open(_path).value(),
                                        {.coding = *_coding, .technology = "LTE"});
    EXPECT_EQ(messagesOf(**reader), expected);
  }
}

// Read as a length, 01 0C makes 3,073 bytes; the record's code would then be nobody's 0xC200, and
// its time, where its own is 0, 0xB0.

TEST_F(DlfReaderTest, CodesTellWhatTimesDoNot) {
  const Bytes before = dlfRecord(0xB0C2, 0xB0);
  const Bytes typed = behind(1, dlfRecord(0xB0C2, 0));
  const Bytes filling = dlfRecord(0xB0C3, 0, std::string(3'073 - typed.size() - 12, '\0'));
  EXPECT_THAT(messagesIn(logOf({before, typed, filling, before})),
              ElementsAre(behind(1, before), typed, behind(1, filling), behind(1, before)));
}

TEST_F(DlfReaderTest, TimesTellWhatCodesDoNot) {
  const Bytes before = dlfRecord(0x1234, kDlfTestTime);
  const Bytes typed = behind(1, dlfRecord(0x1234, kDlfTestTime));
  const Bytes filling =
      dlfRecord(0x1234, kDlfTestTime, std::string(3'073 - typed.size() - 12, '\0'));
  EXPECT_THAT(messagesIn(logOf({before, typed, filling, before})),
              ElementsAre(behind(1, before), typed, behind(1, filling), behind(1, before)));
}

TEST_F(DlfReaderTest, WhatFollowsTellsWhatCodesAndTimesDoNot) {
  const Bytes before = dlfRecord(0x1234, 0x12);
  const Bytes typed = behind(1, dlfRecord(0x1234, 0));
  const Bytes filling = dlfRecord(0x1234, 0, std::string(4'000, '\0'));
  EXPECT_THAT(messagesIn(logOf({before, typed, filling})),
              ElementsAre(behind(1, before), typed, behind(1, filling)));
}

TEST_F(DlfReaderTest, PrefixesAreLeftOut) {
  const Bytes record = dlfRecord(0xB0C2, kDlfTestTime, "one");
  const Bytes prefixed = behind(0x81, behind(0x33, behind(1, record)));
  const Bytes withoutFirst = behind(0x33, behind(1, record));
  EXPECT_THAT(messagesIn(logOf({withoutFirst, prefixed, behind(1, record)})),
              ElementsAre(behind(1, record), behind(1, record), behind(1, record)));
}

TEST_F(DlfReaderTest, TheTechnologyIsTheOnlyOneThatHasAllCodes) {
  const Bytes extra = dlfRecord(1, 0);
  const auto technologyOf = [&](std::initializer_list<Bytes> records) {
    const auto reader = open(logOf(records));
    return reader ? std::string((*reader)->next().value().value().technology)
                  : reader.error().message.substr(_path.size());
  };
  EXPECT_EQ(technologyOf({extra, dlfRecord(0xB0C2, 0)}), "LTE");
  EXPECT_EQ(technologyOf({dlfRecord(0x4101, 0), dlfRecord(0x5000, 0), extra}), "Ondrel_GSM");
  const std::string ask = "; --technology must say which it is";
  EXPECT_EQ(technologyOf({dlfRecord(0x4101, 0)}),
            ": UTRAN2 and Ondrel_GSM have the codes of all packets" + ask);
  EXPECT_EQ(technologyOf({dlfRecord(0xB0C2, 0), dlfRecord(0x5000, 0)}),
            ": no technology has the codes of all packets" + ask);
  EXPECT_EQ(technologyOf({dlfRecord(0xB0C2, 0), dlfRecord(0x1234, 0)}),
            ": no technology has the codes of all packets" + ask);
  EXPECT_EQ(technologyOf({extra, behind(0xFF, dlfRecord(0xB0C2, 0))}),
            ": no packet tells its technology" + ask);
}

TEST_F(DlfReaderTest, TheTechnologyThatIsAskedForHoldsWhateverTheCodes) {
  const auto reader = open(logOf({dlfRecord(0xB0C2, 0)}), "UTRAN2").value();
  EXPECT_THAT(reader->technologies(), ElementsAre("UTRAN2"));
  EXPECT_EQ(reader->next().value().value().technology, "UTRAN2");
}

TEST_F(DlfReaderTest, ALogWithoutPacketsIsAtItsEnd) {
  const auto reader = open(dlfVersionReport()).value();
  EXPECT_THAT(reader->technologies(), IsEmpty());
  EXPECT_FALSE(reader->next().value().has_value());
}

TEST_F(DlfReaderTest, ATimeBeyondTheYear9999IsThatOfTheMessageBefore) {
  // 253,402,300,800 s is the first second of the year 10000.
  const auto reader = open(logOf({dlfRecord(0xB001, ~std::uint64_t{0}), dlfRecord(0xB001, 77),
                                  dlfRecord(0xB001, 253'402'300'800'000'000),
                                  dlfRecord(0xB001, 253'402'300'799'999'999)}))
                          .value();
  for (const std::int64_t time : {std::int64_t{0}, std::int64_t{77}, std::int64_t{77},
                                  std::int64_t{253'402'300'799'999'999}}) {
    EXPECT_EQ(reader->next().value().value().time, Moment(microseconds(time)));
  }
}

TEST_F(DlfReaderTest, WholeRecordsBeforeACutAreYieldedAtEveryLength) {
  const Bytes first = dlfRecord(0xB0C2, kDlfTestTime, "abc");
  const Bytes second = behind(1, dlfRecord(0xB0C3, kDlfTestTime, "de"));
  const Bytes whole = logOf({first, second});
  constexpr std::size_t kReport = 161;
  for (std::size_t length = kReport; length <= whole.size(); ++length) {
    const auto messages =
        messagesIn(Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(length)));
    const std::size_t expected = length == whole.size() ? 2 : length >= kReport + 15 ? 1 : 0;
    EXPECT_EQ(messages.size(), expected) << length;
    const std::size_t begin = expected == 0 ? kReport : kReport + 15;
    const bool isWhole = length == begin || length == whole.size();
    EXPECT_EQ(_error.starts_with(_path + ": offset " + std::to_string(begin) + ": no record: "),
              !isWhole)
        << length << _error;
  }
}

TEST_F(DlfReaderTest, DamageEndsTheReadingForGood) {
  const auto reader = open(logOf({dlfRecord(0xB0C2, kDlfTestTime), {11, 0, 0, 0}})).value();
  EXPECT_TRUE(reader->next().value().has_value());
  for (int i = 0; i < 2; ++i) {
    const auto damage = reader->next();
    ASSERT_FALSE(damage.has_value());
    EXPECT_EQ(damage.error().message,
              _path + ": offset 173: no record: 4 bytes are left, and its length is 11");
  }
}

TEST_F(DlfReaderTest, APipesTechnologyIsFoundToo) {
  std::array<int, 2> ends{};
  ASSERT_EQ(::pipe2(ends.data(), O_CLOEXEC), 0);
  Bytes log = logOf({});
  const Bytes record = dlfRecord(0xB0C2, kDlfTestTime, std::string(60'000, 'x'));
  for (int i = 0; i < 10; ++i) log.insert(log.end(), record.begin(), record.end());
  std::thread writer([&] {
    EXPECT_EQ(::write(ends[1], log.data(), log.size()), static_cast<ssize_t>(log.size()));
    ::close(ends[1]);
  });
  const auto reader = openPath("/proc/self/fd/" + std::to_string(ends[0]), "");
  writer.join();
  ::close(ends[0]);
  ASSERT_TRUE(reader.has_value()) << reader.error().message;
  EXPECT_THAT((*reader)->technologies(), ElementsAre("LTE"));
  EXPECT_EQ(messagesOf(**reader).size(), 10U);
}

}  // namespace
}  // namespace kestro
