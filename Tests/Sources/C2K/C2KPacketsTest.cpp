// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "Sources/C2K/C2KPackets.h"
#include "Sources/C2K/SentCounters.h"
#include "Sources/PacketSimulation.h"
#include "Tests/Sources/BytesOfPacket.h"

namespace kestro {
namespace {

using testing::bytesAt;
using ::testing::ElementsAre;

const std::vector<C2KPilot> kOnePilot = {{.pnOffset = 340, .energy = -10}};

OneXReport traffic() {
  return {.state = OneXState::Traffic,
          .channel = {.bandClass = 1, .number = 283},
          .receivePower = {-63.248, -80},
          .transmitPower = -10.1,
          .activeSet = kOnePilot};
}

TEST(OneXPacketsTest, TheStatusHasFourSubPacketsInARow) {
  const auto packet = oneXStatus(traffic(), kSimulationBegin);
  EXPECT_THAT(bytesAt(packet, 14, 1), ElementsAre(4));
  EXPECT_THAT(bytesAt(packet, 17, 8), ElementsAre(1, 0, 8, 0, 8, 0, 0, 0));
  // 283 is 0x011B; 50 steps of 0.334 below -63.248 are -79.95; -10.1 in tenths is 0xFF9B.
  EXPECT_THAT(bytesAt(packet, 25, 14),
              ElementsAre(2, 0, 14, 0, 1, 1, 0x1B, 1, 0x1B, 1, 0, 0xCE, 0x9B, 0xFF));
  // 512 chips, factor 1, exponent 4, one pilot of one value, reference 340.
  EXPECT_THAT(bytesAt(packet, 39, 14),
              ElementsAre(3, 0, 32, 0, 0, 2, 1, 4, 1, 1, 0x54, 1, 0x54, 1));
  // (0.1 + 1 / 512) × 9 × 512² / 32 = 7516.8
  EXPECT_THAT(bytesAt(packet, 39 + 28, 2), ElementsAre(0x5D, 0x1D));
  EXPECT_THAT(bytesAt(packet, 71, 4), ElementsAre(4, 0, 8, 0));
  EXPECT_EQ(packet->size(), 79U);
}

TEST(OneXPacketsTest, TheActiveSetGrowsByTwentyBytesAPilot) {
  OneXReport report = traffic();
  const std::vector<C2KPilot> pilots = {{4, -1}, {172, -3}, {340, -20}};
  report.activeSet = pilots;
  const auto packet = oneXStatus(report, kSimulationBegin);
  EXPECT_THAT(bytesAt(packet, 41, 2), ElementsAre(12 + 3 * 20, 0));
  EXPECT_THAT(bytesAt(packet, 39 + 12, 2), ElementsAre(4, 0));
  EXPECT_THAT(bytesAt(packet, 39 + 32, 2), ElementsAre(172, 0));
  EXPECT_THAT(bytesAt(packet, 39 + 52, 2), ElementsAre(0x54, 1));
  report.activeSet = {};
  EXPECT_THAT(bytesAt(oneXStatus(report, kSimulationBegin), 41, 8),
              ElementsAre(12, 0, 0, 2, 1, 4, 0, 1));
}

TEST(OneXPacketsTest, PowersThatTheirByteCannotCarryAreTheNearest) {
  OneXReport report = traffic();
  report.receivePower[0] = -130;
  report.receivePower[1] = 10;
  EXPECT_THAT(bytesAt(oneXStatus(report, kSimulationBegin), 35, 2), ElementsAre(0x80, 0x7F));
}

TEST(OneXPacketsTest, AFrameIsGoodOrBad) {
  const auto bad = oneXTrafficFrame(true, kSimulationBegin);
  EXPECT_THAT(bytesAt(bad, 14, 1), ElementsAre(1));
  EXPECT_THAT(bytesAt(bad, 17, 4), ElementsAre(11, 0, 28, 0));
  EXPECT_THAT(bytesAt(bad, 41, 1), ElementsAre(1));
  EXPECT_EQ(bad->size(), 45U);
  EXPECT_THAT(bytesAt(oneXTrafficFrame(false, kSimulationBegin), 41, 1), ElementsAre(0));
}

TEST(OneXPacketsTest, TheSystemStandsWhereItIsRead) {
  const auto packet = oneXSystemParameters({.systemId = 4139,
                                            .networkId = 3,
                                            .baseStationId = 3152,
                                            .packetZoneId = 4,
                                            .protocolRevision = 6,
                                            .isRoaming = true},
                                           kSimulationBegin);
  EXPECT_THAT(bytesAt(packet, 13, 1), ElementsAre(2));
  EXPECT_THAT(bytesAt(packet, 42, 12), ElementsAre(1, 0, 0, 0, 2, 0, 0, 0, 0x2B, 0x10, 3, 0));
  EXPECT_THAT(bytesAt(packet, 131, 3), ElementsAre(4, 0, 6));
  EXPECT_THAT(bytesAt(packet, 184, 2), ElementsAre(0x50, 0x0C));
}

TEST(EVDOPacketsTest, TheStatusHasItsFixedLength) {
  const auto packet = evdoStatus({.deviceState = EVDOState::Connected,
                                  .sessionState = EVDOSession::Open,
                                  .channel = {.bandClass = 1, .number = 1175},
                                  .receivePower = {-75, -77.4},
                                  .transmitPower = -2,
                                  .servingPilot = 460,
                                  .address = 0x2A51C7,
                                  .colorCode = 17},
                                 kSimulationBegin);
  ASSERT_EQ(packet->size(), 50U);
  // 1175 is 0x497; 460 is 0x1CC.
  EXPECT_THAT(bytesAt(packet, 13, 7), ElementsAre(0x97, 0x04 | 1 << 3, 0xB5, 0xB3, 0xFE, 0xCC, 1));
  EXPECT_THAT(bytesAt(packet, 36, 6), ElementsAre(5, 4, 0xC7, 0x51, 0x2A, 17));
}

TEST(EVDOPacketsTest, WithoutAPilotTheOffsetIsInvalid) {
  const auto packet = evdoStatus({.channel = {}}, kSimulationBegin);
  EXPECT_THAT(bytesAt(packet, 18, 2), ElementsAre(0xFF, 0xFF));
}

TEST(EVDOPacketsTest, PilotsHaveLinearEnergies) {
  // 512 × 10^-0.3 = 256.6
  const std::vector<C2KPilot> pilots = {{340, 0}, {460, -3}};
  const auto packet = evdoActiveSet(pilots, kSimulationBegin);
  ASSERT_EQ(packet->size(), 25U + 2 * 12);
  EXPECT_THAT(bytesAt(packet, 15, 1), ElementsAre(2));
  EXPECT_THAT(bytesAt(packet, 25, 4), ElementsAre(0x54, 1, 0, 2));
  EXPECT_THAT(bytesAt(packet, 37, 4), ElementsAre(0xCC, 1, 1, 1));
  EXPECT_EQ(evdoActiveSet({}, kSimulationBegin)->size(), 25U);
}

TEST(EVDOPacketsTest, AFingerWithoutAPilotIsUnused) {
  const std::vector<std::optional<C2KPilot>> fingers = {C2KPilot{340, 0}, std::nullopt};
  const auto packet = evdoFingers(fingers, kSimulationBegin);
  ASSERT_EQ(packet->size(), 23U + 2 * 14);
  EXPECT_THAT(bytesAt(packet, 22, 3), ElementsAre(2, 0x54, 1));
  EXPECT_THAT(bytesAt(packet, 29, 2), ElementsAre(0, 2));
  EXPECT_THAT(bytesAt(packet, 37, 2), ElementsAre(0xFF, 0xFF));
}

TEST(EVDOPacketsTest, MakeNoPacketOfWhatTheyCannotCarry) {
  OneXReport report = traffic();
  report.channel.number = 0x1'0000;
  EXPECT_FALSE(oneXStatus(report, kSimulationBegin).has_value());
  report = traffic();
  const std::vector<C2KPilot> many(256);
  report.activeSet = many;
  EXPECT_FALSE(oneXStatus(report, kSimulationBegin).has_value());
  EXPECT_FALSE(evdoActiveSet(many, kSimulationBegin).has_value());
  const std::vector<std::uint32_t> few(55);
  EXPECT_FALSE(evdoThroughput(kForwardThroughput, 1, few, kSimulationBegin).has_value());
}

// --- Counters

TEST(SentCountersTest, CountWholePacketsAndKeepTheRest) {
  SentCounters counters(kForwardThroughput);
  counters.send(3, 2'500);  // 2 × 1,024 and 452
  const auto first = counters.packet(kSimulationBegin);
  EXPECT_THAT(bytesAt(first, 13, 4), ElementsAre(1, 0, 0, 0));
  EXPECT_THAT(bytesAt(first, 29, 4), ElementsAre(2, 0, 0, 0));
  counters.send(3, 571);
  EXPECT_THAT(bytesAt(counters.packet(kSimulationBegin), 29, 4), ElementsAre(2, 0, 0, 0));
  counters.send(3, 1);
  const auto third = counters.packet(kSimulationBegin);
  EXPECT_THAT(bytesAt(third, 13, 4), ElementsAre(3, 0, 0, 0));
  EXPECT_THAT(bytesAt(third, 29, 4), ElementsAre(3, 0, 0, 0));
}

TEST(SentCountersTest, WrapAtThirtyTwoBits) {
  SentCounters counters(kForwardThroughput);
  counters.send(3, 1024.0 * 0xFFFFFFFF);
  counters.send(3, 2 * 1024);
  EXPECT_THAT(bytesAt(counters.packet(kSimulationBegin), 29, 4), ElementsAre(1, 0, 0, 0));
}

TEST(SentCountersTest, ForwardRatesEndWithTheirLargestPacket) {
  EXPECT_THAT(forwardPacketCounters(),
              ElementsAre(3, 8, 13, 18, 23, 27, 32, 36, 39, 43, 45, 48, 50, 52, 54));
}

TEST(SentCountersTest, ReverseRatesTakeTheSmallestPacketThatIsEnough) {
  // Eight counters a size; 150 packets a second.
  EXPECT_EQ(reversePacketCounter(0), 0U);
  EXPECT_EQ(reversePacketCounter(19'200), 0U);
  EXPECT_EQ(reversePacketCounter(19'201), 8U);
  EXPECT_EQ(reversePacketCounter(1'228'800), 80U);
  EXPECT_EQ(reversePacketCounter(1'228'801), 88U);
  EXPECT_EQ(reversePacketCounter(1e9), 88U);
}

}  // namespace
}  // namespace kestro
