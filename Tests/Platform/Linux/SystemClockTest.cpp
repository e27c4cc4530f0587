// SPDX-License-Identifier: MIT
// The system's clock, in zones given as rules (which need no zone files).
#include <gtest/gtest.h>

#include "Platform/Clock.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Tests/Support/ScopedEnvironment.h"

namespace kestro {
namespace {

using namespace std::chrono;
using testing::ScopedEnvironment;

/// Central European time: daylight saving from the last Sunday of March to that of October.
constexpr const char* kCentralEurope = "CET-1CEST,M3.5.0,M10.5.0/3";
/// Newfoundland: half an hour off, west.
constexpr const char* kNewfoundland = "NST3:30NDT,M3.2.0,M11.1.0";

constexpr Moment kWinter = sys_days(2012y / January / 15) + 12h;
constexpr Moment kSummer = sys_days(2012y / July / 15) + 12h;

class SystemClockTest : public ::testing::Test {
 protected:
  std::unique_ptr<Clock> clock = createSystemClock();
};

TEST_F(SystemClockTest, OffsetsFollowDaylightSaving) {
  const ScopedEnvironment zone("TZ", kCentralEurope);
  EXPECT_EQ(clock->timeZoneOffset(kWinter), 1h);
  EXPECT_FALSE(clock->isDaylightSaving(kWinter));
  EXPECT_EQ(clock->timeZoneOffset(kSummer), 2h);
  EXPECT_TRUE(clock->isDaylightSaving(kSummer));
}

TEST_F(SystemClockTest, OffsetsWestOfGreenwichAreNegative) {
  const ScopedEnvironment zone("TZ", kNewfoundland);
  EXPECT_EQ(clock->timeZoneOffset(kWinter), -(3h + 30min));
}

TEST_F(SystemClockTest, ZonesWithoutDaylightSavingHaveNone) {
  const ScopedEnvironment zone("TZ", "UTC0");
  EXPECT_EQ(clock->timeZoneOffset(kSummer), 0s);
  EXPECT_FALSE(clock->isDaylightSaving(kSummer));
}

TEST_F(SystemClockTest, NowIsTheSystemsTime) {
  const auto before = floor<microseconds>(system_clock::now());
  const Moment now = clock->now();
  EXPECT_LE(before, now);
  EXPECT_LE(now, system_clock::now());
}

}  // namespace
}  // namespace kestro
