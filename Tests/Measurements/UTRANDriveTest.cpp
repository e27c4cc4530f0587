// SPDX-License-Identifier: MIT
// Drives through UTRAN cells in TDD mode, packet by packet.
#include "LogGenerator/Ondrel/CellMonitor.h"
#include "Platform/TelephonyService.h"
#include "Tests/Measurements/DriveFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;

PacketBytes utranCell(unsigned identity, unsigned channel) {
  return packet(0xD0E2).u16(19, channel).u32(21, identity).length(26);
}

/// 2: Cell FACH, 4: Cell PCH.
PacketBytes rrcState(unsigned state) { return packet(0xD0E0).u8(13, 1).u8(14, state).length(15); }

/// A neighbour on channel 10055 with cell parameter 3: channel in bits 0 to 13, cell in bits 14 to
/// 20, level in bits 21 to 28.
PacketBytes utranNeighbour(unsigned level) {
  return packet(0xD00A).u8(16, 1 << 1).u32(168, 10055U | 3U << 14U | level << 21U).length(184);
}

class UTRANDriveTest : public DriveFixture {
 public:
  UTRANDriveTest() : DriveFixture(kTqLogChannelTechnology_Ondrel_UTRAN2) {}

  /// The telephony server's list with the serving cell.
  DriveFixture& takeListed(unsigned identity, unsigned scramblingCode, unsigned area) {
    Dictionary serving;
    serving.set(kTqCellMonitorCellRadioAccessTechnology, kTqCellMonitorRadioAccessTechnologyUTRAN2);
    serving.set(kTqCellMonitorCellType, kTqCellMonitorCellTypeServing);
    serving.set(kTqCellMonitorCellId, Value::integer(identity));
    serving.set(kTqCellMonitorSCN, Value::integer(scramblingCode));
    serving.set(kTqCellMonitorLAC, Value::integer(area));
    serving.set(kTqCellMonitorUARFCN, Value::integer(10055));
    return take(packet(0xFF0001).append(*coding->binary(Array{serving})));
  }
};

TEST_F(UTRANDriveTest, CommonAndDedicatedChannelsMakeAHandover) {
  at(0).take(utranCell(816434, 10055)).take(rrcState(2));
  at(1'000).take(utranCell(816584, 10063)).take(rrcState(3));
  at(1'500).take(rrcState(4)).take(utranCell(816434, 10055));
  EXPECT_THAT(lines, ElementsAre("1 handover UTRA TDD: 816434 -> 816584",
                                 "1.5 reselection UTRA TDD: 816584 -> 816434"));
  EXPECT_EQ(events[0].toldBy, "0xD0E2");
}

TEST_F(UTRANDriveTest, TheServersListAddsPhysicalIdentityAndArea) {
  at(0).take(utranCell(816434, 10055));
  takeListed(816434, 3, 601);
  EXPECT_EQ(cell("816434")->physical, 3u);
  EXPECT_EQ(cell("816434")->area, 601u);
  EXPECT_EQ(cell("816434")->band(), (ChannelBand{.band = "a high", .downlinkKHz = 2'011'000}));
  // So that the pair is known when another cell serves.
  at(1'000).take(utranCell(816584, 10063)).take(utranNeighbour(64));
  EXPECT_EQ(cell("816434")->level.last(), 0.25);  // 64 / 256, as the display has it
  EXPECT_TRUE(cell("816434")->isAssumed);
}

}  // namespace
}  // namespace kestro::testing
