// SPDX-License-Identifier: MIT
#include <algorithm>

#include "LogGenerator/C2K/OneXStatus.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

constexpr unsigned kPaging = 6;
constexpr unsigned kTraffic = 8;

SubPacketBytes stateOf(unsigned callState) { return SubPacketBytes(1, 6).u8(4, callState); }

SubPacketBytes radio() {
  return SubPacketBytes(2, 14)
      .u8(4, 0)
      .u8(5, 1)
      .u16(6, 283)
      .u16(8, 1175)
      .u8(10, 0xF0)
      .u8(11, 127)
      .u16(12, 230);
}

/// N = 8, f = 2, e = 2: D = 9 × 64 × 2 = 1152, and a pilot's y is 2 x / 1152 - 1 / 8.
SubPacketBytes activeSet(unsigned pilots, std::size_t size) {
  return SubPacketBytes(3, size).u16(4, 8).u8(6, 2).u8(7, 2).u8(8, pilots).u8(9, 0).u16(10, 168);
}

SubPacketBytes fingers() { return {4, 8}; }

class OneXStatusTest : public C2KFixture {
 protected:
  static PacketBytes status(const SubPacketBytes& callState, const SubPacketBytes& receiver,
                            const SubPacketBytes& set) {
    return packetOf(0x119C, {callState, receiver, set, fingers()});
  }
  static PacketBytes status(unsigned callState) {
    return status(stateOf(callState), radio(), activeSet(0, 12));
  }

  /// The text of a pilot's energy in a set of this one pilot.
  std::string energyOf(const SubPacketBytes& set) {
    receive(status(stateOf(kPaging), radio(), set));
    const auto shown = pilots("k1xActiveSetInfo");
    return shown.size() == 2 ? shown[1].second : "no list of one";
  }
};

