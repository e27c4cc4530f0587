// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "Measurements/Track.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;

constexpr Moment kTrackStart{1'700'000'000s};

Coordinates place(double latitude, double longitude) {
  return {.latitude = latitude, .longitude = longitude};
}

TEST(TrackTest, BetweenTwoFixesThePositionIsOnTheLine) {
  const Track track({{kTrackStart, place(50, 8)}, {kTrackStart + 4s, place(54, 6)}});
  EXPECT_EQ(track.at(kTrackStart + 1s), place(51, 7.5));
  EXPECT_EQ(track.at(kTrackStart), place(50, 8));
  EXPECT_EQ(track.at(kTrackStart + 4s), place(54, 6));
}

TEST(TrackTest, BeforeTheFirstAndAfterTheLastFixNothingIsKnown) {
  const Track track({{kTrackStart, place(50, 8)}, {kTrackStart + 4s, place(54, 6)}});
  EXPECT_EQ(track.at(kTrackStart - 1us), std::nullopt);
  EXPECT_EQ(track.at(kTrackStart + 4s + 1us), std::nullopt);
  EXPECT_EQ(Track().at(kTrackStart), std::nullopt);
}

TEST(TrackTest, InAGapOfTenSecondsNothingIsKnown) {
  const Track track({{kTrackStart, place(50, 8)}, {kTrackStart + 10s, place(54, 6)}});
  EXPECT_EQ(track.at(kTrackStart + 5s), std::nullopt);
  EXPECT_EQ(track.at(kTrackStart + 10s), place(54, 6));
  const Track closer({{kTrackStart, place(50, 8)}, {kTrackStart + 10s - 2us, place(54, 6)}});
  EXPECT_EQ(closer.at(kTrackStart + 5s - 1us), place(52, 7));
}

TEST(TrackTest, FixesComeInAnyOrder) {
  const Track track(
      {{kTrackStart + 4s, place(54, 6)}, {kTrackStart, place(50, 8)}, {kTrackStart, place(0, 0)}});
  EXPECT_EQ(track.at(kTrackStart + 1s), place(51, 7.5));
  EXPECT_EQ(track.fixes().size(), 2u);
}

TEST(TrackTest, TheDateLineIsCrossedTheShortWay) {
  const Track east({{kTrackStart, place(0, 179)}, {kTrackStart + 4s, place(0, -179)}});
  EXPECT_EQ(east.at(kTrackStart + 1s), place(0, 179.5));
  EXPECT_EQ(east.at(kTrackStart + 3s), place(0, -179.5));
  const Track west({{kTrackStart, place(0, -179)}, {kTrackStart + 4s, place(0, 179)}});
  EXPECT_EQ(west.at(kTrackStart + 3s), place(0, 179.5));
}

}  // namespace
}  // namespace kestro
