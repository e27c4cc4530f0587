// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/FrameErrorRate.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class FrameErrorRateTest : public C2KFixture {
 protected:
  static PacketBytes frame(unsigned errors) {
    return packetOf(0x119D, {SubPacketBytes(11, 25).u8(24, errors)});
  }
  static PacketBytes goodFrame() { return frame(0); }
  static PacketBytes badFrame() { return frame(1); }
};

TEST_F(FrameErrorRateTest, CountsABadFrameAsOneSixtyFourth) {
  receive(badFrame());
  EXPECT_EQ(text("k1xTrafficFER"), "1.56%");  // 1.5625
  EXPECT_EQ(state["TrafficFER"], Value::real(0.015625));
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(FrameErrorRateTest, StartsAtZeroWithAGoodFrame) {
  receive(goodFrame());
  EXPECT_EQ(text("k1xTrafficFER"), "0.00%");
  EXPECT_EQ(state["TrafficFER"], Value::real(0));
}

TEST_F(FrameErrorRateTest, FallsWithEveryGoodFrame) {
  receive(badFrame());
  receive(goodFrame());
  EXPECT_EQ(text("k1xTrafficFER"), "1.54%");  // 100 × 63 / 4096 = 1.538
  receive(goodFrame());
  EXPECT_EQ(text("k1xTrafficFER"), "1.51%");  // 100 × 63² / 64³ = 1.514
}

TEST_F(FrameErrorRateTest, AnyErrorMakesAFrameBad) {
  for (const unsigned errors : {1U, 2U, 128U, 255U}) {
    state.remove("TrafficFER");
    receive(frame(errors));
    EXPECT_EQ(text("k1xTrafficFER"), "1.56%") << errors;
  }
}

TEST_F(FrameErrorRateTest, SixtyFourBadFramesFromZero) {
  receive(goodFrame());
  for (int i = 0; i < 64; ++i) receive(badFrame());
  EXPECT_EQ(text("k1xTrafficFER"), "63.50%");  // 1 - (63 / 64)^64 = 0.63501
}

TEST_F(FrameErrorRateTest, IsKeptInSinglePrecision) {
  // 0.3 as a float is 0.300000011920929; 0.984375 of it, rounded to a float, is 0.295312523841858.
  state.set("TrafficFER", Value::real(0.3));
  receive(goodFrame());
  EXPECT_EQ(state["TrafficFER"], Value::real(0.2953125238418579));
}

TEST_F(FrameErrorRateTest, IsShownInSinglePrecision) {
  // 0.08 as a float is 0.0799999982; 0.984375 of it is 0.0787499994, and 100 times that, rounded to
  // a float, is 7.875 exactly. A double would be 7.87499994 and show 7.87.
  state.set("TrafficFER", Value::real(0.08));
  receive(goodFrame());
  EXPECT_EQ(text("k1xTrafficFER"), "7.88%");
}

TEST_F(FrameErrorRateTest, ForgetsAValueThatIsNoNumber) {
  for (const Value& other : {Value("1"), Value(Dictionary()), Value::boolean(true)}) {
    state.set("TrafficFER", other);
    receive(badFrame());
    EXPECT_EQ(text("k1xTrafficFER"), "1.56%");
  }
}

TEST_F(FrameErrorRateTest, TakesAWholeNumberToo) {
  state.set("TrafficFER", Value::integer(1));
  receive(goodFrame());
  EXPECT_EQ(text("k1xTrafficFER"), "98.44%");  // 98.4375
}

TEST_F(FrameErrorRateTest, FindsItsSubPacketAmongOthers) {
  receive(packetOf(0x119D, {{1, 30}, {12, 5}, SubPacketBytes(11, 25).u8(24, 1), {13, 4}}));
  EXPECT_EQ(text("k1xTrafficFER"), "1.56%");
}

TEST_F(FrameErrorRateTest, ReadsAFlagPastTheEndAsAGoodFrame) {
  receive(badFrame().length(17 + 24));
  EXPECT_EQ(text("k1xTrafficFER"), "0.00%");
}

TEST_F(FrameErrorRateTest, NeedsItsSubPacket) {
  state.set("TrafficFER", Value::real(0.5));
  receive(packetOf(0x119D, {{10, 30}, {12, 30}}));
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("Log code 0x119d: missing traffic demod subpacket.")));
  EXPECT_EQ(state["TrafficFER"], Value::real(0.5));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(FrameErrorRateTest, ReportsABadSize) {
  receive(badFrame().u16(17 + 2, 25 + 17));
  EXPECT_THAT(takeLines(),
              ElementsAre(errorLine("Log code error in subpkt#0: bad size (42)."),
                          warningLine("Log code 0x119d: missing traffic demod subpacket.")));
}

TEST_F(FrameErrorRateTest, NeedsSeventeenBytes) {
  receive(badFrame().length(16));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x119d is 16 bytes long but must be at "
                                                 "least 17 bytes.")));
}

TEST_F(FrameErrorRateTest, IsExplained) {
  EXPECT_THAT(explained(badFrame()), ElementsAre("k1xTrafficFER=(with the packets before) 41"));
  EXPECT_THAT(explained(packetOf(0x119D, {{10, 30}})), IsEmpty());
  EXPECT_THAT(explained(badFrame().length(16)), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
