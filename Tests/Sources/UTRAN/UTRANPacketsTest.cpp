// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "Sources/PacketSimulation.h"
#include "Sources/UTRAN/UTRANPackets.h"
#include "Tests/Sources/BytesOfPacket.h"

namespace kestro {
namespace {

using testing::bytesAt;
using ::testing::ElementsAre;

TEST(UTRANPacketsTest, ReportsTheSignalToInterferenceInHalfDecibels) {
  EXPECT_EQ(utranSirStep(-11.1), 0U);
  EXPECT_EQ(utranSirStep(-11), 1U);
  EXPECT_EQ(utranSirStep(-10.6), 1U);
  EXPECT_EQ(utranSirStep(-10.5), 2U);
  EXPECT_EQ(utranSirStep(9), 41U);
  EXPECT_EQ(utranSirStep(19.9), 62U);
  EXPECT_EQ(utranSirStep(20), 63U);
  EXPECT_EQ(utranSirStep(60), 63U);
}

TEST(UTRANPacketsTest, ReportsBlockErrorsByTheirLogarithm) {
  EXPECT_EQ(utranBlockErrorStep(0), 0U);
  EXPECT_EQ(utranBlockErrorStep(1e-5), 1U);
  EXPECT_EQ(utranBlockErrorStep(1e-4), 2U);   // -4.000: from -4.030 to -3.965
  EXPECT_EQ(utranBlockErrorStep(0.01), 33U);  // -2.000: 31 steps of 0.065 from -4.030 are -2.015
  EXPECT_EQ(utranBlockErrorStep(0.5), 59U);   // -0.301: 57 steps are -0.325
  EXPECT_EQ(utranBlockErrorStep(1), 63U);
}

TEST(UTRANPacketsTest, PutsNeighboursWhereTheyAreRead) {
  const std::vector<UTRANCellReport> cells = {{.uarfcn = 10071,
                                               .parameterId = 83,
                                               .rscp = -75,
                                               .set = UTRANSet::Detected,
                                               .isJointlyDetected = true}};
  const auto packet = utranNeighbours(cells, kSimulationBegin);
  EXPECT_THAT(bytesAt(packet, 16, 1), ElementsAre(1U << 1));
  // 10071 is 0x2757; of 83 the low bits are 3 and the others 20; 41 above -116 dBm: 1 and 5.
  EXPECT_THAT(bytesAt(packet, 168, 4),
              ElementsAre(0x57, 0x27 | 3 << 6, 20 | 1 << 5, 0x85 | 2 << 5));
}

TEST(UTRANPacketsTest, ReportsLevelsThatNoByteCanCarryAsTheNearest) {
  const auto lastBytes = [](double rscp) {
    const std::vector<UTRANCellReport> cells = {{.rscp = rscp, .set = UTRANSet::Active}};
    return bytesAt(utranNeighbours(cells, kSimulationBegin), 170, 2);
  };
  EXPECT_THAT(lastBytes(-130), ElementsAre(0, 0));
  EXPECT_THAT(lastBytes(200), ElementsAre(0xE0, 0x1F));
}

TEST(UTRANPacketsTest, PutsGSMNeighboursWhereTheyAreRead) {
  const std::vector<UTRANGSMCellReport> cells = {
      {.cellId = 1152, .arfcn = 56, .bsic = 14, .level = -70.4}};
  const auto packet = utranGSMNeighbours(cells, kSimulationBegin);
  // 1152 is 0x0480; the BSIC is valid; colours 1 and 6; -70 is 0xFFBA.
  EXPECT_THAT(bytesAt(packet, 16, 9), ElementsAre(1, 0x80, 0x84, 1, 6, 56, 0, 0xBA, 0xFF));
}

TEST(UTRANPacketsTest, PutsCodedChannelsBehindAllTransportChannels) {
  const std::vector<UTRANTransportChannel> transport = {{5, 0.01}, {24, 0}};
  const std::vector<UTRANCodedChannel> coded = {{1, 4, {-12, -11, 9, 9, 9, 20}}};
  const auto packet = utranChannels(transport, coded, kSimulationBegin);
  EXPECT_THAT(bytesAt(packet, 14, 2), ElementsAre(2U << 6, 1U << 4));
  EXPECT_THAT(bytesAt(packet, 17, 4), ElementsAre(5, 33, 24, 0));
  EXPECT_THAT(bytesAt(packet, 289 + 2 * 34, 8), ElementsAre(1, 4, 0, 1, 41, 41, 41, 63));
}

TEST(UTRANPacketsTest, PutsTheServingCellWhereItIsRead) {
  const auto packet = utranSystemInformation(
      {.uarfcn = 10055, .cellIdentity = 0x000C7531, .registrationArea = 3}, kSimulationBegin);
  EXPECT_THAT(bytesAt(packet, 14, 12),
              ElementsAre(0, 3, 0, 0x47, 0x27, 0x47, 0x27, 0x31, 0x75, 0x0C, 0, 0));
}

TEST(UTRANPacketsTest, PutsTheModeBehindItsValidity) {
  EXPECT_THAT(bytesAt(utranRrcState(UTRANMode::UraPch, kSimulationBegin), 13, 2),
              ElementsAre(1, 5));
}

TEST(UTRANPacketsTest, MakesNoPacketOfWhatItCannotCarry) {
  EXPECT_FALSE(utranNeighbours(std::vector<UTRANCellReport>(128), kSimulationBegin).has_value());
  EXPECT_FALSE(
      utranNeighbours({{UTRANCellReport{.uarfcn = 16'384}}}, kSimulationBegin).has_value());
  EXPECT_FALSE(
      utranChannels(std::vector<UTRANTransportChannel>(64), {}, kSimulationBegin).has_value());
}

}  // namespace
}  // namespace kestro
