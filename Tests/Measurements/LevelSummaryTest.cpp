// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <initializer_list>

#include "Measurements/LevelSummary.h"

namespace kestro {
namespace {

LevelSummary summaryOf(std::initializer_list<double> values) {
  LevelSummary summary;
  for (const double value : values) summary.add(value);
  return summary;
}

TEST(LevelSummaryTest, KeepsLastLeastAndGreatest) {
  const LevelSummary summary = summaryOf({-90, -110.25, -85.5, -99});
  EXPECT_EQ(summary.count(), 4u);
  EXPECT_EQ(summary.last(), -99);
  EXPECT_EQ(summary.least(), -110.25);
  EXPECT_EQ(summary.greatest(), -85.5);
}

TEST(LevelSummaryTest, MedianIsTheValueInTheMiddle) {
  EXPECT_EQ(summaryOf({3, 1, 2}).median(), 2);
  EXPECT_EQ(summaryOf({5}).median(), 5);
  EXPECT_EQ(summaryOf({1, 9, 9, 9, 2}).median(), 9);
}

TEST(LevelSummaryTest, MedianOfAnEvenCountIsTheLowerOfTheTwo) {
  EXPECT_EQ(summaryOf({4, 1, 3, 2}).median(), 2);
}

TEST(LevelSummaryTest, MedianIsExactUpToTheMostDistinctValues) {
  LevelSummary summary;
  for (int i = 0; i < 256; ++i)
    summary.add(-120 + 0.25 * (i * 37 % 256));  // 37 is odd: all of them
  EXPECT_EQ(summary.median(), -120 + 0.25 * 127);
  EXPECT_EQ(summary.medianError(), 0);
}

TEST(LevelSummaryTest, MedianOfMoreDistinctValuesIsOffByHalfAStepAtMost) {
  LevelSummary summary;
  for (int i = 0; i < 1'001; ++i)
    summary.add(-140.125 + 0.125 * (i * 10 % 1'001));  // to -15: 1/2 dB
  EXPECT_NEAR(summary.median(), -140.125 + 0.125 * 500, 0.25);
  EXPECT_EQ(summary.medianError(), 0.25);
  EXPECT_EQ(summary.least(), -140.125);
  EXPECT_EQ(summary.greatest(), -15.125);
}

TEST(LevelSummaryTest, ValuesOfAnySizeAreTaken) {
  LevelSummary summary;
  for (int i = 0; i < 2'000; ++i) summary.add((i % 2 == 0 ? 1e300 : -1e300) / (i + 1));
  EXPECT_EQ(summary.count(), 2'000u);
  EXPECT_EQ(summary.greatest(), 1e300);
}

}  // namespace
}  // namespace kestro
