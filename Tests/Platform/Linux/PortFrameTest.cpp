// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Platform/Linux/PortFrame.h"
#include "Platform/MessagePort.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;

constexpr std::uint8_t kMessageBytes[] = {0x01, 0, 0, 0, 0x78, 0x56, 0x34, 0x12,
                                          0,    0, 0, 0, 0x02, 0x01, 0,    0};
constexpr std::uint8_t kReplyBytes[] = {0x03, 0,    0,    0,    0xFE, 0xFF, 0xFF, 0xFF,
                                        0x04, 0x03, 0x02, 0x01, 0,    0,    0,    0x01};

bool isMalformed(std::initializer_list<std::uint8_t> bytes, PortDirection direction) {
  return !decodePortFrameHeader(ByteView(bytes.begin(), bytes.size()), direction);
}

TEST(PortFrame, AMessageIsEncodedFieldByField) {
  EXPECT_THAT(encodePortFrameHeader({PortFrameKind::Message, 0x12345678, 0, 0x102}),
              ::testing::ElementsAreArray(kMessageBytes));
}

TEST(PortFrame, AReplyIsEncodedFieldByField) {
  EXPECT_THAT(encodePortFrameHeader({PortFrameKind::Reply, -2, 0x01020304, 0x01000000}),
              ::testing::ElementsAreArray(kReplyBytes));
}

TEST(PortFrame, EveryFieldOfAMessageIsDecoded) {
  const auto header = decodePortFrameHeader(kMessageBytes, PortDirection::ToReceiver);
  ASSERT_TRUE(header);
  EXPECT_EQ(*header, (PortFrameHeader{PortFrameKind::Message, 0x12345678, 0, 0x102}));
}

TEST(PortFrame, EveryFieldOfAReplyIsDecoded) {
  const auto header = decodePortFrameHeader(kReplyBytes, PortDirection::ToSender);
  ASSERT_TRUE(header);
  EXPECT_EQ(*header, (PortFrameHeader{PortFrameKind::Reply, -2, 0x01020304, 16 * 1024 * 1024}));
}

TEST(PortFrame, UnknownKindsAreMalformed) {
  for (const auto direction : {PortDirection::ToReceiver, PortDirection::ToSender}) {
    for (const std::uint8_t kind : std::initializer_list<std::uint8_t>{0, 5, 255}) {
      EXPECT_TRUE(isMalformed({kind, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0}, direction));
    }
  }
}

TEST(PortFrame, AKindTravelsOneWayOnly) {
  EXPECT_FALSE(decodePortFrameHeader(kMessageBytes, PortDirection::ToSender));
  EXPECT_FALSE(decodePortFrameHeader(kReplyBytes, PortDirection::ToReceiver));
}

TEST(PortFrame, EachReservedByteMustBeZero) {
  using enum PortDirection;
  EXPECT_FALSE(isMalformed({1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, ToReceiver));
  EXPECT_TRUE(isMalformed({1, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, ToReceiver));
  EXPECT_TRUE(isMalformed({1, 0, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, ToReceiver));
  EXPECT_TRUE(isMalformed({1, 0, 0, 128, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, ToReceiver));
}

TEST(PortFrame, OnlyAMessageHasSequenceZero) {
  using enum PortDirection;
  EXPECT_TRUE(isMalformed({1, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0}, ToReceiver));
  EXPECT_TRUE(isMalformed({2, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, ToReceiver));
  EXPECT_TRUE(isMalformed({3, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, ToSender));
  EXPECT_TRUE(isMalformed({4, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, ToSender));
}

TEST(PortFrame, ALengthAboveSixteenMebibytesIsMalformed) {
  using enum PortDirection;
  EXPECT_FALSE(isMalformed({1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1}, ToReceiver));
  EXPECT_TRUE(isMalformed({1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 1}, ToReceiver));
}

TEST(PortFrame, AReplyWithoutDataHasNoBody) {
  using enum PortDirection;
  EXPECT_FALSE(isMalformed({4, 0, 0, 0, 0, 0, 0, 0, 7, 0, 0, 0, 0, 0, 0, 0}, ToSender));
  EXPECT_TRUE(isMalformed({4, 0, 0, 0, 0, 0, 0, 0, 7, 0, 0, 0, 1, 0, 0, 0}, ToSender));
}

TEST(PortFrame, TheErrorSaysWhatIsWrong) {
  constexpr std::uint8_t kOverLong[] = {1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 1};
  const auto header = decodePortFrameHeader(kOverLong, PortDirection::ToReceiver);
  ASSERT_FALSE(header);
  EXPECT_EQ(header.error().message, "a frame of 16777217 bytes, at most 16777216 are allowed");
}

}  // namespace
}  // namespace kestro
