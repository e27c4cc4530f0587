// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "LogGenerator/Packets/Encode.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;

constexpr NamedValue kColours[] = {{0, "red"}, {3, "blue"}};

constexpr Field kPacketFields[] = {
    {"Level", u16(13).bits(0, 8), scaled("%4.2f dBm", -140, 0.25)},
    {"Priority", u16(13).bits(9, 12), decimal()},
    {"Power", s8(15), decimal("%d dBm", -30).absentAt(64, "Not Present")},
    {"Colour", u8(16), named(kColours, "Unknown")},
    {"Area", u16(17).bigEndian(), decimal()},
    {"Digits", {u8(19).bits(0, 3), u8(19).bits(4, 7)}, computed(nullptr)},
    {"Records", u8(20).bits(2, 4), hidden()},
};
static_assert(isLayout(kPacketFields));

constexpr Field kEncodedFields[] = {
    {"Cell", u16(0), decimal()},
    {"Energy", u8(1).ofTwin(), decimal()},
};

constexpr RecordTable kEncodedTable = {.name = "cell",
                                       .count = u8(20).bits(2, 4),
                                       .countAddend = 1,
                                       .base = 21,
                                       .stride = 2,
                                       .fields = kEncodedFields,
                                       .twinBase = 21,
                                       .twinPerCount = 3,
                                       .twinStride = 4};

class EncodeTest : public ::testing::Test {
 protected:
  std::vector<int> payload() {
    const Bytes bytes =
        writer.finish(Moment(std::chrono::microseconds(0x0102030405060708))).value();
    return {bytes.begin() + 13, bytes.end()};
  }

  PacketWriter writer{0xB17F, 21};
};

TEST_F(EncodeTest, TheNumberOfAHiddenFieldIsItsRawValue) {
  writer.fields(kPacketFields).number("Records", 5);
  EXPECT_EQ(payload()[20 - 13], 5 << 2);
}

TEST_F(EncodeTest, ATextHasNoNumber) {
  writer.fields(kPacketFields).number("Colour", 3);
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, NoFewerRecordsThanTheCountSaysForItself) {
  writer.setCount(kEncodedTable, 0);
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, WritesTheHeaderOfABasebandPacket) {
  PacketWriter empty(0xB17F, 0);
  const Bytes bytes = empty.finish(Moment(std::chrono::microseconds(0x0102030405060708))).value();
  EXPECT_THAT(bytes, ElementsAre(1, 12, 0, 0x7F, 0xB1, 8, 7, 6, 5, 4, 3, 2, 1));
}

TEST_F(EncodeTest, MarksExtraPacketsAndStripsTheirOffset) {
  PacketWriter extra(0xFF0002, 0);
  extra.append(Bytes{0xAA, 0xBB});
  const Bytes bytes = extra.finish(Moment(std::chrono::microseconds(1))).value();
  EXPECT_THAT(bytes, ElementsAre(0xFF, 14, 0, 2, 0, 1, 0, 0, 0, 0, 0, 0, 0, 0xAA, 0xBB));
}

TEST_F(EncodeTest, PacksBitFieldsBesideEachOther) {
  // (-100.25 + 140) / 0.25 = 159 = 0x09F; 5 << 9 = 0xA00
  writer.fields(kPacketFields).number("Level", -100.25).raw("Priority", 5);
  EXPECT_THAT(payload(), ElementsAre(0x9F, 0x0A, 0, 0, 0, 0, 0, 0));
}

TEST_F(EncodeTest, RoundsToTheNearestRawValue) {
  // (-100.10 + 140) / 0.25 = 159.6
  writer.fields(kPacketFields).number("Level", -100.10);
  EXPECT_THAT(payload(), ElementsAre(160, 0, 0, 0, 0, 0, 0, 0));
}

TEST_F(EncodeTest, OverwritesEarlierBits) {
  writer.fields(kPacketFields).raw("Level", 511).raw("Level", 1);
  EXPECT_THAT(payload(), ElementsAre(1, 0, 0, 0, 0, 0, 0, 0));
}

TEST_F(EncodeTest, InvertsWholeNumbersNamesAndAbsentValues) {
  writer.fields(kPacketFields).number("Power", -40).text("Colour", "blue");
  EXPECT_THAT(payload(), ElementsAre(0, 0, 0xF6, 3, 0, 0, 0, 0));  // -40 + 30 = -10
  writer.fields(kPacketFields).text("Power", "Not Present");
  EXPECT_THAT(payload(), ElementsAre(0, 0, 64, 3, 0, 0, 0, 0));
}

TEST_F(EncodeTest, WritesBigEndianPlacesAndSeveralPlacesOfOneField) {
  writer.fields(kPacketFields).raw("Area", 0x1234).raw("Digits", {0x5, 0x9});
  EXPECT_THAT(payload(), ElementsAre(0, 0, 0, 0, 0x12, 0x34, 0x95, 0));
}

TEST_F(EncodeTest, PlacesRecordsAndTwinsByTheCount) {
  writer.setCount(kEncodedTable, 2);  // stored as 1 in bits 2 to 4
  writer.record(kEncodedTable, 1).raw("Cell", 0x0A0B).raw("Energy", 7);
  // record 1 at 21 + 2; its twin at 21 + 3 × 1 + 4 = 28, the energy in its second byte
  EXPECT_THAT(payload(), ElementsAre(0, 0, 0, 0, 0, 0, 0, 4, 0, 0, 0x0B, 0x0A, 0, 0, 0, 0, 7));
}

TEST_F(EncodeTest, YieldsNothingForAValueThatDoesNotFit) {
  writer.fields(kPacketFields).number("Level", 0);  // 560 needs more than 9 bits
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, YieldsNothingForANegativeRawValueOfAnUnsignedPlace) {
  writer.fields(kPacketFields).number("Level", -140.25);
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, YieldsNothingForAnUnknownKey) {
  writer.fields(kPacketFields).raw("Lvel", 1);
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, YieldsNothingForANameThatTheTableLacks) {
  writer.fields(kPacketFields).text("Colour", "green");
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, YieldsNothingForTheWrongNumberOfRawValues) {
  writer.fields(kPacketFields).raw("Digits", 5);
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, YieldsNothingForATooLargeCount) {
  writer.setCount(kEncodedTable, 9);  // 3 bits hold 7, one is added
  for (std::size_t i = 0; i < 9; ++i) writer.record(kEncodedTable, i).raw("Cell", 1);
  EXPECT_FALSE(writer.finish(Moment()));
}

TEST_F(EncodeTest, RefusesARecordPastTheCount) {
  writer.setCount(kEncodedTable, 2);
  EXPECT_THROW(static_cast<void>(writer.record(kEncodedTable, 2)), ArrayOutOfBoundsException);
}

}  // namespace
}  // namespace kestro
