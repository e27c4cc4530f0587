// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "CommandLine/Formats/PacketNames.h"
#include "CommandLine/OfflineServices.h"
#include "Tests/CommandLine/Formats/CatalogueGenerator.h"
#include "Tests/Support/PacketBytes.h"

namespace kestro::testing {
namespace {

class PacketNamesTest : public ::testing::Test {
 protected:
  [[nodiscard]] std::string reason(const PacketBytes& bytes) const {
    return names.reasonForNothing(bytes.bytes());
  }

  OfflineServices services;
  CatalogueGenerator generator{
      services.forGenerator(),
      {{.code = 0xB17F, .packetName = "level", .minimumLength = 33, .section = "A"},
       {.code = 0x4031, .section = "B"}}};
  PacketNames names{generator};
};

TEST_F(PacketNamesTest, KnowsTheNames) {
  EXPECT_FALSE(names.isEmpty());
  EXPECT_EQ(names.nameOf(0xB17F), "level");
  EXPECT_EQ(names.nameOf(0x4031), "");
  EXPECT_EQ(names.nameOf(0x1111), "");
  EXPECT_TRUE(PacketNames(CatalogueGenerator(services.forGenerator(), {})).isEmpty());
}

TEST_F(PacketNamesTest, SaysWhyNothingIsRead) {
  EXPECT_EQ(reason(packet(0xB17F).length(12)),
            "too short for a packet, which has at least 13 bytes");
  EXPECT_EQ(reason(packet(0xB17F).u8(0, 2)), "dropped: 0x02 is no log type");
  EXPECT_EQ(reason(packet(0x1111)), "no section takes this log code");
  EXPECT_EQ(reason(packet(0x4031)), "what this packet contains is not known");
  EXPECT_EQ(reason(packet(0xB17F).length(32)),
            "too short: sections read this packet from 33 bytes on");
  EXPECT_EQ(reason(packet(0xB17F).length(33)), "no section reads a value from it");
}

TEST_F(PacketNamesTest, LooksBehindThePrefix) {
  Bytes message = {0x81, 0};
  const Bytes inner = packet(0x4031).bytes();
  message.insert(message.end(), inner.begin(), inner.end());
  EXPECT_EQ(names.reasonForNothing(message), "what this packet contains is not known");
}

}  // namespace
}  // namespace kestro::testing
