// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "CommandLine/Formats/StyledLine.h"

namespace kestro {
namespace {

using Piece = StyledLine::Piece;
using ::testing::ElementsAre;

StyledLine keyAndValue() {
  return StyledLine().append("Key", TextStyle::Key).append("  ").append("value");
}

TEST(StyledLine, NeighboursOfOneStyleJoin) {
  EXPECT_THAT(keyAndValue().pieces(),
              ElementsAre(Piece{"Key", TextStyle::Key}, Piece{"  value", TextStyle::Plain}));
}

TEST(StyledLine, PaddingReachesTheWidthInCells) {
  StyledLine line;
  line.append("東").padTo(4);
  EXPECT_EQ(line.width(), 4U);
  EXPECT_EQ(line.pieces()[0].text, "東  ");
}

TEST(StyledLine, PaddingLeavesAWiderLineAlone) {
  StyledLine line;
  line.append("12345").padTo(3);
  EXPECT_EQ(line.width(), 5U);
}

TEST(StyledLine, FittingCutsWithinAPiece) {
  EXPECT_EQ(keyAndValue().fitted(8).plainText(), "Key  va…");
  EXPECT_EQ(keyAndValue().fitted(10).plainText(), "Key  value");
}

TEST(StyledLine, FittingCutsAtTheEndOfAPiece) {
  EXPECT_EQ(keyAndValue().fitted(3).plainText(), "Ke…");
  EXPECT_EQ(keyAndValue().fitted(0).plainText(), "");
}

TEST(StyledLine, PlainTextHasNoBlanksAtItsEnd) {
  EXPECT_EQ(StyledLine().append("a").padTo(9).plainText(), "a");
}

TEST(StyledLine, TerminalTextResetsEveryStyle) {
  EXPECT_EQ(keyAndValue().terminalText(true), "\033[1mKey\033[0m  value");
  EXPECT_EQ(StyledLine().append("1", TextStyle::Changed).terminalText(true), "\033[7m1\033[0m");
}

TEST(StyledLine, WithoutColourSectionsAreOnlyBold) {
  const StyledLine line = StyledLine().append("Cell", TextStyle::Section);
  EXPECT_EQ(line.terminalText(true), "\033[1;36mCell\033[0m");
  EXPECT_EQ(line.terminalText(false), "\033[1mCell\033[0m");
}

}  // namespace
}  // namespace kestro
