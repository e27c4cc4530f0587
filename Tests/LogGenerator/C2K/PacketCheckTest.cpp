// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/OneXStatus.h"
#include "LogGenerator/C2K/PacketCheck.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// A state of 6 bytes at 17, a radio of 14 at 23, an active set of 12 at 37, fingers of 8 at 49.
PacketBytes status() { return packetOf(0x119C, {{1, 6}, {2, 14}, {3, 12}, {4, 8}}); }

std::vector<Line> refusalOf(const PacketBytes& packet) {
  std::vector<Line> lines;
  for (const RefusalLine& line : refusalOf(OneXStatus().rules(), PacketView(packet.bytes()))) {
    lines.push_back({line.priority, line.text()});
  }
  return lines;
}

TEST(PacketCheckTest, FindsTheSubPacketsOfAPacketThatIsTaken) {
  const PacketBytes packet = status();
  TakenPacket taken{.bytes = PacketView(packet.bytes())};
  EXPECT_TRUE(isTaken(OneXStatus().rules(), taken));
  EXPECT_THAT(taken.subPackets, ElementsAre(17, 23, 37, 49));
  EXPECT_THAT(refusalOf(packet), IsEmpty());
}

TEST(PacketCheckTest, SaysEverythingThatTheLogGetsAboutAPacket) {
  EXPECT_THAT(
      refusalOf(status().u16(37 + 2, 1000)),
      ElementsAre(errorLine("Log code error in subpkt#2: bad size (1000)."),
                  errorLine("Log code error in subpkt#2: bad size (1000)."),
                  warningLine("Log code 0x119c: missing subpacket (ss=1,rf=1,ai=0,fi=0).")));
}

TEST(PacketCheckTest, LooksNoFurtherThanToTheFirstThingThatIsMissing) {
  EXPECT_THAT(refusalOf(status().length(16)),
              ElementsAre(errorLine("Log code 0x119c is 16 bytes long but must be at least 17 "
                                    "bytes.")));
}

}  // namespace
}  // namespace kestro::testing
