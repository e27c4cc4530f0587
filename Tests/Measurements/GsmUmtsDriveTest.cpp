// SPDX-License-Identifier: MIT
// Drives through UMTS and GSM cells, packet by packet.
#include "Platform/TelephonyService.h"
#include "Tests/Measurements/DriveFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

// Ends of the table of linear energies: nearly 0 dB, and weak.
constexpr std::uint32_t kStrong = 524'288;
constexpr std::uint32_t kWeak = 706;

struct ActiveCell {
  unsigned scramblingCode;
  std::uint32_t energy;
};

/// The active set: records of 15 bytes from byte 16, then their energies, 44 bytes each.
PacketBytes activeSet(const std::vector<ActiveCell>& cells) {
  PacketBytes set = packet(0x417A).u8(15, static_cast<unsigned>(cells.size()));
  const std::size_t energies = 16 + 15 * cells.size();
  for (std::size_t i = 0; i < cells.size(); ++i) {
    set.u16(16 + 15 * i + 7, cells[i].scramblingCode);
    set.u32(energies + 44 * i + 32, cells[i].energy);
  }
  return set.length(energies + 44 * cells.size());
}

PacketBytes gsmCell(unsigned identity, unsigned arfcn, unsigned bsic) {
  return packet(0x5134).u16(13, arfcn).u16(15, bsic).u16(17, identity).length(26);
}

/// Levels above -110 dBm of the serving cell and of a neighbour.
PacketBytes gsmLevels(unsigned serving, unsigned arfcn, unsigned neighbour) {
  return packet(0x5137).u8(15, serving).u8(28, 1).u16(29, arfcn).u8(31, neighbour).length(43);
}

/// Network 999-990 and a location area.
PacketBytes servingNetworkOf(unsigned area) {
  return packet(0x7135)
      .u8(15, 0x99)
      .u8(16, 0x90)
      .u8(17, 0x99)
      .u8(18, area >> 8U)
      .u8(19, area & 0xFFU)
      .length(32);
}

PacketBytes rrState(unsigned state) { return packet(0x512C).u8(13, state).length(17); }
PacketBytes dedicatedChannel() { return packet(0x5076).u16(13, 70).length(17); }

class GsmUmtsDriveTest : public DriveFixture {
 public:
  GsmUmtsDriveTest() : DriveFixture(kTqLogChannelTechnology_Ondrel_GSM) {}
};

