// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "App/Toolkit/CellFrames.h"

namespace kestro {
namespace {

// A key of 80 x 18 and a value of 60 x 18 need 80 + 10 + 50 + 60 = 200.
constexpr QSizeF kKey(80, 18);
constexpr QSizeF kValue(60, 18);

TEST(CellFramesTest, AKeyAloneStandsTenFromTheLeftInTheMiddle) {
  EXPECT_EQ(keyOnlyFrame(QRectF(0, 0, 320, 50), kKey), QRectF(10, 16, 80, 18));
}

TEST(CellFramesTest, AKeyAloneFollowsTheAreasLeftEdge) {
  EXPECT_EQ(keyOnlyFrame(QRectF(5, 7, 320, 44), kKey), QRectF(15, 13, 80, 18));
}

TEST(CellFramesTest, AValueThatFitsIsFlushWithTheRightEdge) {
  const CellFrames frames = keyValueFrames(QRectF(0, 0, 201, 50), kKey, kValue);
  EXPECT_EQ(frames.key, QRectF(10, 16, 80, 18));
  EXPECT_EQ(frames.value, QRectF(141, 16, 60, 18));
  EXPECT_EQ(frames.contentSize, QSizeF(201, 50));
  EXPECT_EQ(frames.container, QRectF(0, 0, 201, 50));
}

TEST(CellFramesTest, AValueThatJustFitsFollowsTheKeyAndNothingScrolls) {
  const CellFrames frames = keyValueFrames(QRectF(0, 0, 200, 50), kKey, kValue);
  EXPECT_EQ(frames.value, QRectF(140, 16, 60, 18));
  EXPECT_EQ(frames.contentSize, QSizeF(200, 50));
}

TEST(CellFramesTest, AValueThatJustFitsFollowsTheKeyInAnAreaFurtherRight) {
  const CellFrames frames = keyValueFrames(QRectF(5, 0, 200, 50), kKey, kValue);
  EXPECT_EQ(frames.value, QRectF(145, 16, 60, 18));
  EXPECT_EQ(frames.contentSize, QSizeF(200, 50));
}

TEST(CellFramesTest, AValueThatDoesNotFitStandsBelowTheKey) {
  const CellFrames frames = keyValueFrames(QRectF(0, 0, 199, 50), kKey, kValue);
  EXPECT_EQ(frames.key, QRectF(10, 7, 80, 18));
  EXPECT_EQ(frames.value, QRectF(10, 25, 60, 18));
  EXPECT_EQ(frames.contentSize, QSizeF(199, 50));
  EXPECT_EQ(frames.container, QRectF(0, 0, 199, 50));
}

TEST(CellFramesTest, WhatIsWiderThanTheAreaEvenSoIsScrolledTo) {
  const CellFrames frames = keyValueFrames(QRectF(0, 0, 100, 50), kKey, QSizeF(91, 18));
  EXPECT_EQ(frames.contentSize, QSizeF(10 + 91 + 10, 50));
  EXPECT_EQ(keyValueFrames(QRectF(0, 0, 101, 50), kKey, QSizeF(91, 18)).contentSize,
            QSizeF(101, 50));
}

TEST(CellFramesTest, TwoLinesStandInTheMiddleOfATallRow) {
  const CellFrames frames = keyValueFrames(QRectF(0, 0, 100, 78), kKey, kValue);
  EXPECT_EQ(frames.key.top(), (78 - 36) / 2);
  EXPECT_EQ(frames.value.bottom(), 78 - (78 - 36) / 2);
}

TEST(CellFramesTest, TheContainerIsFiftyHighWhateverTheArea) {
  const CellFrames frames = keyValueFrames(QRectF(5, 7, 300, 44), kKey, kValue);
  EXPECT_EQ(frames.container, QRectF(5, 7, 300, 50));
  EXPECT_EQ(frames.contentSize, QSizeF(300, 50));
  EXPECT_EQ(frames.key, QRectF(15, 13, 80, 18));
  EXPECT_EQ(frames.value, QRectF(240, 13, 60, 18));
}

TEST(CellFramesTest, AValueBelowItsKeyFollowsTheAreasLeftEdge) {
  const CellFrames frames = keyValueFrames(QRectF(5, 0, 100, 50), kKey, kValue);
  EXPECT_EQ(frames.value.left(), 5 + 10);
}

}  // namespace
}  // namespace kestro
