// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include "LogGenerator/C2K/SubPackets.h"
#include "Tests/LogGenerator/C2K/C2KFixture.h"

namespace kestro::testing {
namespace {

/// Where a sub-packet begins, or "none", with the number and the size of one that reaches too far.
std::string found(const PacketBytes& packet, std::uint8_t id) {
  const SubPacketSearch search = searchSubPacket(PacketView(packet.bytes()), id);
  if (search.start) return std::to_string(*search.start);
  if (!search.endedAtBadSize) return "none";
  return fmt::format("none: {} has the size {}", search.badIndex, search.badSize);
}

TEST(SubPacketsTest, FollowOneAnotherFromByteSeventeen) {
  const PacketBytes packet = packetOf(0x119C, {{5, 4}, {6, 10}, {7, 300}});
  EXPECT_EQ(found(packet, 5), "17");
  EXPECT_EQ(found(packet, 6), "21");
  EXPECT_EQ(found(packet, 7), "31");
}

TEST(SubPacketsTest, TheFirstWithAnIdentifierIsTaken) {
  EXPECT_EQ(found(packetOf(0x119C, {{5, 4}, {6, 10}, {6, 10}}), 6), "21");
}

TEST(SubPacketsTest, AnUnknownIdentifierIsAbsentSilently) {
  EXPECT_EQ(found(packetOf(0x119C, {{5, 4}, {6, 10}}), 7), "none");
  EXPECT_EQ(found(packetOf(0x119C, {}), 5), "none");
}

TEST(SubPacketsTest, NoMoreAreLookedAtThanThePacketCounts) {
  EXPECT_EQ(found(packetOf(0x119C, {{5, 4}, {6, 10}}).u8(14, 1), 6), "none");
}

TEST(SubPacketsTest, MayReachSixteenBytesPastTheEnd) {
  for (unsigned overrun = 1; overrun <= 16; ++overrun) {
    const PacketBytes packet = packetOf(0x119C, {{5, 4}, {6, 10}}).u16(21 + 2, 10 + overrun);
    EXPECT_EQ(found(packet, 6), "21") << overrun;
  }
}

TEST(SubPacketsTest, MayNotReachFurther) {
  for (const unsigned overrun : {17U, 18U, 100U, 65525U}) {
    const PacketBytes packet = packetOf(0x119C, {{5, 4}, {6, 10}}).u16(21 + 2, 10 + overrun);
    EXPECT_EQ(found(packet, 6), "none: 1 has the size " + std::to_string(10 + overrun));
  }
}

TEST(SubPacketsTest, ABadSizeIsReportedBeforeTheIdentifierIsRead) {
  const PacketBytes packet = packetOf(0x119C, {{5, 4}}).u16(17 + 2, 65535);
  EXPECT_EQ(found(packet, 5), "none: 0 has the size 65535");
}

TEST(SubPacketsTest, ABadSizeBehindTheOneThatIsLookedForIsNotSeen) {
  EXPECT_EQ(found(packetOf(0x119C, {{5, 4}, {6, 10}}).u16(21 + 2, 65535), 5), "17");
}

TEST(SubPacketsTest, ASizeOfZeroEndsTheSearchAfterTheCount) {
  const PacketBytes packet = packetOf(0x119C, {{5, 4}}).u16(17 + 2, 0).u8(14, 255);
  EXPECT_EQ(found(packet, 6), "none");
  EXPECT_EQ(found(packet, 5), "17");
}

TEST(SubPacketsTest, CountsPastTheEndReadZeros) {
  // What lies past the end has the identifier 0 and the size 0.
  const PacketBytes packet = packetOf(0x119C, {{5, 4}}).u8(14, 255);
  EXPECT_EQ(found(packet, 6), "none");
  EXPECT_EQ(found(packet, 0), "21");
}

TEST(SubPacketsTest, PositionsDoNotWrapAtSixteenBits) {
  std::vector<SubPacketBytes> parts(4, SubPacketBytes(5, 60000));
  parts.emplace_back(6, 4);
  EXPECT_EQ(found(packetOf(0x119C, parts), 6), std::to_string(17U + 4 * 60000));
}

}  // namespace
}  // namespace kestro::testing
