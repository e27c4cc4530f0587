// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "LogGenerator/Packets/Packet.h"
#include "Tests/Support/CountingPropertyListCoding.h"
#include "Tests/Support/PacketBytes.h"

namespace kestro::testing {
namespace {

class PacketTest : public ::testing::Test {
 protected:
  [[nodiscard]] Bytes carrying(const Value& list) const {
    return packet(kCellMonitorCode).append(*coding.xml(list)).bytes();
  }

  CountingPropertyListCoding coding;
};

TEST_F(PacketTest, CarriesAPropertyListBehindItsHeader) {
  const Bytes bytes = carrying(Array{"a", "b"});
  const Packet packet(bytes);
  EXPECT_EQ(packet.bytes().data(), bytes.data());
  EXPECT_EQ(packet.bytes().size(), bytes.size());
  ASSERT_TRUE(packet.propertyList(coding));
  EXPECT_EQ(*packet.propertyList(coding), Value(Array{"a", "b"}));
}

TEST_F(PacketTest, ItsListIsParsedWhenFirstAskedForAndOnce) {
  const Bytes bytes = carrying(Array{"a"});
  const Packet packet(bytes);
  EXPECT_EQ(coding.parsed(), 0);
  const Array first = packet.propertyList(coding)->array();
  EXPECT_EQ(coding.parsed(), 1);
  EXPECT_TRUE(packet.propertyList(coding)->array().isSame(first));
  EXPECT_EQ(coding.parsed(), 1);
}

TEST_F(PacketTest, WhatIsNoListIsTriedOnceToo) {
  const Bytes bytes = packet(kCellMonitorCode).append(Bytes{1, 2, 3}).bytes();
  const Packet packet(bytes);
  EXPECT_FALSE(packet.propertyList(coding));
  EXPECT_FALSE(packet.propertyList(coding));
  EXPECT_EQ(coding.parsed(), 1);
}

TEST_F(PacketTest, AnEmptyPayloadIsNoList) {
  for (const std::size_t size : {std::size_t{0}, std::size_t{12}, kPacketHeaderSize}) {
    const Bytes bytes(size, 0);
    EXPECT_FALSE(Packet(bytes).propertyList(coding)) << size;
  }
}

}  // namespace
}  // namespace kestro::testing