TEST_F(GsmUmtsDriveTest, TheServingUMTSCellIsOneOfTheActiveSet) {
  at(0).take(activeSet({{381, kStrong}}));
  at(500).take(activeSet({{21, kStrong}, {381, kWeak}}));
  EXPECT_THAT(lines, IsEmpty());  // it is still a member
  at(1'000).take(activeSet({{13, kWeak}, {21, kStrong}}));
  EXPECT_THAT(lines, ElementsAre("1 reselection UMTS: -/381 -> -/21"));
  EXPECT_EQ(events[0].toldBy, "0x417A");
  EXPECT_NE(events[0].toLevel, std::nullopt);
}

TEST_F(GsmUmtsDriveTest, AnEmptyActiveSetNamesNoCell) {
  at(0).take(activeSet({{381, kStrong}}));
  at(500).take(activeSet({}));
  at(1'000).take(activeSet({{381, kStrong}}));
  EXPECT_THAT(lines, IsEmpty());
}

TEST_F(GsmUmtsDriveTest, AConnectedRRStateMakesAHandover) {
  at(0).take(activeSet({{381, kStrong}})).take(rrState(9));
  at(1'000).take(activeSet({{21, kStrong}})).take(rrState(5));
  at(2'000).take(activeSet({{381, kStrong}}));
  EXPECT_THAT(lines,
              ElementsAre("1 handover UMTS: -/381 -> -/21", "2 reselection UMTS: -/21 -> -/381"));
  EXPECT_EQ(events[0].connectedBy, "0x512C");
}

TEST_F(GsmUmtsDriveTest, AnotherTechnologyIsToldBesideTheCell) {
  at(0).take(activeSet({{381, kStrong}}));
  at(1'000).take(activeSet({})).take(gsmCell(1001, 42, 9));
  at(2'000).take(activeSet({{21, kStrong}}));
  EXPECT_THAT(lines,
              ElementsAre("1 technology GSM: UMTS -> GSM", "1 reselection GSM: -/381 -> 1001",
                          "2 technology UMTS: GSM -> UMTS", "2 reselection UMTS: 1001 -> -/21"));
}

TEST_F(GsmUmtsDriveTest, ADedicatedChannelMakesAHandoverOfGSM) {
  at(0).take(gsmCell(1001, 42, 9));
  at(500).take(dedicatedChannel());
  at(1'500).take(gsmCell(1002, 45, 15));
  at(2'600).take(gsmCell(1001, 42, 9));
  EXPECT_THAT(lines,
              ElementsAre("1.5 handover GSM: 1001 -> 1002", "2.6 reselection GSM: 1002 -> 1001"));
  EXPECT_EQ(events[0].connectedBy, "0x5076");
}

TEST_F(GsmUmtsDriveTest, GSMLevelsAreInDbm) {
  at(0).take(gsmCell(1001, 42, 9)).take(gsmCell(1002, 45, 15));
  // The neighbour's colours come in a list of their own: channel 42 has 9.
  take(packet(0x51FF).u8(14, 1).u16(15, 42).u8(17, 9).length(19)).take(gsmLevels(30, 42, 12));
  EXPECT_EQ(cell("1002")->level.last(), -80);
  EXPECT_EQ(cell("1001")->level.last(), -98);
  EXPECT_TRUE(cell("1001")->isAssumed);
  EXPECT_EQ(cell("1001")->band(), (ChannelBand{.band = "P-GSM 900", .downlinkKHz = 943'400}));
}

TEST_F(GsmUmtsDriveTest, ANeighbourWithoutColoursIsNoCell) {
  at(0).take(gsmCell(1001, 42, 9)).take(gsmLevels(30, 45, 12));
  EXPECT_THAT(cellNames(), ElementsAre("1001"));
}

TEST_F(GsmUmtsDriveTest, AreaAndNetworkAreThoseOfTheNextDecidingPacket) {
  at(0).take(servingNetworkOf(601)).take(gsmCell(1001, 42, 9));
  at(1'000).take(servingNetworkOf(602)).take(gsmCell(1002, 45, 15));
  EXPECT_THAT(lines, ElementsAre("1 area GSM: location area 601 -> 602",
                                 "1 reselection GSM: 1001 -> 1002"));
  EXPECT_EQ(cell("1001")->area, 601u);
  EXPECT_EQ(cell("1002")->area, 602u);
  EXPECT_EQ(cell("1002")->network, "999-990");
}

TEST_F(GsmUmtsDriveTest, AnotherNetworkIsTold) {
  at(0).take(servingNetworkOf(601)).take(gsmCell(1001, 42, 9));
  at(1'000).take(servingNetworkOf(601).u8(17, 0x89));
  EXPECT_THAT(lines, ElementsAre("1 network GSM: network 999-990 -> 999-980"));
}

TEST_F(GsmUmtsDriveTest, RankedCellsAreNeighboursOfTheirChannel) {
  at(0).take(activeSet({{381, kStrong}}));
  // One UMTS cell: channel 10613, code 21, RSCP -91 - 21 as the display has it, Ec/N0 -20 / 2.
  take(packet(0x4005).u8(13, 1).u16(15, 10613).u16(17, 21).u8(19, 0xA5).u8(22, 0xEC).length(25));
  ASSERT_NE(cell("10613/21"), nullptr);
  EXPECT_EQ(cell("10613/21")->level.last(), -112);
  EXPECT_EQ(cell("10613/21")->quality.last(), -10);
  EXPECT_EQ(cell("10613/21")->band().band, "I");
}

TEST_F(GsmUmtsDriveTest, NamedStatesAreToldWhenTheyChange) {
  at(0).take(rrState(5));
  at(1'000).take(rrState(5)).take(rrState(9));
  ASSERT_EQ(events.size(), 1u);
  EXPECT_EQ(events[0].kind, EventKind::State);
  EXPECT_EQ(events[0].subject, "GSM RR Info/RR State");
  EXPECT_EQ(events[0].from, "RR_IDLE");
  EXPECT_EQ(events[0].to, "RR_DATA_TRANSFER");
  EXPECT_EQ(events[0].toldBy, "0x512C");
}

TEST_F(GsmUmtsDriveTest, OfADriveTestLogCellsHaveNoChannelAndStatesAreNotTold) {
  isFromDriveTest = true;
  at(0).take(servingNetworkOf(601)).take(rrState(0)).take(activeSet({{381, kStrong}}));
  at(1'000)
      .take(rrState(9))
      .take(activeSet({}))
      .take(gsmCell(1001, 42, 9))
      .take(gsmLevels(30, 45, 12));
  at(1'500).take(gsmCell(1002, 45, 15));
  at(2'000).take(activeSet({{21, kStrong}}));
  EXPECT_THAT(lines,
              ElementsAre("1 technology GSM: UMTS -> GSM", "1 reselection GSM: code 381 -> 1001",
                          "1.5 reselection GSM: 1001 -> 1002", "2 technology UMTS: GSM -> UMTS",
                          "2 reselection UMTS: 1002 -> code 21"));
  EXPECT_EQ(events.size(), lines.size());
  for (const Cell& row : watch->cells().all()) {
    EXPECT_EQ(row.channel, std::nullopt);
    EXPECT_EQ(row.physical, std::nullopt);
    EXPECT_EQ(row.network, "");
    EXPECT_EQ(row.area, 601u);
  }
  EXPECT_EQ(cell("1001")->level.last(), -80);
}

}  // namespace
}  // namespace kestro::testing
