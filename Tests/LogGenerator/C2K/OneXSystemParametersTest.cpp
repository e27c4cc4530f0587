// SPDX-License-Identifier: MIT
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class OneXSystemParametersTest : public C2KFixture {
 protected:
  static PacketBytes parameters() {
    return packet(0x134F)
        .u8(13, 2)
        .u32(42, 1)
        .u32(46, 2)
        .u16(50, 4139)
        .u16(52, 5)
        .u8(131, 9)
        .u8(133, 6)
        .u16(184, 1234);
  }
};

TEST_F(OneXSystemParametersTest, ShowsEveryValue) {
  receive(parameters());
  EXPECT_EQ(text("k1xRoamingHome"), "ON [1]");
  EXPECT_EQ(text("kSystemId"), "4139");
  EXPECT_EQ(text("kNetworkId"), "5");
  EXPECT_EQ(text("kPacketZoneId"), "9");
  EXPECT_EQ(text("kBaseId"), "1234");
  EXPECT_EQ(text("kProtocolRevision"), "6");
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(OneXSystemParametersTest, ReadsTheWidestValues) {
  receive(packet(0x134F).length(186, 0xFF).u32(46, 2));
  EXPECT_EQ(text("k1xRoamingHome"), "ERI - -1");
  EXPECT_EQ(text("kSystemId"), "65535");
  EXPECT_EQ(text("kNetworkId"), "65535");
  EXPECT_EQ(text("kPacketZoneId"), "255");
  EXPECT_EQ(text("kBaseId"), "65535");
  EXPECT_EQ(text("kProtocolRevision"), "255");
}

TEST_F(OneXSystemParametersTest, NamesEveryRoamingIndicator) {
  const char* const names[] = {"OFF [0]",
                               "ON [1]",
                               "Flashing [2]",
                               "Out of Neighborhood [3]",
                               "Out of Building [4]",
                               "Preferred system [5]",
                               "Available system [6]",
                               "Alliance partner [7]",
                               "Premium partner [8]",
                               "Full service functionality [9]",
                               "Partial service functionality [10]",
                               "Banner ON [11]",
                               "Banner OFF [12]",
                               "ERI - 13"};
  for (unsigned value = 0; value < std::size(names); ++value) {
    receive(parameters().u32(42, value));
    EXPECT_EQ(text("k1xRoamingHome"), names[value]);
  }
  receive(parameters().u32(42, 0x80000000));
  EXPECT_EQ(text("k1xRoamingHome"), "ERI - -2147483648");
}

TEST_F(OneXSystemParametersTest, KnowsIdentitiesOfOneSystemTypeOnly) {
  for (const unsigned type : {0U, 1U, 3U, 258U}) {
    receive(parameters().u32(46, type));
    const std::string unknown = "(unknown system type " + std::to_string(type) + ")";
    EXPECT_EQ(text("kSystemId"), unknown);
    EXPECT_EQ(text("kNetworkId"), unknown);
    EXPECT_EQ(text("kBaseId"), "1234");
  }
  receive(parameters().u32(46, 0xFFFFFFFF));
  EXPECT_EQ(text("kSystemId"), "(unknown system type -1)");
}

TEST_F(OneXSystemParametersTest, ABaseStationPastTheEndReadsAsZero) {
  receive(parameters().length(171));
  EXPECT_EQ(text("kBaseId"), "0");
  receive(parameters().length(185));
  EXPECT_EQ(text("kBaseId"), "210");  // 1234 & 0xFF
}

TEST_F(OneXSystemParametersTest, NeedsOneHundredAndSeventyOneBytes) {
  receive(parameters().length(170));
  EXPECT_THAT(takeLines(), ElementsAre(errorLine("Log code 0x134f is 170 bytes long but must be at "
                                                 "least 171 bytes.")));
  EXPECT_THAT(shownNames(), IsEmpty());
}

TEST_F(OneXSystemParametersTest, RejectsEarlyVersions) {
  for (const unsigned version : {0U, 1U}) {
    receive(parameters().u8(13, version));
    EXPECT_THAT(takeLines(),
                ElementsAre(errorLine("Log code 0x134f has version=" + std::to_string(version) +
                                      "; only version 2 or higher expected; dropping.")));
  }
  EXPECT_THAT(shownNames(), IsEmpty());
  receive(parameters().u8(13, 255));
  EXPECT_EQ(text("kSystemId"), "4139");
}

TEST_F(OneXSystemParametersTest, IsExplained) {
  EXPECT_THAT(explained(parameters()),
              ElementsAre("Version= 13", "k1xRoamingHome=ON [1] 42", "kSystemId=4139 46 50",
                          "kNetworkId=5 46 52", "kPacketZoneId=9 131", "kBaseId=1234 184",
                          "kProtocolRevision=6 133"));
  EXPECT_THAT(explained(parameters().length(170)), IsEmpty());
  EXPECT_THAT(explained(parameters().u8(13, 1)), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
