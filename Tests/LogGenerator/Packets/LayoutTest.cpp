// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <vector>

#include "LogGenerator/Packets/Field.h"

namespace kestro {
namespace {

// --- Which bits a place reads --------------------------------------------------------------------

TEST(PlaceTest, IntegersReadAllTheirBits) {
  EXPECT_EQ(u8(7).bitCount, 8);
  EXPECT_EQ(u16(7).bitCount, 16);
  EXPECT_EQ(u24(7).bitCount, 24);
  EXPECT_EQ(s32(7).bitCount, 32);
  EXPECT_TRUE(s8(0).isSigned);
  EXPECT_TRUE(s16(0).isSigned);
  EXPECT_FALSE(u32(0).isSigned);
}

TEST(PlaceTest, PartsOfAnIntegerKeepItsWidth) {
  const Place place = u32(21).bits(9, 17);
  EXPECT_EQ(place.offset, 21);
  EXPECT_EQ(place.width, 4);
  EXPECT_EQ(place.firstBit, 9);
  EXPECT_EQ(place.bitCount, 9);
  EXPECT_EQ(u8(3).bit(7), u8(3).bits(7, 7));
}

TEST(OverlapTest, IsDecidedBitByBit) {
  EXPECT_TRUE(overlap(u16(4).bits(0, 8), u8(5)));
  EXPECT_FALSE(overlap(u16(4).bits(0, 7), u8(5)));
  EXPECT_TRUE(overlap(u32(0).bits(17, 25), u16(2).bits(9, 15)));
  EXPECT_FALSE(overlap(u32(0).bits(17, 25), u16(2).bits(10, 15)));
  EXPECT_FALSE(overlap(u16(4), u16(6)));
  EXPECT_TRUE(overlap(u16(4), u16(5)));
}

TEST(OverlapTest, TakesBigEndianPlacesByWholeBytes) {
  EXPECT_TRUE(overlap(u16(4).bigEndian().bits(0, 3), u8(4)));
  EXPECT_FALSE(overlap(u16(4).bigEndian().bits(0, 3), u8(6)));
}

TEST(OverlapTest, ComparesPlacesOfOneOriginOnly) {
  EXPECT_FALSE(overlap(u8(4), u8(4).ofPacket()));
  EXPECT_FALSE(overlap(u8(4), u8(4).ofTwin()));
  EXPECT_TRUE(overlap(u8(4).ofTwin(), u8(4).ofTwin()));
}

// --- What a layout must keep to ------------------------------------------------------------------

bool isLayoutOf(const std::vector<Field>& fields) { return isLayout(fields); }

TEST(LayoutTest, FieldsSideBySideAreALayout) {
  EXPECT_TRUE(
      isLayoutOf({{"A", u16(0).bits(0, 8), decimal()}, {"B", u16(0).bits(9, 15), decimal()}}));
}

TEST(LayoutTest, RefusesFieldsThatReadTheSameBits) {
  EXPECT_FALSE(
      isLayoutOf({{"A", u16(0).bits(0, 8), decimal()}, {"B", u16(0).bits(8, 15), decimal()}}));
  EXPECT_FALSE(isLayoutOf({{"A", {u8(0), u8(2)}, eachDecimal()}, {"B", u16(1), decimal()}}));
}

TEST(LayoutTest, AcceptsSharedBits) {
  EXPECT_TRUE(isLayoutOf({{"A", u16(0), decimal()}, {"B", u16(0).shared(), decimal()}}));
}

TEST(LayoutTest, AcceptsBitsOfFieldsThatNeverMeet) {
  const Place kind = u8(0);
  const auto areALayout = [](When first, When second) {
    return isLayoutOf({{"A", u16(1), decimal(), first}, {"B", u8(2), decimal(), second}});
  };
  EXPECT_TRUE(areALayout(when(equals(kind, 1)), when(equals(kind, 2))));
  EXPECT_TRUE(areALayout(when(between(kind, 3, 4)), when(between(kind, 0, 2))));
  EXPECT_FALSE(areALayout(when(between(kind, 0, 2)), when(between(kind, 2, 3))));
  EXPECT_FALSE(areALayout(when(equals(kind, 1)), when(equals(u8(5), 2))));
  EXPECT_FALSE(areALayout(when(equals(kind, 1)), {}));
}

TEST(LayoutTest, NeedsAKeyForEveryField) { EXPECT_FALSE(isLayoutOf({{"", u8(0), decimal()}})); }

TEST(LayoutTest, RefusesPlacesOutsideTheirInteger) {
  EXPECT_FALSE(isLayoutOf({{"A", u8(0).bits(4, 8), decimal()}}));
  EXPECT_FALSE(isLayoutOf({{"A", u16(0).bits(16, 16), decimal()}}));
  EXPECT_FALSE(isLayoutOf({{"A", integerAt(0, 5, false), decimal()}}));
  EXPECT_FALSE(isLayoutOf({{"A", integerAt(0, 0, false), decimal()}}));
}

TEST(LayoutTest, HasAtMostSixtyFourFields) {
  std::vector<Field> fields;
  for (unsigned i = 0; i < 64; ++i) fields.emplace_back("A", u8(i), decimal());
  EXPECT_TRUE(isLayout(fields));
  fields.emplace_back("A", u8(64), decimal());
  EXPECT_FALSE(isLayout(fields));
}

TEST(ConditionTest, HoldsAlwaysUnlessSaidOtherwise) {
  EXPECT_TRUE(Condition().isAlways());
  EXPECT_FALSE(equals(u8(0), 0).isAlways());
  EXPECT_FALSE(between(u8(0), 0, 255).isAlways());
}

}  // namespace
}  // namespace kestro
