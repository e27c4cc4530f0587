// SPDX-License-Identifier: MIT
// The time of recordings whose clock was set.
#include <gtest/gtest.h>

#include "Sources/RecordedTimeline.h"

namespace kestro {
namespace {

using std::chrono::hours;
using std::chrono::microseconds;
using std::chrono::seconds;

TEST(RecordedTimelineTest, BeginsAtZeroAndKeepsThePauses) {
  RecordedTimeline timeline;
  EXPECT_EQ(timeline.advanceTo(Moment(seconds(1000))), seconds(0));
  EXPECT_EQ(timeline.advanceTo(Moment(seconds(1000))), seconds(0));
  EXPECT_EQ(timeline.advanceTo(Moment(microseconds(1'000'000'007))), microseconds(7));
  EXPECT_EQ(timeline.advanceTo(Moment(seconds(1003))), seconds(3));
}

TEST(RecordedTimelineTest, AClockSetBackCostsNoTime) {
  RecordedTimeline timeline;
  static_cast<void>(timeline.advanceTo(Moment(seconds(1000))));
  EXPECT_EQ(timeline.advanceTo(Moment(seconds(400))), seconds(0));
  EXPECT_EQ(timeline.advanceTo(Moment(seconds(402))), seconds(2));
}

TEST(RecordedTimelineTest, AClockSetForwardByMoreThanADayCostsNoTime) {
  RecordedTimeline timeline;
  static_cast<void>(timeline.advanceTo(Moment(seconds(0))));
  EXPECT_EQ(timeline.advanceTo(Moment(hours(24))), hours(24));
  EXPECT_EQ(timeline.advanceTo(Moment(hours(49))), hours(24));
  EXPECT_EQ(timeline.advanceTo(Moment(hours(50))), hours(25));
}

}  // namespace
}  // namespace kestro