TEST_F(OneXStatusTest, ShowsEveryValueInTraffic) {
  receive(status(kTraffic));
  EXPECT_EQ(text("k1xDeviceState"), "Traffic [8]");
  EXPECT_EQ(text("k1xRx0BandClass"), "800 MHz cellular band [0]");
  EXPECT_EQ(text("k1xRx0ChanNum"), "283");
  EXPECT_EQ(text("k1xRxAGC0"), "-68.59 dBm");  // -16 × 0.334 - 63.248 = -68.592
  EXPECT_EQ(text("k1xRx1BandClass"), "1.8 to 2.0GHz PCS band [1]");
  EXPECT_EQ(text("k1xRx1ChanNum"), "1175");
  EXPECT_EQ(text("k1xRxAGC1"), "-20.83 dBm");  // 127 × 0.334 - 63.248 = -20.83
  EXPECT_EQ(text("k1xTxAGC"), "+23.00 dBm");
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(OneXStatusTest, HidesSecondReceiverAndTransmitterOutsideTraffic) {
  for (const unsigned callState : {0U, 6U, 7U, 9U, 255U}) {
    receive(status(callState));
    EXPECT_EQ(text("k1xRx0BandClass"), "800 MHz cellular band [0]") << callState;
    EXPECT_EQ(text("k1xRx0ChanNum"), "283") << callState;
    EXPECT_EQ(text("k1xRxAGC0"), "-68.59 dBm") << callState;
    EXPECT_EQ(text("k1xRx1BandClass"), "N/A") << callState;
    EXPECT_EQ(text("k1xRx1ChanNum"), "N/A") << callState;
    EXPECT_EQ(text("k1xRxAGC1"), "N/A") << callState;
    EXPECT_EQ(text("k1xTxAGC"), "N/A") << callState;
  }
}

TEST_F(OneXStatusTest, NamesEveryState) {
  const char* const names[] = {"Inactive [0]",
                               "Deep sleep in start state [1]",
                               "Initial state for CDMA operation [2]",
                               "Acquisition [3]",
                               "Sync [4]",
                               "Slew [5]",
                               "Paging [6]",
                               "Slotted mode sleep state [7]",
                               "Traffic [8]",
                               "UnSlew [9]",
                               "Operation in PCG state [10]",
                               "Powerup state [11]",
                               "[Bad Value 12]"};
  for (unsigned value = 0; value < std::size(names); ++value) {
    receive(status(value));
    EXPECT_EQ(text("k1xDeviceState"), names[value]);
  }
  receive(status(255));
  EXPECT_EQ(text("k1xDeviceState"), "[Bad Value 255]");
}

TEST_F(OneXStatusTest, NamesEveryBandClassOfBothReceivers) {
  constexpr unsigned kCount = std::size(kBandClassTexts);
  for (unsigned value = 0; value < kCount; ++value) {
    const unsigned other = kCount - 1 - value;
    receive(status(stateOf(kTraffic), radio().u8(4, value).u8(5, other), activeSet(0, 12)));
    EXPECT_EQ(text("k1xRx0BandClass"), kBandClassTexts[value]);
    EXPECT_EQ(text("k1xRx1BandClass"), kBandClassTexts[other]);
  }
  receive(status(stateOf(kTraffic), radio().u8(4, 255).u8(5, 9), activeSet(0, 12)));
  EXPECT_EQ(text("k1xRx0BandClass"), "[Bad Value 255]");
  EXPECT_EQ(text("k1xRx1BandClass"), "900 MHzband [9]");
}

TEST_F(OneXStatusTest, ShowsTheExtremesOfEveryLevel) {
  receive(
      status(stateOf(kTraffic), radio().u8(10, 128).u8(11, 0).u16(12, 0x8000), activeSet(0, 12)));
  EXPECT_EQ(text("k1xRxAGC0"), "-106.00 dBm");
  EXPECT_EQ(text("k1xRxAGC1"), "-63.25 dBm");
  EXPECT_EQ(text("k1xTxAGC"), "-3276.80 dBm");
  receive(status(stateOf(kTraffic), radio().u8(10, 255).u8(11, 1).u16(12, 0), activeSet(0, 12)));
  EXPECT_EQ(text("k1xRxAGC0"), "-63.58 dBm");
  EXPECT_EQ(text("k1xRxAGC1"), "-62.91 dBm");
  EXPECT_EQ(text("k1xTxAGC"), "+0.00 dBm");
}

// --- Active set ----------------------------------------------------------------------------------

TEST_F(OneXStatusTest, ShowsTheActiveSetInEveryState) {
  const SubPacketBytes set = activeSet(3, 64).u16(12, 168).u16(24, 648).u16(36, 5832).u16(48, 576);
  for (const unsigned callState : {kPaging, kTraffic}) {
    receive(status(stateOf(callState), radio(), set));
    // Records of 12 bytes: each PN lies where the record before has its energy: 648 / 576 - 1 / 8 =
    // 1, 5832 / 576 - 1 / 8 = 10, 576 / 576 - 1 / 8 = 0.875.
    EXPECT_THAT(pilots("k1xActiveSetInfo"),
                ElementsAre(Pair("_sorted", "_sorted"), Pair("0;168", "(ref pilot) +0.00 dB"),
                            Pair("1;648", "+10.00 dB"), Pair("2;5832", "-0.58 dB")));
  }
}

TEST_F(OneXStatusTest, SpacesPilotsByTheirValues) {
  // One value each: records of 18 bytes, filled up to 20; the energy is 4 bytes further on.
  receive(status(stateOf(kPaging), radio(),
                 activeSet(2, 60).u8(9, 1).u16(12, 5).u16(28, 648).u16(32, 6).u16(48, 5832)));
  EXPECT_THAT(
      pilots("k1xActiveSetInfo"),
      ElementsAre(Pair("_sorted", "_sorted"), Pair("0;5", "+0.00 dB"), Pair("1;6", "+10.00 dB")));
}

TEST_F(OneXStatusTest, FillsNothingUpForAnEvenNumberOfValues) {
  // Two values: 24 bytes; the energy is 8 bytes further on.
  receive(status(stateOf(kPaging), radio(),
                 activeSet(2, 64).u8(9, 2).u16(12, 5).u16(32, 648).u16(36, 6).u16(56, 5832)));
  EXPECT_THAT(
      pilots("k1xActiveSetInfo"),
      ElementsAre(Pair("_sorted", "_sorted"), Pair("0;5", "+0.00 dB"), Pair("1;6", "+10.00 dB")));
}

TEST_F(OneXStatusTest, AnEmptyActiveSetIsAListAllTheSame) {
  receive(status(kPaging));
  EXPECT_THAT(pilots("k1xActiveSetInfo"), ElementsAre(Pair("_sorted", "_sorted")));
}

TEST_F(OneXStatusTest, MarksEveryPilotWithTheReferencePN) {
  receive(status(stateOf(kPaging), radio(),
                 activeSet(3, 60).u16(12, 168).u16(24, 168).u16(36, 7).u16(48, 168)));
  EXPECT_THAT(pilots("k1xActiveSetInfo"),
              ElementsAre(Pair("_sorted", "_sorted"), Pair("0;168", "(ref pilot) -7.78 dB"),
                          Pair("1;168", "(ref pilot) -50.00 dB"), Pair("2;7", "-7.78 dB")));
}

TEST_F(OneXStatusTest, ShowsNothingWeakerThanMinusFiftyDecibels) {
  // 2 × 72 / 1152 = 1 / 8 leaves nothing; one more leaves 1 / 576.
  EXPECT_EQ(energyOf(activeSet(1, 28).u16(24, 72)), "-50.00 dB");
  EXPECT_EQ(energyOf(activeSet(1, 28).u16(24, 0)), "-50.00 dB");
  EXPECT_EQ(energyOf(activeSet(1, 28).u16(24, 73)), "-27.60 dB");
}

TEST_F(OneXStatusTest, AMissingLengthIsNoNumber) {
  EXPECT_EQ(energyOf(activeSet(1, 28).u16(4, 0).u16(24, 648)), "-50.00 dB");
  EXPECT_EQ(energyOf(activeSet(1, 28).u16(4, 0).u16(24, 0)), "-50.00 dB");
}

TEST_F(OneXStatusTest, AMissingFactorIsInfinite) {
  EXPECT_EQ(energyOf(activeSet(1, 28).u8(6, 0).u16(24, 648)), "+inf dB");
  EXPECT_EQ(energyOf(activeSet(1, 28).u8(6, 0).u16(24, 0)), "-50.00 dB");
}

TEST_F(OneXStatusTest, ComputesBeyondThirtyTwoBits) {
  // 2^37 × 65535 / (9 × 65535² × 255) = 913.81
  EXPECT_EQ(energyOf(activeSet(1, 28).u16(4, 65535).u8(6, 255).u8(7, 20).u16(24, 65535)),
            "+29.61 dB");
}

TEST_F(OneXStatusTest, TakesEveryExponent) {
  // 2^-3 × 9216 / 1152 - 1 / 8 = 0.875
  EXPECT_EQ(energyOf(activeSet(1, 28).u8(7, 0).u16(24, 9216)), "-0.58 dB");
  // 10 log10(2^507 × 0.5625) = 1523.723
  EXPECT_EQ(energyOf(activeSet(1, 28).u8(7, 255).u16(24, 648)), "+1523.72 dB");
}

TEST_F(OneXStatusTest, PilotsPastTheEndReadAsZero) {
  receive(status(stateOf(kPaging), radio(), activeSet(255, 12)).length(17 + 6 + 14 + 12 + 8));
  const auto shown = pilots("k1xActiveSetInfo");
  ASSERT_THAT(shown, SizeIs(256));
  EXPECT_THAT(shown[255], Pair("254;0", "-50.00 dB"));
}

// --- Sub-packets ---------------------------------------------------------------------------------

TEST_F(OneXStatusTest, TakesSubPacketsInEveryOrder) {
  std::vector<SubPacketBytes> parts = {stateOf(kTraffic), radio(), activeSet(0, 12), fingers(),
                                       SubPacketBytes(9, 5)};
  std::vector<int> order = {0, 1, 2, 3, 4};
  do {
    std::vector<SubPacketBytes> arranged;
    arranged.reserve(order.size());
    for (const int part : order) arranged.push_back(parts[static_cast<std::size_t>(part)]);
    state.remove(kStateDisplay);
    receive(packetOf(0x119C, arranged));
    EXPECT_EQ(text("k1xRx1ChanNum"), "1175");
    EXPECT_EQ(text("k1xDeviceState"), "Traffic [8]");
  } while (std::ranges::next_permutation(order).found);
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(OneXStatusTest, NeedsAllFourSubPackets) {
  const SubPacketBytes parts[] = {stateOf(kTraffic), radio(), activeSet(0, 12), fingers()};
  const char* const found[] = {"ss=0,rf=1,ai=1,fi=1", "ss=1,rf=0,ai=1,fi=1", "ss=1,rf=1,ai=0,fi=1",
                               "ss=1,rf=1,ai=1,fi=0"};
  for (std::size_t missing = 0; missing < 4; ++missing) {
    std::vector<SubPacketBytes> rest;
    for (std::size_t i = 0; i < 4; ++i) {
      if (i != missing) rest.push_back(parts[i]);
    }
    receive(packetOf(0x119C, rest));
    EXPECT_THAT(takeLines(), ElementsAre(warningLine(std::string("Log code 0x119c: missing "
                                                                 "subpacket (") +
                                                     found[missing] + ").")));
  }
  receive(packetOf(0x119C, {}));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Log code 0x119c: missing subpacket "
                                                   "(ss=0,rf=0,ai=0,fi=0).")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(OneXStatusTest, ReportsABadSizeForEverySubPacketThatItLooksFor) {
  receive(status(kTraffic).u16(17 + 2, 0xFFFF));
  const std::vector<Line> lines = takeLines();
  ASSERT_THAT(lines, SizeIs(5));
  EXPECT_THAT(std::vector<Line>(lines.begin(), lines.begin() + 4),
              Each(errorLine("Log code error in subpkt#0: bad size (65535).")));
  EXPECT_EQ(lines[4], warningLine("Log code 0x119c: missing subpacket (ss=0,rf=0,ai=0,fi=0)."));
}

TEST_F(OneXStatusTest, ReportsABadSizeOnlyWhereTheSearchGetsToIt) {
  receive(status(kTraffic).u16(17 + 6 + 14 + 2, 1000));  // the third one's
  EXPECT_THAT(
      takeLines(),
      ElementsAre(errorLine("Log code error in subpkt#2: bad size (1000)."),
                  errorLine("Log code error in subpkt#2: bad size (1000)."),
                  warningLine("Log code 0x119c: missing subpacket (ss=1,rf=1,ai=0,fi=0).")));
}

TEST_F(OneXStatusTest, GetsNoFurtherThanASubPacketOfSizeZero) {
  const char* const found[] = {"ss=1,rf=0,ai=0,fi=0", "ss=1,rf=1,ai=0,fi=0", "ss=1,rf=1,ai=1,fi=0"};
  const std::size_t starts[] = {17, 17 + 6, 17 + 6 + 14};
  for (std::size_t i = 0; i < std::size(starts); ++i) {
    // Each time the count is the highest that a packet can have.
    receive(status(kTraffic).u16(starts[i] + 2, 0).u8(14, 255));
    EXPECT_THAT(takeLines(), ElementsAre(warningLine(std::string("Log code 0x119c: missing "
                                                                 "subpacket (") +
                                                     found[i] + ").")));
  }
  EXPECT_THAT(shownNames(), IsEmpty());
  // Behind the last one nothing is looked for.
  receive(status(kTraffic).u16(17 + 6 + 14 + 12 + 2, 0).u8(14, 255));
  EXPECT_EQ(text("k1xDeviceState"), "Traffic [8]");
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(OneXStatusTest, AcceptsALastSubPacketThatOverrunsByFewerThanSeventeenBytes) {
  const PacketBytes whole = status(kTraffic);
  const std::size_t lastSize = 17 + 6 + 14 + 12 + 2;
  PacketBytes accepted = whole;
  receive(accepted.u16(lastSize, 8 + 16));
  EXPECT_EQ(text("k1xDeviceState"), "Traffic [8]");
  PacketBytes rejected = status(kPaging);
  receive(rejected.u16(lastSize, 8 + 17));
  EXPECT_EQ(text("k1xDeviceState"), "Traffic [8]");
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code error in subpkt#3: bad size (25)."),
                                       warningLine("Log code 0x119c: missing subpacket "
                                                   "(ss=1,rf=1,ai=1,fi=0).")));
}

TEST_F(OneXStatusTest, AnyLastSubPacketMayOverrunBySixteenBytesAndByNoMore) {
  const SubPacketBytes parts[] = {stateOf(kTraffic), radio(), activeSet(0, 12), fingers()};
  for (std::size_t last = 0; last < std::size(parts); ++last) {
    std::vector<SubPacketBytes> arranged;
    for (std::size_t i = 1; i <= std::size(parts); ++i) {
      arranged.push_back(parts[(last + i) % std::size(parts)]);
    }
    const PacketBytes whole = packetOf(0x119C, arranged);
    const std::size_t size = parts[last].bytes().size();
    const std::size_t start = whole.bytes().size() - size;
    for (unsigned overrun = 0; overrun <= 20; ++overrun) {
      state.remove(kStateDisplay);
      PacketBytes packet = whole;
      receive(packet.u16(start + 2, static_cast<unsigned>(size) + overrun));
      EXPECT_EQ(shownNames().empty(), overrun >= 17) << last << " " << overrun;
    }
  }
}

TEST_F(OneXStatusTest, FieldsPastTheEndReadAsZero) {
  // Sub-packets of four bytes each: all their fields lie in the ones behind, or past the end.
  receive(packetOf(0x119C, {{3, 4}, {4, 4}, {2, 4}, {1, 4}}));
  EXPECT_EQ(text("k1xDeviceState"), "Inactive [0]");
  EXPECT_EQ(text("k1xRx0BandClass"), "1.8 to 2.0GHz PCS band [1]");  // the next identifier
  EXPECT_EQ(text("k1xRxAGC0"), "-63.25 dBm");
}

TEST_F(OneXStatusTest, NeedsSeventeenBytes) {
  receive(status(kTraffic).length(16));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x119c is 16 bytes long but must be at "
                                                 "least 17 bytes.")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

// --- The frame error rate of traffic that is over ------------------------------------------------

TEST_F(OneXStatusTest, ShowsTheErrorRateOnceMoreAfterTraffic) {
  receive(status(kTraffic));
  state.set("TrafficFER", Value::real(0.125));
  receive(status(kTraffic));
  EXPECT_EQ(text("k1xTrafficFER"), "");
  receive(status(kPaging));
  EXPECT_EQ(text("k1xTrafficFER"), "12.50% (old)");
  EXPECT_FALSE(state.contains("TrafficFER"));
  display().set("k1xTrafficFER", "untouched");
  receive(status(kPaging));
  EXPECT_EQ(text("k1xTrafficFER"), "untouched");
}

TEST_F(OneXStatusTest, ShowsTheOldErrorRateInSinglePrecision) {
  // 0.00275 as a float is 0.002749999985, and 100 times that, rounded to a float, 0.27500001. A
  // double would be 0.2749999985 and show 0.27.
  state.set("TrafficFER", Value::real(0.00275));
  receive(status(kPaging));
  EXPECT_EQ(text("k1xTrafficFER"), "0.28% (old)");
}

TEST_F(OneXStatusTest, KeepsAnErrorRateThatIsNoNumber) {
  receive(status(kTraffic));
  state.set("TrafficFER", "0.125");
  receive(status(kPaging));
  EXPECT_EQ(text("k1xTrafficFER"), "");
  EXPECT_TRUE(state.contains("TrafficFER"));
}

TEST_F(OneXStatusTest, TakesAnyNumberAsTheErrorRate) {
  receive(status(kTraffic));
  state.set("TrafficFER", Value::integer(1));
  receive(status(kPaging));
  EXPECT_EQ(text("k1xTrafficFER"), "100.00% (old)");
}

TEST_F(OneXStatusTest, KeepsTheErrorRateWhileSubPacketsAreMissing) {
  receive(status(kTraffic));
  state.set("TrafficFER", Value::real(0.125));
  receive(packetOf(0x119C, {stateOf(kPaging)}));
  EXPECT_TRUE(state.contains("TrafficFER"));
}

// --- Explaining ----------------------------------------------------------------------------------

TEST_F(OneXStatusTest, IsExplained) {
  // The state sub-packet begins at 17, the radio one at 23, the active set at 37.
  EXPECT_THAT(
      explained(status(stateOf(kTraffic), radio(), activeSet(1, 28).u16(12, 7).u16(24, 648))),
      ElementsAre("k1xDeviceState=Traffic [8] 21", "k1xRx0BandClass=800 MHz cellular band [0] 27",
                  "k1xRx0ChanNum=283 29", "k1xRxAGC0=-68.59 dBm 33",
                  "k1xRx1BandClass=1.8 to 2.0GHz PCS band [1] 28", "k1xRx1ChanNum=1175 31",
                  "k1xRxAGC1=-20.83 dBm 34", "k1xTxAGC=+23.00 dBm 35", "Accumulation Length= 41",
                  "Energy Factor= 43", "Energy Exponent= 44", "Pilots= 45", "Values per Pilot= 46",
                  "Reference PN Offset= 47", "k1xActiveSetInfo[0] PN Offset=7 49",
                  "k1xActiveSetInfo[0] Energy=+0.00 dB 61 49 41 43 44 47"));
}

TEST_F(OneXStatusTest, IsExplainedOutsideTraffic) {
  const std::vector<std::string> lines = explained(status(kPaging));
  ASSERT_THAT(lines, SizeIs(15));
  EXPECT_EQ(lines[4], "k1xRx1BandClass=N/A 28");
  EXPECT_EQ(lines[14], "k1xTrafficFER=(from the packets before) 21");
}

TEST_F(OneXStatusTest, NothingIsExplainedOfAPacketThatIsRejected) {
  EXPECT_THAT(explained(status(kTraffic).length(16)), IsEmpty());
  EXPECT_THAT(explained(packetOf(0x119C, {stateOf(kTraffic)})), IsEmpty());
  EXPECT_THAT(explained(status(kTraffic).u16(17 + 2, 0xFFFF)), IsEmpty());
  EXPECT_THAT(takeLines(), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
