// SPDX-License-Identifier: MIT
// Drives through CDMA2000 cells, packet by packet.
#include "Platform/TelephonyService.h"
#include "Tests/Measurements/DriveFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// EV-DO's status: channel 201 of band class 0, -60 dBm; 5: connected, 3: idle.
PacketBytes evdoCell(unsigned pn, unsigned state) {
  return packet(0x1183).u16(13, 201).u8(15, 0xC4).u16(18, pn).u8(36, state).length(50);
}

/// The active set: energies in parts of 512, 512 being 0 dB.
PacketBytes evdoPilots(unsigned pn, unsigned energy) {
  return packet(0x12B6).u8(15, 1).u16(25, pn).u16(27, energy).length(37);
}

/// 1x: system 4139, network 1, packet zone and base station.
PacketBytes oneXCell(unsigned baseStation, unsigned zone) {
  return packet(0x134F)
      .u8(13, 2)
      .u32(46, 2)
      .u16(50, 4139)
      .u16(52, 1)
      .u8(131, zone)
      .u16(184, baseStation)
      .length(186);
}

class C2KDriveTest : public DriveFixture {
 public:
  C2KDriveTest() : DriveFixture(kTqLogChannelTechnology_Ondrel_CDMA) {}
};

TEST_F(C2KDriveTest, EVDOHandsOverWhenConnected) {
  at(0).take(evdoCell(340, 5));
  at(1'000).take(evdoCell(172, 3));
  at(2'500).take(evdoCell(340, 3));
  EXPECT_THAT(lines, ElementsAre("1 reselection EV-DO: 201/340 -> 201/172",
                                 "2.5 reselection EV-DO: 201/172 -> 201/340"));
  at(3'000).take(evdoCell(340, 5));
  at(3'500).take(evdoCell(172, 5));
  EXPECT_EQ(lines.back(), "3.5 handover EV-DO: 201/340 -> 201/172");
  EXPECT_EQ(events.back().connectedBy, "0x1183");
}

TEST_F(C2KDriveTest, PilotsAreOnTheServingChannel) {
  at(0).take(evdoCell(340, 3)).take(evdoPilots(340, 512)).take(evdoPilots(172, 256));
  EXPECT_THAT(cellNames(), ElementsAre("201/340", "201/172"));
  EXPECT_EQ(cell("201/340")->level.last(), -60);
  EXPECT_EQ(cell("201/340")->quality.last(), 0);
  EXPECT_NEAR(cell("201/172")->quality.last(), -3.01, 0.01);
  // Band class 0 has 870 + 0.03 x 201 MHz.
  EXPECT_EQ(cell("201/340")->band(), (ChannelBand{.band = "0", .downlinkKHz = 876'030}));
  EXPECT_EQ(cell("201/172")->band(), cell("201/340")->band());
}

TEST_F(C2KDriveTest, TheRadiosServeBesideEachOther) {
  at(0).take(evdoCell(340, 3)).take(oneXCell(3002, 1));
  at(500).take(evdoCell(340, 3)).take(oneXCell(3002, 1));
  EXPECT_THAT(lines, IsEmpty());
  at(1'000).take(oneXCell(3152, 4));
  EXPECT_THAT(lines,
              ElementsAre("1 reselection 1x: 3002 -> 3152", "1 area 1x: packet zone 1 -> 4"));
  EXPECT_EQ(cell("3152")->network, "4139-1");
  EXPECT_EQ(cell("201/340")->served, std::chrono::seconds(1));
  EXPECT_EQ(cell("3002")->served, std::chrono::seconds(1));
}

}  // namespace
}  // namespace kestro::testing
