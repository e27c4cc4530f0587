// SPDX-License-Identifier: MIT
// The simulated radio world: that it repeats, and that it behaves as radio does.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "Sources/World/Noise.h"
#include "Sources/World/RadioWorld.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

TEST(SmoothNoiseTest, RepeatsForOneSeedAndDiffersForAnother) {
  const SmoothNoise noise(7, 10);
  EXPECT_EQ(noise.at(123.4), SmoothNoise(7, 10).at(123.4));
  EXPECT_NE(noise.at(123.4), SmoothNoise(8, 10).at(123.4));
}

TEST(SmoothNoiseTest, HasMeanZeroAndDeviationOne) {
  const SmoothNoise noise(42, 1);
  constexpr int kCount = 20'000;
  double sum = 0;
  double squares = 0;
  for (int i = 0; i < kCount; ++i) {
    const double value = noise.at(i * 0.73);
    ASSERT_LT(std::abs(value), 5);
    sum += value;
    squares += value * value;
  }
  EXPECT_NEAR(sum / kCount, 0, 0.05);
  EXPECT_NEAR(squares / kCount, 1, 0.05);
}

TEST(SmoothNoiseTest, ChangesLittleOverAHundredthOfItsCorrelationLength) {
  const SmoothNoise noise(42, 50);
  for (double place = 0; place < 5'000; place += 0.5) {
    ASSERT_LT(std::abs(noise.at(place + 0.5) - noise.at(place)), 0.2) << place;
  }
}

TEST(SmoothNoiseTest, APeriodicOneMeetsItselfAgain) {
  const SmoothNoise noise(42, 50, 20);
  EXPECT_NEAR(noise.at(999.999), noise.at(0), 0.01);
  EXPECT_NEAR(noise.at(1'020), noise.at(20), 1e-9);
}

TEST(RingRoadTest, IsAClosedCircleOfItsLength) {
  const Location begin = RingRoad::locationAt(0);
  const Location end = RingRoad::locationAt(RingRoad::kLength);
  EXPECT_NEAR(begin.x, end.x, 1e-6);
  EXPECT_NEAR(begin.y, end.y, 1e-6);
  const Location next = RingRoad::locationAt(10);
  EXPECT_NEAR(std::hypot(next.x - begin.x, next.y - begin.y), 10, 0.01);
}

TEST(DriveTest, NeverGoesBackNorFasterThanACarNorJumps) {
  Drive drive(1);
  double speed = drive.speed();
  double travelled = 0;
  for (int i = 0; i < 20'000; ++i) {
    drive.advance(milliseconds(500));
    ASSERT_GE(drive.speed(), 0);
    ASSERT_LT(drive.speed(), 60);
    ASSERT_LE(std::abs(drive.speed() - speed), 0.91);
    ASSERT_GE(drive.travelled(), travelled);
    ASSERT_LT(drive.distance(), RingRoad::kLength);
    speed = drive.speed();
    travelled = drive.travelled();
  }
  EXPECT_NEAR(drive.seconds(), 10'000, 1e-6);
  EXPECT_GT(travelled, 2 * RingRoad::kLength);
}

RadioLayerParameters oneMast() {
  return {.seed = 1,
          .frequency = 900,
          .power = 50,
          .shadowDeviation = 0,
          .fadingDeviation = 0,
          .sites = {0}};
}

TEST(RadioLayerTest, EveryMastHasThreeSectors) {
  auto parameters = oneMast();
  parameters.sites = {3, 5};
  const RadioLayer layer(parameters);
  ASSERT_EQ(layer.cells().size(), 6U);
  EXPECT_EQ(layer.cells()[0].site, 3U);
  EXPECT_EQ(layer.cells()[5].site, 5U);
  EXPECT_EQ(layer.cells()[5].sector, 2U);
}

TEST(RadioLayerTest, TheStrongestCellComesFirst) {
  const RadioLayer layer(oneMast());
  const auto levels = layer.levels(Drive(1));
  ASSERT_EQ(levels.size(), 3U);
  EXPECT_TRUE(std::ranges::is_sorted(levels, std::ranges::greater(), &CellLevel::level));
}

TEST(RadioLayerTest, TheLevelFollowsThePathLossModel) {
  // No sector radiates less than 20 dB below its main direction.
  const RadioLayer layer(oneMast());
  const Drive drive(1);
  for (const auto& cell : layer.levels(drive)) {
    const double pathLoss = 120.9 + 37.6 * std::log10(cell.distance / 1000);
    EXPECT_LE(cell.level, 50 - pathLoss + 1e-9);
    EXPECT_GE(cell.level, 50 - pathLoss - 20 - 1e-9);
  }
}

TEST(RadioLayerTest, AHigherFrequencyIsWeakerEverywhere) {
  auto high = oneMast();
  high.frequency = 1800;
  const Drive drive(1);
  const auto low = RadioLayer(oneMast()).levels(drive);
  const auto weaker = RadioLayer(high).levels(drive);
  for (std::size_t i = 0; i < low.size(); ++i) {
    EXPECT_NEAR(low[i].level - weaker[i].level, 21 * std::log10(2.0), 1e-9);
  }
}

TEST(PowerSumTest, TwoEqualSignalsAreThreeDecibelsMore) {
  PowerSum sum;
  sum.add(-80);
  EXPECT_NEAR(sum.level(), -80, 1e-9);
  sum.add(-80);
  EXPECT_NEAR(sum.level(), -80 + 10 * std::log10(2.0), 1e-9);
}

}  // namespace
}  // namespace kestro
