// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <string>

#include "TelephonyServer/LostChannels.h"

namespace kestro {
namespace {

constexpr ProcessNumber kClient = 7;

class LostChannelsTest : public ::testing::Test {
 protected:
  void lose(const std::string& portName, StartCommand command = {}, std::uint64_t missed = 0) {
    channels.remember({portName, kClient, std::move(command), missed});
  }
  void due(const std::string& message, int count = 1) {
    const Bytes bytes(message.begin(), message.end());
    for (int i = 0; i < count; ++i) channels.messageDue(bytes);
  }
  void pass(unsigned seconds) {
    for (unsigned i = 0; i < seconds; ++i) channels.secondPassed();
  }
  std::optional<std::uint64_t> missedBy(std::string_view portName) {
    const auto lost = channels.take(portName, kClient);
    return lost ? std::optional(lost->missed) : std::nullopt;
  }

  LostChannels channels;
};

TEST_F(LostChannelsTest, CountWhatComesAfterWhatTheyHadMissedAlready) {
  due("before");
  lose("A", {}, 5);
  due("after", 3);
  EXPECT_EQ(missedBy("A"), 8U);
}

TEST_F(LostChannelsTest, MissOnlyWhatTheyWanted) {
  lose("A", {.filter = CodeFilter({0x4241})});
  due("\x01..AB", 2);
  due("\x01..XY", 3);
  EXPECT_EQ(missedBy("A"), 2U);
}

TEST_F(LostChannelsTest, AreRememberedForSixtySeconds) {
  lose("A");
  lose("B");
  pass(60);
  EXPECT_TRUE(missedBy("A"));
  pass(1);
  EXPECT_FALSE(missedBy("B"));
}

TEST_F(LostChannelsTest, AreTakenOnceAndByTheirClientOnly) {
  lose("A");
  EXPECT_FALSE(channels.take("A", kClient + 1));
  EXPECT_TRUE(channels.take("A", kClient));
  EXPECT_FALSE(channels.take("A", kClient));
  EXPECT_FALSE(channels.take("B", kClient));
}

TEST_F(LostChannelsTest, TheirCommandsAreKept) {
  lose("A", {.filter = CodeFilter({0x4241}), .wantsTimes = true});
  const auto lost = channels.take("A", kClient);
  ASSERT_TRUE(lost);
  EXPECT_TRUE(lost->command.wantsTimes);
  EXPECT_FALSE(lost->command.filter.acceptsEverything());
}

TEST_F(LostChannelsTest, ThoseThatAskedForCodesAreForgottenWhenTheTechnologyChanges) {
  lose("Codes", {.filter = CodeFilter({0x4241})});
  lose("Everything");
  channels.technologyChanged();
  EXPECT_FALSE(missedBy("Codes"));
  EXPECT_TRUE(missedBy("Everything"));
}

TEST_F(LostChannelsTest, NoMoreThan512AreRemembered) {
  for (int i = 0; i <= 512; ++i) lose("A" + std::to_string(i));
  EXPECT_FALSE(missedBy("A0"));
  EXPECT_TRUE(missedBy("A1"));
  EXPECT_TRUE(missedBy("A512"));
}

}  // namespace
}  // namespace kestro
