// SPDX-License-Identifier: MIT
#include <array>

#include "LogGenerator/C2K/EVDOThroughput.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using ::testing::StartsWith;

// --- 0x1192: forward link ------------------------------------------------------------------------

class ForwardThroughputTest : public C2KFixture {
 protected:
  static PacketBytes forward(std::uint32_t sequence) {
    return packet(0x1192).u32(13, sequence).length(241);
  }
  /// One counter of 1024 bits, the fourth, at this count.
  static PacketBytes forward(std::uint32_t sequence, std::uint32_t count) {
    return forward(sequence).u32(17 + 4 * 3, count);
  }

  [[nodiscard]] std::int64_t number(std::string_view key) const {
    EXPECT_TRUE(state[key].isInteger());
    return state[key].integerBits();
  }
  [[nodiscard]] std::int64_t extraNumber(std::string_view key) const {
    EXPECT_TRUE(extraInfo()[key].isInteger());
    return extraInfo()[key].integerBits();
  }
};

TEST_F(ForwardThroughputTest, TheFirstPacketPrimesTheRate) {
  receive(forward(7, 3));
  EXPECT_EQ(text("kFLDataRate"), "");
  EXPECT_EQ(number("FLDataSeqNum"), 7);
  EXPECT_EQ(number("FLDataSent"), 3072);
  EXPECT_EQ(extraNumber("FLDataSeqNum1"), 7);
  EXPECT_EQ(extraNumber("FLDataSent1"), 3072);
  EXPECT_THAT(extraInfo(), SizeIs(2));
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(ForwardThroughputTest, TheSecondPacketShowsTheRateBetweenThem) {
  receive(forward(7, 3));
  receive(forward(11, 13));
  EXPECT_EQ(text("kFLDataRate"), "2.50 kbps");  // 10 counts of 1024 bits in 4 steps
  EXPECT_EQ(number("FLDataSeqNum"), 11);
  EXPECT_EQ(number("FLDataSent"), 13312);
  EXPECT_EQ(extraNumber("FLDataSeqNum2"), 7);
  EXPECT_EQ(extraNumber("FLDataSent2"), 3072);
  EXPECT_EQ(extraNumber("FLDataSeqNum1"), 11);
  EXPECT_EQ(extraNumber("FLDataSent1"), 13312);
}

TEST_F(ForwardThroughputTest, MayBeLonger) {
  receive(forward(7, 3).length(242));
  EXPECT_EQ(number("FLDataSent"), 3072);
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(ForwardThroughputTest, WeighsEveryCounter) {
  const std::array<std::int64_t, 56> weights = {
      128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
      0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
      0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
      1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0};
  for (std::size_t i = 0; i < weights.size(); ++i) {
    receive(forward(1).u32(17 + 4 * i, 3));
    EXPECT_EQ(number("FLDataSent"), 3 * weights[i]) << i;
  }
}

TEST_F(ForwardThroughputTest, AddsUpMoreThanThirtyTwoBits) {
  PacketBytes packet = forward(1);
  for (std::size_t i = 0; i < 56; ++i) packet.u32(17 + 4 * i, 0xFFFFFFFF);
  receive(packet);
  // The weights add up to 48896.
  EXPECT_EQ(number("FLDataSent"), 48896 * 4294967295);
}

TEST_F(ForwardThroughputTest, KeepsTheRateWhileTheSequenceStands) {
  receive(forward(7, 0));
  receive(forward(8, 5));
  receive(forward(8, 9));
  EXPECT_EQ(text("kFLDataRate"), "5.00 kbps");
  EXPECT_EQ(extraNumber("FLDataSeqNum2"), 8);
  EXPECT_EQ(extraNumber("FLDataSent2"), 5120);
  EXPECT_EQ(number("FLDataSent"), 9216);
}

TEST_F(ForwardThroughputTest, KeepsTheRateWhenTheSequenceFalls) {
  receive(forward(7, 0));
  receive(forward(8, 5));
  receive(forward(3, 6));
  EXPECT_EQ(text("kFLDataRate"), "5.00 kbps");
  EXPECT_EQ(extraNumber("FLDataSeqNum2"), 8);
  EXPECT_EQ(number("FLDataSeqNum"), 3);
  receive(forward(4, 8));
  EXPECT_EQ(text("kFLDataRate"), "2.00 kbps");
}

TEST_F(ForwardThroughputTest, TheSequenceMayWrap) {
  receive(forward(0xFFFFFFFF, 0));
  EXPECT_EQ(number("FLDataSeqNum"), 4294967295);
  receive(forward(1, 4));
  EXPECT_EQ(text("kFLDataRate"), "2.00 kbps");
}

TEST_F(ForwardThroughputTest, TheLongestStepDoesNotWrap) {
  receive(forward(0, 0));
  receive(forward(0x7FFFFFFF).u32(17 + 4 * 52, 0xFFFFFFFF));
  // 5120 × 4294967295 / (2147483647 × 1024) = 10.0000000023
  EXPECT_EQ(text("kFLDataRate"), "10.00 kbps");
  receive(forward(0xFFFFFFFF, 0));  // 2147483648 steps are no step forward
  EXPECT_EQ(text("kFLDataRate"), "10.00 kbps");
}

TEST_F(ForwardThroughputTest, AFallingCountIsANegativeRate) {
  receive(forward(1, 10));
  receive(forward(2, 4));
  EXPECT_EQ(text("kFLDataRate"), "-6.00 kbps");
}

TEST_F(ForwardThroughputTest, ACounterThatWrapsIsANegativeRate) {
  receive(forward(1, 0xFFFFFFFF));
  receive(forward(2, 1));
  EXPECT_EQ(text("kFLDataRate"), "-4294967294.00 kbps");
  receive(forward(3, 0xFFFFFFFF));
  EXPECT_EQ(text("kFLDataRate"), "4294967294.00 kbps");
}

TEST_F(ForwardThroughputTest, RoundsToTwoDecimals) {
  receive(forward(0, 0));
  receive(forward(3, 2));
  EXPECT_EQ(text("kFLDataRate"), "0.67 kbps");
}

TEST_F(ForwardThroughputTest, BeginsAnewWhenTheStateLosesEitherValue) {
  for (const char* key : {"FLDataSeqNum", "FLDataSent"}) {
    receive(forward(7, 0));
    receive(forward(8, 5));
    state.remove(key);
    receive(forward(9, 9));
    EXPECT_EQ(text("kFLDataRate"), "") << key;
  }
}

TEST_F(ForwardThroughputTest, GoesOnWithoutExtraInformation) {
  receive(forward(7, 0));
  state.remove("ExtraInfo");
  receive(forward(8, 5));
  EXPECT_EQ(text("kFLDataRate"), "5.00 kbps");
}

TEST_F(ForwardThroughputTest, NeedsTwoHundredAndFortyOneBytes) {
  receive(forward(7, 0).length(240));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x1192 is 240 bytes long but must be at "
                                                 "least 241 bytes.")));
  EXPECT_FALSE(state.contains("FLDataSeqNum"));
  EXPECT_THAT(extraInfo(), IsEmpty());
}

