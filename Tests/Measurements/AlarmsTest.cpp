// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "Measurements/Alarms.h"
#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

TEST(AlarmsTest, NoMoreThanTheMostSeriesAreWatched) {
  SeriesTable table;
  const SeriesGroup* group = table.group({.technology = "LTE", .section = "List", .key = "Level"});
  std::size_t told = 0;
  // Two rules mean each series.
  Alarms alarms(*parseRules("Level < 0\nList/Level < 0", "rules"), [&](const Event&) { ++told; });
  std::vector<Series> series(Alarms::kMaximumWatched / 2 + 1);
  for (Series& one : series) {
    one.group = group;
    const MeasuredValue value{.series = &one, .number = -1};
    alarms.take(
        {.technology = kTqLogChannelTechnology_Ondrel_LTE, .measured = {.values = {&value, 1}}});
  }
  EXPECT_EQ(told, Alarms::kMaximumWatched);
  EXPECT_EQ(alarms.notWatchedCount(), 2u);
}

}  // namespace
}  // namespace kestro
