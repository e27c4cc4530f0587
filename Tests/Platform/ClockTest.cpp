// SPDX-License-Identifier: MIT
// Date texts in zones of every kind.
#include <gtest/gtest.h>

#include "Platform/Clock.h"

namespace kestro {
namespace {

using namespace std::chrono;

class FixedZoneClock final : public Clock {
 public:
  explicit FixedZoneClock(seconds offset) : _offset(offset) {}
  [[nodiscard]] Moment now() const override { return {}; }
  [[nodiscard]] seconds timeZoneOffset(Moment /*moment*/) const override { return _offset; }
  [[nodiscard]] bool isDaylightSaving(Moment /*moment*/) const override { return false; }

 private:
  seconds _offset;
};

/// 2012-03-04 12:05:09 UTC.
constexpr Moment kMoment = sys_days(2012y / March / 4) + 12h + 5min + 9s;

std::string dateTextIn(seconds offset, Moment moment = kMoment) {
  return dateText(FixedZoneClock(offset), moment);
}

TEST(ClockTest, DateTextsAreLocalTimeWithTheZonesOffset) {
  EXPECT_EQ(dateTextIn(1h), "2012-03-04 13:05:09 +0100");
  EXPECT_EQ(dateTextIn(0s), "2012-03-04 12:05:09 +0000");
  EXPECT_EQ(dateTextIn(5h + 45min), "2012-03-04 17:50:09 +0545");
  EXPECT_EQ(dateTextIn(-(3h + 30min)), "2012-03-04 08:35:09 -0330");
  EXPECT_EQ(dateTextIn(-30min), "2012-03-04 11:35:09 -0030");
}

TEST(ClockTest, TheZoneMovesTheDateToo) {
  EXPECT_EQ(dateTextIn(14h), "2012-03-05 02:05:09 +1400");
  EXPECT_EQ(dateTextIn(-12h, Moment(1s)), "1969-12-31 12:00:01 -1200");
}

TEST(ClockTest, FractionsOfASecondAreCutOff) {
  EXPECT_EQ(dateTextIn(0s, kMoment + 999'999us), "2012-03-04 12:05:09 +0000");
  EXPECT_EQ(dateTextIn(0s, Moment(-1us)), "1969-12-31 23:59:59 +0000");
}

TEST(ClockTest, UpdatedTextIsTheStatusLine) {
  EXPECT_EQ(updatedText(FixedZoneClock(1h), kMoment), "Updated 2012-03-04 at 13:05:09");
}

}  // namespace
}  // namespace kestro
