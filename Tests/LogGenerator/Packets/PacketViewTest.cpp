// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <limits>
#include <memory>

#include "LogGenerator/Packets/PacketView.h"

namespace kestro {
namespace {

/// Bytes 0x11, 0x22, … 0x88 in memory that ends with the last one.
class PacketViewTest : public ::testing::Test {
 protected:
  PacketViewTest() {
    for (std::size_t i = 0; i < kSize; ++i) memory[i] = static_cast<std::uint8_t>(0x11 * (i + 1));
  }

  static constexpr std::size_t kSize = 8;
  std::unique_ptr<std::uint8_t[]> memory = std::make_unique<std::uint8_t[]>(kSize);
  PacketView packet{ByteView(memory.get(), kSize)};
};

TEST_F(PacketViewTest, ReadsLittleEndianIntegersOfEveryWidth) {
  EXPECT_EQ(packet.read(1, 1), 0x22U);
  EXPECT_EQ(packet.read(1, 2), 0x3322U);
  EXPECT_EQ(packet.read(1, 3), 0x443322U);
  EXPECT_EQ(packet.read(1, 4), 0x55443322U);
}

TEST_F(PacketViewTest, ReadsUpToTheLastByte) {
  EXPECT_EQ(packet.u32(4), 0x88776655U);
  EXPECT_EQ(packet.u16(6), 0x8877U);
  EXPECT_EQ(packet.u8(7), 0x88U);
  EXPECT_EQ(packet.read(5, 3), 0x887766U);
}

TEST_F(PacketViewTest, BytesPastTheEndReadAsZero) {
  EXPECT_EQ(packet.u32(5), 0x00887766U);
  EXPECT_EQ(packet.u32(7), 0x00000088U);
  EXPECT_EQ(packet.u16(7), 0x0088U);
  EXPECT_EQ(packet.u8(8), 0U);
  EXPECT_EQ(packet.u16(8), 0U);
  EXPECT_EQ(packet.u32(8), 0U);
  EXPECT_EQ(packet.u32(1'000'000), 0U);
}

TEST_F(PacketViewTest, OffsetsMayBeAsLargeAsTheyCome) {
  constexpr std::size_t kLargest = std::numeric_limits<std::size_t>::max();
  EXPECT_EQ(packet.u8(kLargest), 0U);
  EXPECT_EQ(packet.u32(kLargest - 4), 0U);
}

TEST(EmptyPacketViewTest, IsAllZeros) {
  const PacketView packet;
  EXPECT_EQ(packet.size(), 0U);
  EXPECT_EQ(packet.u8(0), 0U);
  EXPECT_EQ(packet.u32(0), 0U);
}

}  // namespace
}  // namespace kestro