TEST_F(ForwardThroughputTest, IsExplained) {
  const std::vector<std::string> lines = explained(forward(7, 1));
  ASSERT_THAT(lines, SizeIs(1));
  EXPECT_THAT(lines[0], StartsWith("kFLDataRate=(since the packet before) 13 17 21 25 29 "));
  EXPECT_TRUE(lines[0].ends_with(" 233 237"));
  EXPECT_THAT(explained(forward(7).length(240)), IsEmpty());
}

// --- 0x127E: reverse link ------------------------------------------------------------------------

class ReverseThroughputTest : public C2KFixture {
 protected:
  static PacketBytes reverse(std::uint32_t sequence) {
    return packet(0x127E).u32(14, sequence).length(1750);
  }

  [[nodiscard]] std::int64_t sent() const { return state["RLDataSent"].integerBits(); }

  static constexpr std::array<std::int64_t, 12> kBits = {128,  256,  512,  768,  1024, 1536,
                                                         2048, 3072, 4096, 6144, 8192, 12288};
  static constexpr std::array<std::size_t, 8> kOffsets = {18, 22, 26, 30, 306, 310, 314, 318};
};

TEST_F(ReverseThroughputTest, ShowsTheRateBetweenTwoPackets) {
  receive(reverse(100).u32(18 + 24 * 4, 6));
  EXPECT_EQ(text("kRLDataRate"), "");
  receive(reverse(102).u32(18 + 24 * 4, 7));
  EXPECT_EQ(text("kRLDataRate"), "0.50 kbps");
  EXPECT_EQ(state["RLDataSeqNum"], Value::integer(102));
  EXPECT_EQ(Value(extraInfo()), Value(Dictionary{{"RLDataSeqNum1", Value::integer(102)},
                                                 {"RLDataSent1", Value::integer(7168)},
                                                 {"RLDataSeqNum2", Value::integer(100)},
                                                 {"RLDataSent2", Value::integer(6144)}}));
}

