// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "LogGenerator/Packets/Walk.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

// --- Reading a place -----------------------------------------------------------------------------

const Bytes kBytes = {0x12, 0x34, 0x56, 0x78, 0x9A, 0xBC, 0xDE, 0xF0};

std::int64_t read(const Place& place, const RecordPosition& position = {}) {
  return readNumber(place, PacketView(kBytes), position);
}

TEST(ReadNumberTest, ReadsLittleAndBigEndian) {
  EXPECT_EQ(read(u16(1)), 0x5634);
  EXPECT_EQ(read(u16(1).bigEndian()), 0x3456);
  EXPECT_EQ(read(u24(1)), 0x785634);
  EXPECT_EQ(read(u24(1).bigEndian()), 0x345678);
  EXPECT_EQ(read(u32(1).bigEndian()), 0x3456789A);
}

TEST(ReadNumberTest, CountsBitsFromTheLeastSignificant) {
  EXPECT_EQ(read(u16(1).bits(4, 11)), 0x63);              // 0x5634
  EXPECT_EQ(read(u16(1).bigEndian().bits(4, 11)), 0x45);  // 0x3456
  EXPECT_EQ(read(u32(4).bits(31, 31)), 1);                // 0xF0DEBC9A
  EXPECT_EQ(read(u8(0).bit(1)), 1);                       // 0x12
}

TEST(ReadNumberTest, ExtendsTheSignOfTheBitsThatItReads) {
  EXPECT_EQ(read(s8(4)), 0x9A - 0x100);
  EXPECT_EQ(read(s16(6)), 0xF0DE - 0x10000);
  EXPECT_EQ(read(s32(4)), std::int64_t{0xF0DEBC9A} - 0x100000000);
  EXPECT_EQ(read(s16(6).bits(4, 11)), 0x0D);
  EXPECT_EQ(read(s16(6).bits(4, 7)), -3);  // 0xD of four bits
  EXPECT_EQ(read(u32(4)), 0xF0DEBC9A);
}

TEST(ReadNumberTest, CountsFromThePlacesOrigin) {
  const RecordPosition position{.here = 2, .twin = 5};
  EXPECT_EQ(read(u8(1), position), 0x78);
  EXPECT_EQ(read(u8(1).ofPacket(), position), 0x34);
  EXPECT_EQ(read(u8(1).ofTwin(), position), 0xDE);
}

TEST(ReadNumberTest, BytesPastTheEndAreZeroInEitherByteOrder) {
  EXPECT_EQ(read(u16(7)), 0x00F0);
  EXPECT_EQ(read(u16(7).bigEndian()), 0xF000);
}

TEST(HoldsTest, IncludesBothBounds) {
  const auto holdsFor = [](std::int64_t lowest, std::int64_t highest) {
    return holds(between(u8(0), lowest, highest), PacketView(kBytes), {});  // 0x12 is 18
  };
  EXPECT_TRUE(holdsFor(18, 18));
  EXPECT_TRUE(holdsFor(17, 18));
  EXPECT_TRUE(holdsFor(18, 19));
  EXPECT_FALSE(holdsFor(19, 30));
  EXPECT_FALSE(holdsFor(0, 17));
  EXPECT_TRUE(holds({}, PacketView(kBytes), {}));
}

// --- Walking a table -----------------------------------------------------------------------------

/// Byte 0 counts the records of four bytes behind it; byte 1 is another count.
constexpr RecordTable kTable = {.name = "record", .count = u8(0), .base = 2, .stride = 4};

RecordTable bounded(RecordTable table, const Place& bounds) {
  table.boundsCount = bounds;
  return table;
}

std::vector<std::size_t> starts(const RecordTable& table, const Bytes& bytes) {
  std::vector<std::size_t> result;
  forEachRecord(table, PacketView(bytes), [&](std::size_t index, const RecordPosition& position) {
    EXPECT_LT(index, 256U);
    result.push_back(position.here);
  });
  return result;
}

TEST(RecordTableTest, PlacesRecordsByTheirStride) {
  EXPECT_THAT(starts(kTable, {3, 0}), ElementsAre(2, 6, 10));
  EXPECT_THAT(starts(kTable, {0, 0}), IsEmpty());
}

TEST(RecordTableTest, StandsBehindATableThatAnotherCountMakesLonger) {
  RecordTable table = kTable;
  table.counted = u8(1);
  table.perCount = 6;
  EXPECT_THAT(starts(table, {2, 5}), ElementsAre(32, 36));
}

TEST(RecordTableTest, AddsToTheCount) {
  RecordTable table = kTable;
  table.count = table.boundsCount = u8(0).bits(0, 4);
  table.countAddend = 1;
  EXPECT_THAT(starts(table, {0, 0}), ElementsAre(2));
  EXPECT_EQ(starts(table, {0x1F, 0}).size(), 32U);
}

TEST(RecordTableTest, ThrowsForAnIndexAtTheCount) {
  const Bytes two = {2, 0};
  EXPECT_NO_THROW(static_cast<void>(recordAt(kTable, PacketView(two), 1)));
  EXPECT_THROW(static_cast<void>(recordAt(kTable, PacketView(two), 2)), ArrayOutOfBoundsException);
  const Bytes none = {0, 0};
  EXPECT_THROW(static_cast<void>(recordAt(kTable, PacketView(none), 0)), ArrayOutOfBoundsException);
}

TEST(RecordTableTest, ThrowsWhereTheBoundsCountIsBelowTheLoops) {
  const RecordTable table = bounded(kTable, u8(1));
  EXPECT_THAT(starts(table, {2, 2}), ElementsAre(2, 6));
  EXPECT_THROW(starts(table, {2, 1}), ArrayOutOfBoundsException);
}

TEST(RecordTableTest, IsNotBoundedUnlessItSaysSo) {
  RecordTable table = bounded(kTable, u8(1));
  table.isBounded = false;
  EXPECT_THAT(starts(table, {2, 0}), ElementsAre(2, 6));
}

TEST(RecordTableTest, LeavesOutRecordsThatFailItsCondition) {
  RecordTable table = kTable;
  table.stride = 1;
  table.keep = equals(u8(0).bits(4, 7), 0);
  EXPECT_THAT(starts(table, {4, 0, 0x01, 0x11, 0x02, 0xF0}), ElementsAre(2, 4));
}

TEST(RecordTableTest, MayKeepNoneButChecksTheBoundsAllTheSame) {
  RecordTable table = bounded(kTable, u8(1));
  table.keepsNone = true;
  EXPECT_THAT(starts(table, {2, 2}), IsEmpty());
  EXPECT_THROW(starts(table, {2, 1}), ArrayOutOfBoundsException);
}

TEST(RecordTableTest, PlacesTheTwinByItsOwnRule) {
  RecordTable table = kTable;
  table.twinBase = 16;
  table.twinPerCount = 15;
  table.twinStride = 44;
  const Bytes bytes = {2, 0};
  EXPECT_EQ(recordAt(table, PacketView(bytes), 0).twin, 46U);
  EXPECT_EQ(recordAt(table, PacketView(bytes), 1).twin, 90U);
}

TEST(ArrayOutOfBoundsExceptionTest, IsAStandardException) {
  const ArrayOutOfBoundsException failure;
  EXPECT_STREQ(static_cast<const std::exception&>(failure).what(), std::exception().what());
}

}  // namespace
}  // namespace kestro
