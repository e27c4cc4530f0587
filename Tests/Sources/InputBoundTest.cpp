// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "Sources/InputBound.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;

InputBound bound(std::string_view text) {
  const auto parsed = parseInputBound(text);
  EXPECT_TRUE(parsed.has_value()) << text;
  return parsed.value_or(InputBound());
}

/// 2019-11-21 15:38:36 UTC, worked out by `date -u -d @1574350716`.
constexpr Moment kMoment{1'574'350'716s};

TEST(InputBoundTest, ATimeWithoutZoneIsUtc) {
  EXPECT_EQ(bound("2019-11-21T15:38:36"), InputBound(kMoment));
  EXPECT_EQ(bound("2019-11-21 15:38:36"), InputBound(kMoment));
  EXPECT_EQ(bound("2019-11-21T15:38:36Z"), InputBound(kMoment));
}

TEST(InputBoundTest, AZoneCounts) {
  EXPECT_EQ(bound("2019-11-21T16:38:36+01:00"), InputBound(kMoment));
  EXPECT_EQ(bound("2019-11-21T12:08:36-03:30"), InputBound(kMoment));
}

TEST(InputBoundTest, ATimeMayBeMoreOrLessExact) {
  EXPECT_EQ(bound("2019-11-21T15:38:36.000250"), InputBound(kMoment + 250us));
  EXPECT_EQ(bound("2019-11-21T15:38:36.5Z"), InputBound(kMoment + 500ms));
  EXPECT_EQ(bound("2019-11-21T15:38"), InputBound(kMoment - 36s));
  EXPECT_EQ(bound("2019-11-21"), InputBound(kMoment - 36s - 38min - 15h));
  EXPECT_EQ(bound("1970-01-01"), InputBound(Moment()));
}

TEST(InputBoundTest, APlusCountsFromTheFirstMessage) {
  EXPECT_EQ(bound("+90s"), InputBound(90s));
  EXPECT_EQ(bound("+2m30s"), InputBound(150s));
  EXPECT_EQ(bound("+1h"), InputBound(3600s));
  EXPECT_EQ(bound("+1h1s"), InputBound(3601s));
  EXPECT_EQ(bound("+0.5s"), InputBound(500'000us));
  EXPECT_EQ(bound("+0s"), InputBound(0us));
}

TEST(InputBoundTest, ANumberIsAMessage) {
  EXPECT_EQ(bound("#1"), InputBound(MessageNumber{1}));
  EXPECT_EQ(bound("#18446744073709551615"), InputBound(MessageNumber{18'446'744'073'709'551'615U}));
}

TEST(InputBoundTest, AnythingElseIsRefused) {
  for (const std::string_view text : {"",
                                      " ",
                                      "now",
                                      "15:38",
                                      "2019",
                                      "2019-11",
                                      "2019-13-01",
                                      "2019-02-29",
                                      "2019-11-21T",
                                      "2019-11-21T24:00",
                                      "2019-11-21T15:60",
                                      "2019-11-21T15:38:60",
                                      "2019-11-21T15:38:36.",
                                      "2019-11-21T15:38:36.1234567",
                                      "2019-11-21T15:38:36 UTC",
                                      "2019-11-21T15:38:36+1",
                                      "2019-11-21Z",
                                      "2019-1-1",
                                      "-2019-11-21",
                                      "+",
                                      "+90",
                                      "+s",
                                      "+1s1m",
                                      "+1m1m",
                                      "+1.5m",
                                      "+-1s",
                                      "+1d",
                                      "+1000001s",
                                      "+1s ",
                                      "+9223372036854775808s",
                                      "-1s",
                                      "#",
                                      "#0",
                                      "#-1",
                                      "#1.5",
                                      "#18446744073709551616",
                                      "12"}) {
    EXPECT_FALSE(parseInputBound(text).has_value()) << text;
  }
  EXPECT_THAT(parseInputBound("soon").error().message,
              ::testing::StartsWith("\"soon\" is no time; the forms are 2019-11-21T15:38:36"));
}

}  // namespace
}  // namespace kestro
