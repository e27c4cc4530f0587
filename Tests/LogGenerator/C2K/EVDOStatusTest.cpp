// SPDX-License-Identifier: MIT
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class EVDOStatusTest : public C2KFixture {
 protected:
  static PacketBytes status() {
    return packet(0x1183)
        .u16(13, 283U | 1U << 11)
        .u8(15, 0xA6)
        .u8(16, 0xB0)
        .u8(17, 12)
        .u16(18, 168)
        .u8(36, 5)
        .u8(37, 4)
        .u16(38, 0xBEEF)
        .u8(40, 0x0A)
        .u8(41, 77)
        .length(50);
  }
};

TEST_F(EVDOStatusTest, ShowsEveryValue) {
  receive(status());
  EXPECT_EQ(text("kChannel"), "283");
  EXPECT_EQ(text("k1xEVDODeviceState"), "Connected [5]");
  EXPECT_EQ(text("kBandClass"), "1.8 to 2.0GHz PCS band [1]");
  EXPECT_EQ(text("kRxAGC0"), "-90 dBm");
  EXPECT_EQ(text("kRxAGC1"), "-80 dBm");
  EXPECT_EQ(text("kTxAGC"), "+12 dBm");
  EXPECT_EQ(text("kServingPNOffset"), "168 × 64chips");
  EXPECT_EQ(text("kSessionState"), "Open [4]");
  EXPECT_EQ(text("kUATI24"), "0x0abeef");
  EXPECT_EQ(text("kColorCode"), "77");
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(EVDOStatusTest, ReadsTheWidestValues) {
  receive(packet(0x1183).length(50, 0xFF));
  EXPECT_EQ(text("kChannel"), "2047");
  EXPECT_EQ(text("k1xEVDODeviceState"), "[Reserved 255]");
  EXPECT_EQ(text("kBandClass"), "[Bad Value 31]");
  EXPECT_EQ(text("kRxAGC0"), "-1 dBm");
  EXPECT_EQ(text("kRxAGC1"), "-1 dBm");
  EXPECT_EQ(text("kTxAGC"), "-1 dBm");
  EXPECT_EQ(text("kServingPNOffset"), "Invalid Value");
  EXPECT_EQ(text("kSessionState"), "[Reserved 255]");
  EXPECT_EQ(text("kUATI24"), "0xffffff");
  EXPECT_EQ(text("kColorCode"), "255");
}

TEST_F(EVDOStatusTest, ReadsTheNarrowestValues) {
  receive(packet(0x1183).length(50));
  EXPECT_EQ(text("kChannel"), "0");
  EXPECT_EQ(text("k1xEVDODeviceState"), "Inactive [0]");
  EXPECT_EQ(text("kBandClass"), "800 MHz cellular band [0]");
  EXPECT_EQ(text("kRxAGC0"), "+0 dBm");
  EXPECT_EQ(text("kRxAGC1"), "N/A");
  EXPECT_EQ(text("kTxAGC"), "N/A");
  EXPECT_EQ(text("kServingPNOffset"), "0 × 64chips");
  EXPECT_EQ(text("kSessionState"), "Closed [0]");
  EXPECT_EQ(text("kUATI24"), "0x000000");
}

TEST_F(EVDOStatusTest, NamesEveryDeviceState) {
  const char* const names[] = {"Inactive [0]", "Acquisition [1]", "Sync [2]",     "Idle [3]",
                               "Access [4]",   "Connected [5]",   "[Reserved 6]", "[Reserved 7]"};
  for (unsigned value = 0; value < std::size(names); ++value) {
    receive(status().u8(36, value));
    EXPECT_EQ(text("k1xEVDODeviceState"), names[value]);
  }
}

TEST_F(EVDOStatusTest, NamesEverySessionState) {
  const char* const names[] = {"Closed [0]",        "AMP setup [1]", "AT-initiated neg [2]",
                               "Initiated neg [3]", "Open [4]",      "[Reserved 5]"};
  for (unsigned value = 0; value < std::size(names); ++value) {
    receive(status().u8(37, value));
    EXPECT_EQ(text("kSessionState"), names[value]);
  }
}

TEST_F(EVDOStatusTest, NamesEveryBandClass) {
  for (unsigned value = 0; value < std::size(kBandClassTexts); ++value) {
    receive(status().u16(13, value << 11));
    EXPECT_EQ(text("kBandClass"), kBandClassTexts[value]);
    EXPECT_EQ(text("kChannel"), "0");
  }
}

TEST_F(EVDOStatusTest, HidesSecondReceiverAndTransmitterBeforeAccess) {
  for (unsigned device = 0; device < 4; ++device) {
    receive(status().u8(36, device));
    EXPECT_EQ(text("kRxAGC0"), "-90 dBm") << device;
    EXPECT_EQ(text("kRxAGC1"), "N/A") << device;
    EXPECT_EQ(text("kTxAGC"), "N/A") << device;
  }
  for (const unsigned device : {4U, 5U, 6U, 255U}) {
    receive(status().u8(36, device));
    EXPECT_EQ(text("kRxAGC1"), "-80 dBm") << device;
    EXPECT_EQ(text("kTxAGC"), "+12 dBm") << device;
  }
}

TEST_F(EVDOStatusTest, ShowsLevelsWithTheirSign) {
  receive(status().u8(15, 127).u8(16, 128));
  EXPECT_EQ(text("kRxAGC0"), "+127 dBm");
  EXPECT_EQ(text("kRxAGC1"), "-128 dBm");
}

TEST_F(EVDOStatusTest, OnlyOnePNOffsetIsInvalid) {
  receive(status().u16(18, 0xFFFE));
  EXPECT_EQ(text("kServingPNOffset"), "65534 × 64chips");
  receive(status().u16(18, 0xFFFF));
  EXPECT_EQ(text("kServingPNOffset"), "Invalid Value");
}

TEST_F(EVDOStatusTest, HasFiftyBytesExactly) {
  receive(status().length(49));
  EXPECT_THAT(takeLines(),
              ElementsAre(errorLine("Log code 0x1183 is 49 bytes long but should be 50 bytes.")));
  receive(status().length(51));
  EXPECT_THAT(takeLines(),
              ElementsAre(errorLine("Log code 0x1183 is 51 bytes long but should be 50 bytes.")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(EVDOStatusTest, IsExplained) {
  EXPECT_THAT(
      explained(status()),
      ElementsAre("kChannel=283 13", "k1xEVDODeviceState=Connected [5] 36",
                  "kBandClass=1.8 to 2.0GHz PCS band [1] 14", "kRxAGC0=-90 dBm 15",
                  "kRxAGC1=-80 dBm 16", "kTxAGC=+12 dBm 17", "kServingPNOffset=168 × 64chips 18",
                  "kSessionState=Open [4] 37", "kUATI24=0x0abeef 38", "kColorCode=77 41"));
  EXPECT_THAT(explained(status().length(49)), IsEmpty());
  EXPECT_THAT(explained(status().length(51)), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
