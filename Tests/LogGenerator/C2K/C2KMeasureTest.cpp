// SPDX-License-Identifier: MIT
// What the CDMA2000 packets say as numbers.
#include "Platform/TelephonyService.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"
#include "Tests/Support/MeasureFixture.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

class C2KMeasureTest : public MeasureFixture {
 protected:
  C2KMeasureTest() : MeasureFixture(kTqLogChannelTechnology_Ondrel_CDMA) {}

  static PacketBytes frame(unsigned errors) {
    return packetOf(0x119D, {SubPacketBytes(11, 25).u8(24, errors)});
  }
  /// A packet of the call state, with no pilots.
  static PacketBytes status(unsigned state) {
    return packetOf(0x119C, {SubPacketBytes(1, 5).u8(4, state), SubPacketBytes(2, 14),
                             SubPacketBytes(3, 12), SubPacketBytes(4, 4)});
  }
  /// A packet in traffic with one pilot: PN 168, a length of 64, a factor of 1, an exponent of 4.
  static PacketBytes statusOfPilot(unsigned reference) {
    return packetOf(0x119C, {SubPacketBytes(1, 5).u8(4, 8), SubPacketBytes(2, 14),
                             SubPacketBytes(3, 26)
                                 .u16(4, 64)
                                 .u8(6, 1)
                                 .u8(7, 4)
                                 .u8(8, 1)
                                 .u16(10, reference)
                                 .u16(12, 168)
                                 .u16(24, 1152),
                             SubPacketBytes(4, 4)});
  }
  static PacketBytes forward(std::uint32_t sequence, std::uint32_t count) {
    return packet(0x1192).u32(13, sequence).u32(17 + 4 * 3, count).length(241);
  }
};

TEST_F(C2KMeasureTest, TheErrorRateGoesOnFromFrameToFrameAndBeginsAnewAfterTraffic) {
  EXPECT_THAT(lines(frame(1)), ElementsAre("1x/Traffic FER 1.5625 %|1.56%"));
  EXPECT_THAT(lines(frame(0)), ElementsAre("1x/Traffic FER 1.5380859375 %|1.54%"));  // 63 / 64²
  EXPECT_THAT(lines(status(8)), Not(Contains(HasSubstr("FER"))));
  EXPECT_THAT(lines(frame(0)), ElementsAre(HasSubstr("|1.51%")));
  // The rate that is shown once more when the traffic ends is no measurement.
  EXPECT_THAT(lines(status(6)), Not(Contains(HasSubstr("FER"))));
  EXPECT_THAT(lines(frame(0)), ElementsAre("1x/Traffic FER 0 %|0.00%"));
}

TEST_F(C2KMeasureTest, TheDataRateIsThatBetweenTwoPackets) {
  EXPECT_THAT(lines(forward(7, 3)), IsEmpty());
  EXPECT_THAT(lines(forward(11, 13)),
              ElementsAre("EV-DO/Data Rate/Forward Link 2.5 kbps|2.50 kbps"));
  EXPECT_THAT(lines(forward(11, 99)), IsEmpty());  // no newer than the one before
  EXPECT_THAT(lines(packet(0x1192).length(240)), IsEmpty());
}

TEST_F(C2KMeasureTest, PilotsAreTheirOffsets) {
  // 10 log(256 / 512), and 512 / 512.
  const auto pilots = packet(0x12B6).u8(15, 2).u16(25, 168).u16(27, 256).u16(37, 9).u16(39, 512);
  EXPECT_THAT(lines(PacketBytes(pilots).length(49)),
              ElementsAre("EV-DO/Active Set/Energy [168] -3.010299956639812 dB|-3.01 dB",
                          "EV-DO/Active Set/Energy [9] 0 dB|+0.00 dB"));
  EXPECT_THAT(lines(PacketBytes(pilots).length(48)), IsEmpty());  // refused
}

TEST_F(C2KMeasureTest, AnEnergyOfZeroIsNoNumberOfDecibels) {
  EXPECT_THAT(lines(packet(0x12B6).u8(15, 1).u16(25, 168).length(37)), IsEmpty());  // "-inf dB"
}

TEST_F(C2KMeasureTest, TheReferencePilotIsShownAsSuch) {
  // 2^(2 × 4 - 3) × 1152 / (9 × 64 × 64 × 1) - 1 / 64 = 0.984375, which is -0.0684 dB.
  EXPECT_THAT(lines(statusOfPilot(9)), Contains(HasSubstr("dB|-0.07 dB")));
  EXPECT_THAT(lines(statusOfPilot(168)), Contains(HasSubstr("dB|(ref pilot) -0.07 dB")));
  EXPECT_THAT(lines(statusOfPilot(168)), Contains(HasSubstr("1x/Active Set/Energy [168] -0.06")));
}

TEST_F(C2KMeasureTest, WhatThePhoneDoesNotKnowIsNone) {
  EXPECT_THAT(lines(status(8)), Contains(HasSubstr("1x/Radio/Tx AGC 0 dBm|+0.00 dBm")));
  EXPECT_THAT(lines(status(6)), Not(Contains(HasSubstr("Tx AGC"))));
  EXPECT_THAT(lines(status(6)), Contains("1x/State 6|Paging [6]"));
}

TEST_F(C2KMeasureTest, AnIdentityOfAnotherSystemIsNone) {
  const auto system = packet(0x134F).u8(13, 2).u32(46, 2).u16(50, 4113).length(186);
  EXPECT_THAT(lines(system), Contains("1x/System/System ID 4113|4113"));
  EXPECT_THAT(lines(PacketBytes(system).u32(46, 3)), Not(Contains(HasSubstr("System ID"))));
}

TEST_F(C2KMeasureTest, UnitsAndHexadecimalNumbersAreThoseOfTheFormats) {
  const auto status = packet(0x1183).u16(18, 168).u8(38, 0x3F).u8(39, 0xAB).length(50);
  EXPECT_THAT(lines(status), Contains("EV-DO/Radio/Serving PN Offset 168 64chips|168 × 64chips"));
  EXPECT_THAT(lines(status), Contains("EV-DO/Session/UATI 24 43839|0x00ab3f"));
  EXPECT_THAT(lines(PacketBytes(status).u16(18, 0xFFFF)), Not(Contains(HasSubstr("Serving PN"))));
}

}  // namespace
}  // namespace kestro::testing
