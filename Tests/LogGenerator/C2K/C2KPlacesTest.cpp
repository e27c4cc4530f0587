// SPDX-License-Identifier: MIT
// Where the CDMA2000 parsers read: every place of every packet, those that are not shown included.
#include "Tests/LogGenerator/C2K/C2KFixture.h"
#include "Tests/Support/ExplainedPlaces.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;

class C2KPlacesTest : public ExplainedPlacesFixture {
 protected:
  C2KPlacesTest() : ExplainedPlacesFixture("Ondrel_CDMA") {}
};

/// A sub-packet with all bits set behind its size.
SubPacketBytes ones(unsigned id, std::size_t size) {
  SubPacketBytes bytes(id, size);
  for (std::size_t i = 4; i < size; ++i) bytes.u8(i, 0xFF);
  return bytes;
}

/// 1x status: the state, traffic, at 17, the radio at 25, the active set at 41, the fingers at 69.
PacketBytes status(const SubPacketBytes& activeSet, unsigned state = 8) {
  return packetOf(0x119C, {ones(1, 8).u8(4, state), ones(2, 16), activeSet, ones(4, 4)});
}

TEST_F(C2KPlacesTest, OneXStatus) {
  EXPECT_THAT(
      places(status(ones(3, 28))),
      ElementsAre("1x status: k1xDeviceState 21[0-7]=8", "1x status: k1xRx0BandClass 29[0-7]=255",
                  "1x status: k1xRx0ChanNum 31[0-15]=65535", "1x status: k1xRxAGC0 35[0-7]=-1",
                  "1x status: k1xRx1BandClass 30[0-7]=255",
                  "1x status: k1xRx1ChanNum 33[0-15]=65535", "1x status: k1xRxAGC1 36[0-7]=-1",
                  "1x status: k1xTxAGC 37[0-15]=-1",
                  "1x status: Accumulation Length 45[0-15]=65535",
                  "1x status: Energy Factor 47[0-7]=255", "1x status: Energy Exponent 48[0-7]=255",
                  "1x status: Pilots 49[0-7]=255", "1x status: Values per Pilot 50[0-7]=255",
                  "1x status: Reference PN Offset 51[0-15]=65535"));
}

TEST_F(C2KPlacesTest, OneXPilots) {
  // One pilot without further values.
  EXPECT_THAT(recordPlaces(status(ones(3, 28).u8(8, 1).u8(9, 0))),
              ElementsAre("1x status: k1xActiveSetInfo#0 PN Offset 53[0-15]=65535",
                          "1x status: k1xActiveSetInfo#0 Energy 65[0-15]=65535 53[0-15]=65535 "
                          "45[0-15]=65535 47[0-7]=255 48[0-7]=255 51[0-15]=65535"));
}

TEST_F(C2KPlacesTest, TheOldErrorRateOfEveryStateButTraffic) {
  EXPECT_EQ(places(status(ones(3, 28), 7)).back(), "1x status: k1xTrafficFER 21[0-7]=7");
  EXPECT_EQ(places(status(ones(3, 28), 9)).back(), "1x status: k1xTrafficFER 21[0-7]=9");
  EXPECT_EQ(places(status(ones(3, 28), 255)).back(), "1x status: k1xTrafficFER 21[0-7]=255");
}

TEST_F(C2KPlacesTest, TrafficFrame) {
  EXPECT_THAT(places(packetOf(0x119D, {ones(11, 28)})),
              ElementsAre("1x traffic frame: k1xTrafficFER 41[0-7]=255"));
}

TEST_F(C2KPlacesTest, OneXSystemParameters) {
  const std::string parameters = "1x system parameters: ";
  EXPECT_THAT(
      places(allOnes(0x134F, 200)),
      ElementsAre(parameters + "Version 13[0-7]=255", parameters + "k1xRoamingHome 42[0-31]=-1",
                  parameters + "kSystemId 46[0-31]=4294967295 50[0-15]=65535",
                  parameters + "kNetworkId 46[0-31]=4294967295 52[0-15]=65535",
                  parameters + "kPacketZoneId 131[0-7]=255", parameters + "kBaseId 184[0-15]=65535",
                  parameters + "kProtocolRevision 133[0-7]=255"));
}

