// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Recordings/PositionComment.h"

namespace kestro {
namespace {

TEST(PositionCommentTest, HoldsTheNumbersAsTheyWereWritten) {
  EXPECT_EQ(positionComment("51.887630", "-8.460065", "12"),
            "position: 51.887630, -8.460065; 12 km/h");
  EXPECT_EQ(positionComment("1", "2", ""), "position: 1, 2");
}

TEST(PositionCommentTest, IsReadBack) {
  EXPECT_EQ(positionOfComment("position: 51.88763, -8.460065; 12.5 km/h"),
            (Position{.latitude = 51.88763, .longitude = -8.460065, .speed = 12.5}));
  EXPECT_EQ(positionOfComment("position: -90, 180"), (Position{.latitude = -90, .longitude = 180}));
}

TEST(PositionCommentTest, OtherCommentsAreNone) {
  for (const auto* comment :
       {"", "position", "position: ", "position: 1", "position: 1,2", "position: 1, ",
        "position: 91, 0", "position: 0, -180.5", "position: nan, 0", "position: 0, inf",
        "position: 1, 2; 3", "position: 1, 2; km/h", "position: 1, 2 and more",
        "position: 1, 2; 3 km/h or so", "Position: 1, 2", " position: 1, 2"}) {
    EXPECT_FALSE(positionOfComment(comment)) << comment;
  }
}

TEST(PositionCommentTest, TheFirstPositionCounts) {
  const std::vector<std::string> comments = {"tunnel", "position: 1, 2", "position: 3, 4"};
  EXPECT_EQ(positionAmong(comments), (Position{.latitude = 1, .longitude = 2}));
  EXPECT_FALSE(positionAmong(std::vector<std::string>{"tunnel"}));
}

}  // namespace
}  // namespace kestro
