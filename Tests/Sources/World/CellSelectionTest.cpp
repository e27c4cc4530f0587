// SPDX-License-Identifier: MIT
// How the simulated phone chooses its cells.
#include <gtest/gtest.h>

#include <vector>

#include "Sources/World/CellSelection.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

std::vector<CellLevel> levels(std::initializer_list<std::pair<std::size_t, double>> cells) {
  std::vector<CellLevel> result;
  for (const auto& [cell, level] : cells) {
    result.push_back({.cell = cell, .level = level, .distance = 0});
  }
  return result;
}

class CellSelectionTest : public ::testing::Test {
 protected:
  bool look(std::initializer_list<std::pair<std::size_t, double>> cells) {
    return _selection.update(levels(cells), milliseconds(500));
  }

  CellSelection _selection{3, milliseconds(1'000)};
};

TEST_F(CellSelectionTest, TheFirstLookTakesTheStrongest) {
  EXPECT_TRUE(look({{4, -70}, {2, -71}}));
  EXPECT_EQ(_selection.serving(), 4U);
}

TEST_F(CellSelectionTest, AStrongerCellTakesOverAfterTheTimeToTrigger) {
  look({{4, -70}, {2, -71}});
  EXPECT_FALSE(look({{2, -70}, {4, -74}}));
  EXPECT_FALSE(look({{2, -70}, {4, -74}}));
  EXPECT_TRUE(look({{2, -70}, {4, -74}}));
  EXPECT_EQ(_selection.serving(), 2U);
}

TEST_F(CellSelectionTest, ABreakBelowTheHysteresisStartsTheTimeAnew) {
  look({{4, -70}, {2, -71}});
  look({{2, -70}, {4, -74}});
  look({{2, -70}, {4, -74}});
  EXPECT_FALSE(look({{2, -70}, {4, -73}}));
  EXPECT_FALSE(look({{2, -70}, {4, -74}}));
  EXPECT_FALSE(look({{2, -70}, {4, -74}}));
  EXPECT_EQ(_selection.serving(), 4U);
}

TEST_F(CellSelectionTest, AnotherCandidateStartsTheTimeAnew) {
  look({{4, -70}, {2, -71}, {1, -72}});
  look({{2, -60}, {1, -61}, {4, -74}});
  look({{2, -60}, {1, -61}, {4, -74}});
  EXPECT_FALSE(look({{1, -60}, {2, -61}, {4, -74}}));
  EXPECT_EQ(_selection.serving(), 4U);
}

TEST(SoftHandoverSetTest, CellsJoinNearTheStrongestAndLeaveFartherFromIt) {
  SoftHandoverSet set;
  set.update(levels({{1, -70}, {2, -73}, {3, -75}}));
  EXPECT_TRUE(set.contains(1) && set.contains(2));
  EXPECT_FALSE(set.contains(3));
  set.update(levels({{1, -70}, {2, -76}}));
  EXPECT_TRUE(set.contains(2));
  set.update(levels({{1, -70}, {2, -77}}));
  EXPECT_FALSE(set.contains(2));
  set.update(levels({{1, -70}, {2, -75}}));
  EXPECT_FALSE(set.contains(2));
}

TEST(SoftHandoverSetTest, HoldsThreeCellsAtMost) {
  SoftHandoverSet set;
  set.update(levels({{1, -70}, {2, -70}, {3, -70}, {4, -70}}));
  EXPECT_EQ(set.size(), 3U);
  EXPECT_FALSE(set.contains(4));
}

}  // namespace
}  // namespace kestro
