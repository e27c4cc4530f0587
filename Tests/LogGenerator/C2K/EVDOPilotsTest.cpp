// SPDX-License-Identifier: MIT
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

// --- 0x12B6: active set --------------------------------------------------------------------------

class EVDOActiveSetTest : public C2KFixture {
 protected:
  /// Three pilots, two of them with one PN offset. 512 is 0 dB, 5120 10 dB, 256 about -3 dB.
  static PacketBytes threePilots() {
    return packet(0x12B6)
        .u8(15, 3)
        .u16(25, 168)
        .u16(27, 512)
        .u16(37, 12)
        .u16(39, 5120)
        .u16(49, 168)
        .u16(51, 256)
        .length(61);
  }

  std::string energyOf(unsigned x) {
    receive(packet(0x12B6).u8(15, 1).u16(27, x).length(37));
    return pilots("kActiveSetPilots")[1].second;
  }
};

TEST_F(EVDOActiveSetTest, ShowsEveryPilotUnderItsNumberAndPNOffset) {
  receive(threePilots());
  EXPECT_THAT(pilots("kActiveSetPilots"),
              ElementsAre(Pair("_sorted", "_sorted"), Pair("0;168", "+0.00 dB"),
                          Pair("1;12", "+10.00 dB"), Pair("2;168", "-3.01 dB")));
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(EVDOActiveSetTest, ShowsEnergiesInDecibels) {
  EXPECT_EQ(energyOf(0), "-inf dB");
  EXPECT_EQ(energyOf(1), "-27.09 dB");      // 10 log10(1 / 512) = -27.0927
  EXPECT_EQ(energyOf(511), "-0.01 dB");     // -0.00849
  EXPECT_EQ(energyOf(513), "+0.01 dB");     // 0.00847
  EXPECT_EQ(energyOf(65535), "+21.07 dB");  // 21.0720
}

TEST_F(EVDOActiveSetTest, ShowsAnEmptySetAsAText) {
  receive(threePilots());
  receive(packet(0x12B6).length(25));
  EXPECT_EQ(text("kActiveSetPilots"), "(none)");
}

TEST_F(EVDOActiveSetTest, ReplacesTheSet) {
  receive(threePilots());
  receive(threePilots().u8(15, 1));
  EXPECT_THAT(pilots("kActiveSetPilots"), SizeIs(2));
}

TEST_F(EVDOActiveSetTest, LeavesAListThatSomebodyHasAsItWas) {
  receive(threePilots());
  const Dictionary held = display()["kActiveSetPilots"].dictionary();
  generator->generateLogUsingState(state);
  receive(packet(0x12B6).u8(15, 1).u16(25, 7).u16(27, 5120).length(37));
  EXPECT_EQ(Value(held), Value(Dictionary{{"_sorted", "_sorted"},
                                          {"0;168", "+0.00 dB"},
                                          {"1;12", "+10.00 dB"},
                                          {"2;168", "-3.01 dB"}}));
  const Value kept = state["History"].array()[0].dictionary()["Display"];
  EXPECT_EQ(kept.dictionary()["kActiveSetPilots"], Value(held));
  EXPECT_THAT(pilots("kActiveSetPilots"),
              ElementsAre(Pair("_sorted", "_sorted"), Pair("0;7", "+10.00 dB")));
}

TEST_F(EVDOActiveSetTest, WritingAListAnewLeavesTheHistoryAsItWas) {
  receive(threePilots());
  generator->generateLogUsingState(state);
  receive(packet(0x12B6).u8(15, 1).u16(25, 7).u16(27, 5120).length(37));
  const Value kept = state["History"].array()[0].dictionary()["Display"];
  EXPECT_EQ(kept.dictionary()["kActiveSetPilots"], Value(Dictionary{{"_sorted", "_sorted"},
                                                                    {"0;168", "+0.00 dB"},
                                                                    {"1;12", "+10.00 dB"},
                                                                    {"2;168", "-3.01 dB"}}));
}

TEST_F(EVDOActiveSetTest, ShowsTheListAtEveryPlaceOfItsName) {
  setTemplate(Dictionary{{"A", "kActiveSetPilots"}, {"B", "kActiveSetPilots"}});
  receive(threePilots());
  receive(packet(0x12B6).u8(15, 1).u16(25, 7).u16(27, 5120).length(37));
  const Value expected = Dictionary{{"_sorted", "_sorted"}, {"0;7", "+10.00 dB"}};
  EXPECT_EQ(display()["A"], expected);
  EXPECT_EQ(display()["B"], expected);
}

TEST_F(EVDOActiveSetTest, NeedsTwentyFiveBytes) {
  receive(threePilots().length(24));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x12b6 is 24 bytes long but must be at "
                                                 "least 25 bytes.")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(EVDOActiveSetTest, NeedsTwelveBytesForEachPilot) {
  receive(threePilots().length(60));
  EXPECT_THAT(takeLines(),
              ElementsAre(errorLine("Log code 0x12b6 is 60 bytes long, but has 3 substructs.")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(EVDOActiveSetTest, MayBeLonger) {
  receive(threePilots().length(62));
  EXPECT_THAT(pilots("kActiveSetPilots"), SizeIs(4));
}

TEST_F(EVDOActiveSetTest, HoldsTwoHundredAndFiftyFivePilots) {
  receive(packet(0x12B6).u8(15, 255).length(25 + 12 * 255));
  const auto shown = pilots("kActiveSetPilots");
  ASSERT_THAT(shown, SizeIs(256));
  EXPECT_THAT(shown[255], Pair("254;0", "-inf dB"));
}

TEST_F(EVDOActiveSetTest, IsExplained) {
  EXPECT_THAT(explained(threePilots().u8(15, 1)),
              ElementsAre("kActiveSetPilots count= 15", "kActiveSetPilots[0] PN Offset=168 25",
                          "kActiveSetPilots[0] Energy=+0.00 dB 27"));
  EXPECT_THAT(explained(threePilots().length(24)), IsEmpty());
  EXPECT_THAT(explained(threePilots().length(60)), IsEmpty());
}

// --- 0x108A: fingers -----------------------------------------------------------------------------

class EVDOFingersTest : public C2KFixture {
 protected:
  /// Three fingers, the second unused.
  static PacketBytes threeFingers() {
    return packet(0x108A)
        .u8(22, 3)
        .u16(23, 168)
        .u16(29, 512)
        .u16(37, 0xFFFF)
        .u16(43, 512)
        .u16(51, 0xFFFE)
        .u16(57, 5120)
        .length(65);
  }
};

TEST_F(EVDOFingersTest, ShowsTheFingersThatAreUsed) {
  receive(threeFingers());
  EXPECT_THAT(pilots("kFingerC2I"),
              ElementsAre(Pair("_sorted", "_sorted"), Pair("0;168", "+0.00 dB"),
                          Pair("2;65534", "+10.00 dB")));
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(EVDOFingersTest, ShowsUnusedFingersAsAText) {
  receive(threeFingers().u16(23, 0xFFFF).u16(51, 0xFFFF));
  EXPECT_EQ(text("kFingerC2I"), "(none)");
}

TEST_F(EVDOFingersTest, ShowsNoFingersAsAText) {
  receive(packet(0x108A).length(23));
  EXPECT_EQ(text("kFingerC2I"), "(none)");
}

TEST_F(EVDOFingersTest, NeedsTwentyThreeBytes) {
  receive(threeFingers().length(22));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x108a is 22 bytes long but must be at "
                                                 "least 23 bytes.")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(EVDOFingersTest, HasFourteenBytesForEachFingerExactly) {
  receive(threeFingers().length(64));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x108a has bad length of 64 bytes, but "
                                                 "has 3 substructs (size=23).")));
  receive(threeFingers().length(66));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x108a has bad length of 66 bytes, but "
                                                 "has 3 substructs (size=23).")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(EVDOFingersTest, HoldsTwoHundredAndFiftyFiveFingers) {
  receive(packet(0x108A).u8(22, 255).length(23 + 14 * 255));
  EXPECT_THAT(pilots("kFingerC2I"), SizeIs(256));
}

TEST_F(EVDOFingersTest, IsExplained) {
  EXPECT_THAT(explained(threeFingers()),
              ElementsAre("kFingerC2I count= 22", "kFingerC2I[0] PN Offset=168 23",
                          "kFingerC2I[0] Energy=+0.00 dB 29", "kFingerC2I[2] PN Offset=65534 51",
                          "kFingerC2I[2] Energy=+10.00 dB 57"));
  EXPECT_THAT(explained(threeFingers().length(66)), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
