// SPDX-License-Identifier: MIT
#include <numeric>

#include "LogGenerator/C2K/SubPackets.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Optional;

class SubPacketsTest : public ::testing::Test {
 protected:
  std::optional<std::size_t> find(const PacketBytes& packet, std::uint8_t id) {
    return findSubPacket(PacketView(packet.bytes()), id, log);
  }

  RecordingSystemLog log;
};

TEST_F(SubPacketsTest, FollowOneAnotherFromByteSeventeen) {
  const PacketBytes packet = packetOf(0x119C, {{5, 4}, {6, 10}, {7, 300}});
  EXPECT_THAT(find(packet, 5), Optional(17U));
  EXPECT_THAT(find(packet, 6), Optional(21U));
  EXPECT_THAT(find(packet, 7), Optional(31U));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SubPacketsTest, TheFirstWithAnIdentifierIsTaken) {
  EXPECT_THAT(find(packetOf(0x119C, {{5, 4}, {6, 10}, {6, 10}}), 6), Optional(21U));
}

TEST_F(SubPacketsTest, AnUnknownIdentifierIsAbsentSilently) {
  EXPECT_EQ(find(packetOf(0x119C, {{5, 4}, {6, 10}}), 7), std::nullopt);
  EXPECT_EQ(find(packetOf(0x119C, {}), 5), std::nullopt);
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SubPacketsTest, NoMoreAreLookedAtThanThePacketCounts) {
  EXPECT_EQ(find(packetOf(0x119C, {{5, 4}, {6, 10}}).u8(14, 1), 6), std::nullopt);
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SubPacketsTest, MayReachSixteenBytesPastTheEnd) {
  for (unsigned overrun = 1; overrun <= 16; ++overrun) {
    const PacketBytes packet = packetOf(0x119C, {{5, 4}, {6, 10}}).u16(21 + 2, 10 + overrun);
    EXPECT_THAT(find(packet, 6), Optional(21U)) << overrun;
  }
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SubPacketsTest, MayNotReachFurther) {
  for (const unsigned overrun : {17U, 18U, 100U, 65525U}) {
    const PacketBytes packet = packetOf(0x119C, {{5, 4}, {6, 10}}).u16(21 + 2, 10 + overrun);
    EXPECT_EQ(find(packet, 6), std::nullopt) << overrun;
    EXPECT_THAT(log.take(), ElementsAre(errorLine("Log code error in subpkt#1: bad size (" +
                                                  std::to_string(10 + overrun) + ").")));
  }
}

TEST_F(SubPacketsTest, ABadSizeIsReportedBeforeTheIdentifierIsRead) {
  const PacketBytes packet = packetOf(0x119C, {{5, 4}}).u16(17 + 2, 65535);
  EXPECT_EQ(find(packet, 5), std::nullopt);
  EXPECT_THAT(log.take(), ElementsAre(errorLine("Log code error in subpkt#0: bad size (65535).")));
}

TEST_F(SubPacketsTest, ABadSizeBehindTheOneThatIsLookedForIsNotSeen) {
  EXPECT_THAT(find(packetOf(0x119C, {{5, 4}, {6, 10}}).u16(21 + 2, 65535), 5), Optional(17U));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SubPacketsTest, ASizeOfZeroEndsTheSearchAfterTheCount) {
  const PacketBytes packet = packetOf(0x119C, {{5, 4}}).u16(17 + 2, 0).u8(14, 255);
  EXPECT_EQ(find(packet, 6), std::nullopt);
  EXPECT_THAT(find(packet, 5), Optional(17U));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SubPacketsTest, CountsPastTheEndReadZeros) {
  // What lies past the end has the identifier 0 and the size 0.
  const PacketBytes packet = packetOf(0x119C, {{5, 4}}).u8(14, 255);
  EXPECT_EQ(find(packet, 6), std::nullopt);
  EXPECT_THAT(find(packet, 0), Optional(21U));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SubPacketsTest, PositionsDoNotWrapAtSixteenBits) {
  std::vector<SubPacketBytes> parts(4, SubPacketBytes(5, 60000));
  parts.emplace_back(6, 4);
  EXPECT_THAT(find(packetOf(0x119C, parts), 6), Optional(17U + 4 * 60000));
}

}  // namespace
}  // namespace kestro::testing
