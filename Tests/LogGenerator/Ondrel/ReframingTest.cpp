// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <initializer_list>

#include "LogGenerator/Ondrel/Reframing.h"

namespace kestro {
namespace {

using ::testing::IsEmpty;
using ::testing::SizeIs;

/// A record of 12 bytes: its length, then `fill`.
Bytes emptyRecord(std::uint8_t fill) {
  return {12, 0, fill, fill, fill, fill, fill, fill, fill, fill, fill, fill};
}

/// A record of 14 bytes.
Bytes longRecord() { return {14, 0, 0x7F, 0xB1, 0, 0, 0, 0, 0, 0, 0, 0, 0xAA, 0xBB}; }

Bytes joined(std::initializer_list<Bytes> parts) {
  Bytes result;
  for (const Bytes& part : parts) result.insert(result.end(), part.begin(), part.end());
  return result;
}

Value entry(const Bytes& collected) { return Dictionary{{"DisplayState", Value::data(collected)}}; }

const Bytes kReport(161, 0xEE);

TEST(AppendRecords, LeavesOutTheTypeByteOfEveryMessage) {
  Bytes dlf{0xEE};
  const auto found = appendRecords(
      dlf, joined({{0x01}, emptyRecord(5), {0xFF}, longRecord(), {0x01}, emptyRecord(6)}));
  EXPECT_EQ(found.count, 3U);
  EXPECT_EQ(found.unframedSize, 0U);
  EXPECT_EQ(dlf, joined({{0xEE}, emptyRecord(5), longRecord(), emptyRecord(6)}));
}

TEST(AppendRecords, LeavesOutPrefixes) {
  Bytes dlf;
  const auto found = appendRecords(
      dlf, joined({{0x81, 0x33, 0x01}, longRecord(), {0x81, 0x01, 0x01}, emptyRecord(5)}));
  EXPECT_EQ(found.count, 2U);
  EXPECT_EQ(dlf, joined({longRecord(), emptyRecord(5)}));
}

TEST(AppendRecords, NothingHasNoRecords) {
  Bytes dlf;
  const auto found = appendRecords(dlf, {});
  EXPECT_EQ(found.count, 0U);
  EXPECT_EQ(found.unframedSize, 0U);
  EXPECT_THAT(dlf, IsEmpty());
}

TEST(AppendRecords, EndsAtARecordShorterThanItsHeader) {
  Bytes dlf;
  Bytes bad = emptyRecord(5);
  bad[0] = 11;
  const auto found =
      appendRecords(dlf, joined({{0x01}, longRecord(), {0x01}, bad, {0x01}, longRecord()}));
  EXPECT_EQ(found.count, 1U);
  EXPECT_EQ(found.unframedSize, 13U + 15U);
  EXPECT_EQ(dlf, longRecord());
}

TEST(AppendRecords, EveryCutOfTheLastMessageIsUnframed) {
  const Bytes whole = joined({{0x01}, emptyRecord(5), {0x01}, longRecord()});
  for (std::size_t kept = 1; kept < 15; ++kept) {
    Bytes dlf;
    const Bytes cut(whole.begin(), whole.begin() + 13 + static_cast<std::ptrdiff_t>(kept));
    const auto found = appendRecords(dlf, cut);
    EXPECT_EQ(found.count, 1U) << kept;
    EXPECT_EQ(found.unframedSize, kept);
    EXPECT_EQ(dlf, emptyRecord(5));
  }
}

TEST(ReframedDlf, HasTheReportAndEveryEntrysRecords) {
  const Bytes first = joined({{0x01}, emptyRecord(5), {0x01}, emptyRecord(6)});
  const Bytes second = joined({{0xFF}, longRecord()});
  const Bytes exported = joined({kReport, emptyRecord(5), {0x01}, emptyRecord(6), longRecord()});
  const auto reframed =
      reframedDlf(exported, {entry(first), Dictionary(), entry({0x01}), entry(second),
                             Dictionary{{"DLF", Value::data(exported)}}});
  ASSERT_TRUE(reframed);
  EXPECT_EQ(reframed->dlf, joined({kReport, emptyRecord(5), emptyRecord(6), longRecord()}));
  EXPECT_EQ(reframed->packetCount, 3U);
  EXPECT_THAT(reframed->unframed, IsEmpty());
}

TEST(ReframedDlf, NamesTheEntryWhosePacketsDoNotFrame) {
  const Bytes cut = joined({{0x01}, emptyRecord(5), {0x01, 0xAA}});
  const auto reframed = reframedDlf(joined({kReport, emptyRecord(5), {0x01, 0xAA}, longRecord()}),
                                    {entry(cut), entry(joined({{0x01}, longRecord()}))});
  ASSERT_TRUE(reframed);
  EXPECT_EQ(reframed->dlf, joined({kReport, emptyRecord(5), longRecord()}));
  EXPECT_EQ(reframed->packetCount, 2U);
  ASSERT_THAT(reframed->unframed, SizeIs(1));
  EXPECT_EQ(reframed->unframed[0].entry, 1U);
  EXPECT_EQ(reframed->unframed[0].size, 2U);
}

TEST(ReframedDlf, AReportAloneStays) {
  const auto reframed = reframedDlf(kReport, {});
  ASSERT_TRUE(reframed);
  EXPECT_EQ(reframed->dlf, kReport);
}

TEST(ReframedDlf, ALogThatIsNotTheEntriesIsRefused) {
  const Array entries{entry(joined({{0x01}, longRecord()}))};
  EXPECT_TRUE(reframedDlf(joined({kReport, longRecord()}), entries));
  EXPECT_FALSE(reframedDlf(joined({kReport, emptyRecord(5), {0, 0}}), entries));
  EXPECT_FALSE(reframedDlf(joined({kReport, longRecord(), {0}}), entries));
  EXPECT_FALSE(reframedDlf(kReport, entries));
  EXPECT_FALSE(reframedDlf(Bytes(160, 0xEE), {}));
  EXPECT_FALSE(reframedDlf({}, {}));
}

}  // namespace
}  // namespace kestro