TEST_F(C2KPlacesTest, EVDOStatus) {
  const std::string evdo = "EV-DO status: ";
  EXPECT_THAT(
      places(allOnes(0x1183, 50)),
      ElementsAre(evdo + "kChannel 13[0-10]=2047", evdo + "k1xEVDODeviceState 36[0-7]=255",
                  evdo + "kBandClass 14[3-7]=31", evdo + "kRxAGC0 15[0-7]=-1",
                  evdo + "kRxAGC1 16[0-7]=-1", evdo + "kTxAGC 17[0-7]=-1",
                  evdo + "kServingPNOffset 18[0-15]=65535", evdo + "kSessionState 37[0-7]=255",
                  evdo + "kUATI24 38[0-23]=16777215", evdo + "kColorCode 41[0-7]=255"));
}

TEST_F(C2KPlacesTest, EVDOActiveSet) {
  EXPECT_THAT(places(allOnes(0x12B6, 25 + 12 * 255)),
              ElementsAre("EV-DO active set: kActiveSetPilots count 15[0-7]=255"));
  EXPECT_THAT(recordPlaces(allOnes(0x12B6, 37).u8(15, 1)),
              ElementsAre("EV-DO active set: kActiveSetPilots#0 PN Offset 25[0-15]=65535",
                          "EV-DO active set: kActiveSetPilots#0 Energy 27[0-15]=65535"));
}

TEST_F(C2KPlacesTest, EVDOFingers) {
  // The PN offset 65535 is nobody's.
  EXPECT_THAT(places(allOnes(0x108A, 23 + 14 * 255)),
              ElementsAre("EV-DO finger C/I: kFingerC2I count 22[0-7]=255"));
  EXPECT_THAT(recordPlaces(allOnes(0x108A, 37).u8(22, 1).u16(23, 65534)),
              ElementsAre("EV-DO finger C/I: kFingerC2I#0 PN Offset 23[0-15]=65534",
                          "EV-DO finger C/I: kFingerC2I#0 Energy 29[0-15]=65535"));
}

TEST_F(C2KPlacesTest, ForwardThroughput) {
  // The number, then 56 counters in a row, those that count nothing included.
  std::string line = "EV-DO forward throughput: kFLDataRate 13[0-31]=4294967295";
  for (int i = 0; i < 56; ++i) line += " " + std::to_string(17 + 4 * i) + "[0-31]=4294967295";
  EXPECT_THAT(places(allOnes(0x1192, 241)), ElementsAre(line));
}

// --- What is read to decide ----------------------------------------------------------------------

class C2KConditionsTest : public C2KFixture {};

TEST_F(C2KConditionsTest, TheStateIsOneByte) {
  // Whatever follows it, 8 is traffic: the second receiver and the transmitter are shown.
  receive(status(ones(3, 28)));
  EXPECT_EQ(text("k1xDeviceState"), "Traffic [8]");
  EXPECT_EQ(text("k1xRx1BandClass"), "[Bad Value 255]");
  EXPECT_EQ(text("k1xRx1ChanNum"), "65535");
  EXPECT_EQ(text("k1xRxAGC1"), "-63.58 dBm");  // -0.334 - 63.248 = -63.582
  EXPECT_EQ(text("k1xTxAGC"), "-0.10 dBm");
}

TEST_F(C2KConditionsTest, TheReferencePilotIsKnownByBothBytesOfItsOffset) {
  receive(status(SubPacketBytes(3, 28).u8(8, 1).u16(10, 0x0107).u16(12, 0x0007)));
  ASSERT_EQ(pilots("k1xActiveSetInfo").size(), 2U);
  EXPECT_EQ(pilots("k1xActiveSetInfo")[1].first, "0;7");
  EXPECT_EQ(pilots("k1xActiveSetInfo")[1].second.find("ref"), std::string::npos);
}

TEST_F(C2KConditionsTest, TheVersionOfTheSystemParametersIsOneByte) {
  receive(allOnes(0x134F, 200).u8(13, 1));
  EXPECT_THAT(takeLines(),
              ElementsAre(errorLine("Log code 0x134f has version=1; only version 2 or higher "
                                    "expected; dropping.")));
}

TEST_F(C2KConditionsTest, SubPacketsAreCountedAndNamedByOneByte) {
  // Bytes 15 and 16 belong to nothing, nor does a sub-packet's byte 1. The second is not counted.
  receive(packetOf(0x119C, {ones(1, 8).u8(1, 0xFF), ones(2, 16)}).u8(14, 1).u16(15, 0xFFFF));
  EXPECT_THAT(
      takeLines(),
      ElementsAre(warningLine("Log code 0x119c: missing subpacket (ss=1,rf=0,ai=0,fi=0).")));
}

}  // namespace
}  // namespace kestro::testing