TEST_F(ReverseThroughputTest, WeighsEveryCounterOfEveryRateAndBlock) {
  for (std::size_t rate = 0; rate < 12; ++rate) {
    for (std::size_t block = 0; block < 3; ++block) {
      for (const std::size_t offset : kOffsets) {
        receive(reverse(1).u32(offset + 24 * rate + 576 * block, 5));
        EXPECT_EQ(sent(), 5 * kBits[rate]) << rate << " " << block << " " << offset;
      }
    }
  }
}

TEST_F(ReverseThroughputTest, CountsNoOtherBytes) {
  PacketBytes packet = reverse(1).length(14).u32(14, 1).length(1750, 0xFF);
  for (std::size_t rate = 0; rate < 12; ++rate) {
    for (std::size_t block = 0; block < 3; ++block) {
      for (const std::size_t offset : kOffsets) packet.u32(offset + 24 * rate + 576 * block, 0);
    }
  }
  receive(packet);
  EXPECT_EQ(sent(), 0);
}

TEST_F(ReverseThroughputTest, AddsUpMoreThanThirtyTwoBits) {
  receive(reverse(1).length(14).u32(14, 1).length(1750, 0xFF));
  // 24 counters for each of the rates, whose weights add up to 40064.
  EXPECT_EQ(sent(), 24 * 40064 * 4294967295);
}

TEST_F(ReverseThroughputTest, KeepsTheRateWhileTheSequenceStands) {
  receive(reverse(1));
  receive(reverse(2).u32(18 + 24 * 4, 3));
  receive(reverse(2).u32(18 + 24 * 4, 9));
  EXPECT_EQ(text("kRLDataRate"), "3.00 kbps");
}

TEST_F(ReverseThroughputTest, SequenceAndCountersMayWrap) {
  receive(reverse(0xFFFFFFFE).u32(18 + 24 * 4, 0xFFFFFFFF));
  receive(reverse(2).u32(18 + 24 * 4, 3));
  EXPECT_EQ(text("kRLDataRate"), "-1073741823.00 kbps");  // -4294967292 counts in 4 steps
  EXPECT_EQ(state["RLDataSeqNum"], Value::integer(2));
  EXPECT_EQ(extraInfo()["RLDataSeqNum2"], Value::integer(0xFFFFFFFE));
}

TEST_F(ReverseThroughputTest, LeavesTheForwardLinkAlone) {
  receive(reverse(1));
  EXPECT_FALSE(state.contains("FLDataSeqNum"));
  EXPECT_EQ(text("kFLDataRate"), "");
}

TEST_F(ReverseThroughputTest, NeedsSeventeenHundredAndFiftyBytes) {
  receive(reverse(1).length(1749));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x127e is 1749 bytes long but must be "
                                                 "at least 1750 bytes.")));
  EXPECT_FALSE(state.contains("RLDataSeqNum"));
}

TEST_F(ReverseThroughputTest, IsExplained) {
  const std::vector<std::string> lines = explained(reverse(7));
  ASSERT_THAT(lines, SizeIs(1));
  EXPECT_THAT(lines[0], StartsWith("kRLDataRate=(since the packet before) 14 18 22 26 30 306 "));
  EXPECT_EQ(std::ranges::count(lines[0], ' '), 3 + 1 + 288);
}

}  // namespace
}  // namespace kestro::testing
