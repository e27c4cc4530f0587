// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <chrono>

#include "Platform/SourceTimes.h"

namespace kestro {
namespace {

using std::chrono::microseconds;

// 2012-03-04 12:05:09.000042 UTC is 1,330,862,709,000,042 us, 0x0004BA699F03C76A.
constexpr Moment kTime{microseconds(1'330'862'709'000'042)};
const Bytes kBytes = {0x6A, 0xC7, 0x03, 0x9F, 0x69, 0xBA, 0x04, 0x00};

TEST(SourceTimes, AreEightBytesTheLowestFirst) {
  const auto bytes = sourceTimeBytes(kTime);
  EXPECT_EQ(Bytes(bytes.begin(), bytes.end()), kBytes);
}

TEST(SourceTimes, BelongToTheLogDataThatFollows) {
  SourceTimes times;
  EXPECT_FALSE(times.isLogData(4, kBytes));
  EXPECT_EQ(times.time(), std::nullopt);
  EXPECT_TRUE(times.isLogData(0, {}));
  EXPECT_EQ(times.time(), kTime);
  EXPECT_TRUE(times.isLogData(0, {}));
  EXPECT_EQ(times.time(), std::nullopt);
}

TEST(SourceTimes, OtherMessagesAreNeitherTimesNorLogData) {
  SourceTimes times;
  EXPECT_FALSE(times.isLogData(4, kBytes));
  EXPECT_FALSE(times.isLogData(3, kBytes));
  EXPECT_TRUE(times.isLogData(0, {}));
  EXPECT_EQ(times.time(), kTime);
}

TEST(SourceTimes, OfAnotherLengthAreNone) {
  SourceTimes times;
  EXPECT_FALSE(times.isLogData(4, kBytes));
  EXPECT_FALSE(times.isLogData(4, Bytes(9)));
  EXPECT_TRUE(times.isLogData(0, {}));
  EXPECT_EQ(times.time(), std::nullopt);
}

TEST(SourceTimes, MayLieBeforeTheEpoch) {
  SourceTimes times;
  EXPECT_FALSE(times.isLogData(4, Bytes(8, 0xFF)));
  EXPECT_TRUE(times.isLogData(0, {}));
  EXPECT_EQ(times.time(), Moment(microseconds(-1)));
}

}  // namespace
}  // namespace kestro
