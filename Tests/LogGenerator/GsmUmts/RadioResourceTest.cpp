// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/RadioResource.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

class GSMRRInfoTest : public DecoderFixture<GSMRRInfo> {
 protected:
  static PacketBytes state(unsigned value) { return packet(0x512C).u8(13, value).length(17); }
  static PacketBytes measurements() {
    return packet(0x5137).u8(15, 48).u32(16, 0x00020001).u32(20, 0x00040003).length(29);
  }
};

TEST_F(GSMRRInfoTest, ShowsTheState) {
  decode(state(5).u8(14, 1).u8(15, 255).u8(16, 3));
  EXPECT_THAT(entries(), ElementsAre(Pair("RR State", "RR_IDLE"), Pair("RR Sub State", "1"),
                                     Pair("RR Status", "255"), Pair("RR Mode", "3")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMRRInfo")));
}

TEST_F(GSMRRInfoTest, NamesEveryState) {
  constexpr const char* kNames[] = {"RR_INACTIVE",
                                    "RR_GOING_ACTIVE",
                                    "RR_GOING_INACTIVE",
                                    "RR_CELL_SELECTION",
                                    "RR_PLMN_LIST_CONSTRUCTION",
                                    "RR_IDLE",
                                    "RR_CELL_RESELECTION",
                                    "RR_CONNECTION_PENDING",
                                    "RR_CHOOSE_CELL",
                                    "RR_DATA_TRANSFER",
                                    "RR_NO_CHANNELS",
                                    "RR_CONNECTION_RELEASE",
                                    "RR_EARLY_CAMPED_WAIT_FOR_SI",
                                    "RR_W2G_INTERRAT_HANDOVER_ PROGRESS",
                                    "RR_W2G_INTERRAT_RESELECTION_PROGRESS",
                                    "RR_WAIT_FOR_EARLY_PSCAN",
                                    "GRR51",
                                    "GRR52",
                                    "RR_G2W_INTERRAT_RESELECTION_PROGRESS",
                                    "RR_G2W_INTERRAT_HANDOVER_ PROGRESS",
                                    "RR_CELL_REEST",
                                    "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS",
                                    "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(state(value));
    EXPECT_EQ(text("RR State"), name) << value;
    ++value;
  }
  decode(state(255));
  EXPECT_EQ(text("RR State"), "Unknown");
}

TEST_F(GSMRRInfoTest, NeedsSeventeenBytesOfState) {
  decode(state(5).length(16));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMRRInfo")));
}

TEST_F(GSMRRInfoTest, ShowsDiscontinuousReception) {
  decode(packet(0x51F6).length(24));
  EXPECT_THAT(entries(), ElementsAre(Pair("DRX Used", "0 sec")));
  decode(packet(0x51F6).u8(16, 255).length(24));
  EXPECT_THAT(entries(), ElementsAre(Pair("DRX Used", "255 sec")));
}

TEST_F(GSMRRInfoTest, NeedsTwentyFourBytesOfDiscontinuousReception) {
  decode(packet(0x51F6).length(23));
  EXPECT_THAT(entries(), IsEmpty());
}

TEST_F(GSMRRInfoTest, ShowsDiscontinuousTransmission) {
  for (const auto& [value, name] : {std::pair(0U, "OFF"), {1U, "ON"}, {2U, "ON"}, {255U, "ON"}}) {
    decode(packet(0x5072).u8(19, value));
    EXPECT_THAT(entries(), ElementsAre(Pair("DTX Used", name))) << value;
  }
}

TEST_F(GSMRRInfoTest, NeedsTwentyBytesOfDiscontinuousTransmission) {
  decode(packet(0x5072).length(19));
  EXPECT_THAT(entries(), IsEmpty());
}

TEST_F(GSMRRInfoTest, ShowsTheMeasurementsWhole) {
  decode(measurements());
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Serving Rx Level", "48"), Pair("Rx Quality Full", "131073"),
                          Pair("Rx Quality Sub", "262147")));
  decode(measurements().u8(15, 255).u32(16, 0xFFFFFFFF).u32(20, 0x80000000));
  EXPECT_THAT(entries(), ElementsAre(Pair("Serving Rx Level", "255"), Pair("Rx Quality Full", "-1"),
                                     Pair("Rx Quality Sub", "-2147483648")));
}

TEST_F(GSMRRInfoTest, NeedsTwentyNineBytesOfMeasurements) {
  decode(measurements().length(28));
  EXPECT_THAT(entries(), IsEmpty());
}

TEST_F(GSMRRInfoTest, KeepsWhatAPacketDoesNotCarry) {
  decode(measurements());
  decode(packet(0x5072).length(20));
  decode(packet(0x51F6).length(24));
  decode(state(0));
  EXPECT_THAT(keysOf(section()),
              ElementsAre("Serving Rx Level", "Rx Quality Full", "Rx Quality Sub", "DTX Used",
                          "DRX Used", "RR State", "RR Sub State", "RR Status", "RR Mode"));
  decode(measurements().u8(15, 49));
  EXPECT_THAT(entries(), SizeIs(9));
  EXPECT_EQ(text("Serving Rx Level"), "49");
}

}  // namespace
}  // namespace kestro::testing
