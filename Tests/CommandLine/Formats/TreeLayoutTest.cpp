// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

#include "CommandLine/Formats/TreeLayout.h"
#include "Tests/CommandLine/Formats/DisplayTrees.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using testing::screenOf;
using testing::textsInStyle;
using testing::treeOf;

/// All blocks below each other, "--" between them.
std::string layout(const Value& display, std::size_t width = kUnlimitedWidth) {
  std::string result;
  for (const LineBlock& block : layoutTree(*treeOf(display), nullptr, width)) {
    result += (result.empty() ? "" : "--\n") + screenOf(block);
  }
  return result;
}

std::vector<std::string> changed(const Value& before, const Value& now) {
  std::vector<std::string> result;
  const NodePointer previous = treeOf(before);
  for (const LineBlock& block : layoutTree(*treeOf(now), previous.get())) {
    std::ranges::copy(textsInStyle(block, TextStyle::Changed), std::back_inserter(result));
  }
  return result;
}

TEST(TreeLayout, ValuesOfASectionStandInAColumn) {
  EXPECT_EQ(layout(Dictionary{{"Cell", Dictionary{{"ARFCN", "62"}, {"RxLev", "-71 dBm"}}}}),
            "Cell\n"
            "  ARFCN  62\n"
            "  RxLev  -71 dBm\n");
}

TEST(TreeLayout, SectionsAndRunsOfValuesAreBlocks) {
  EXPECT_EQ(
      layout(Dictionary{
          {"Mode", "Idle"}, {"Band", "3"}, {"Cell", Dictionary{{"ID", "1"}}}, {"End", "yes"}}),
      "Mode  Idle\n"
      "Band  3\n"
      "--\n"
      "Cell\n"
      "  ID  1\n"
      "--\n"
      "End   yes\n");
}

TEST(TreeLayout, SectionsInSectionsIndentFurther) {
  EXPECT_EQ(layout(Dictionary{{"A", Dictionary{{"B", Dictionary{{"k", "v"}}}, {"k", "v"}}}}),
            "A\n"
            "  B\n"
            "    k  v\n"
            "  k  v\n");
}

TEST(TreeLayout, AnEmptySectionSaysSo) {
  EXPECT_EQ(layout(Dictionary{{"A", Array()}}), "A  (empty)\n");
}

TEST(TreeLayout, ADisplayWithoutSectionsIsItsText) { EXPECT_EQ(layout("(text)"), "(text)\n"); }

TEST(TreeLayout, ALongKeyDoesNotPushTheOtherValuesAside) {
  EXPECT_EQ(layout(Dictionary{{"Key that is longer than half", "1"}, {"Short", "2"}}, 40),
            "Key that is longer than half  1\n"
            "Short  2\n");
}

TEST(TreeLayout, LinesWiderThanTheWidthAreCut) {
  EXPECT_EQ(layout(Dictionary{{"Key", "0123456789"}}, 10), "Key  0123…\n");
}

TEST(TreeLayout, WideCharactersKeepTheColumn) {
  EXPECT_EQ(layout(Dictionary{{"東京", "a"}, {"Key", "b"}}),
            "東京  a\n"
            "Key   b\n");
}

TEST(TreeLayout, ControlCharactersInKeysAndValuesAreNeutralised) {
  EXPECT_EQ(layout(Dictionary{{"\033[2J", "a\nb"}}), "␛[2J  a␊b\n");
}

TEST(TreeLayout, AnArrayOfTextsIsNumbered) {
  EXPECT_EQ(layout(Dictionary{{"Cells", Array{"a", "b"}}}),
            "Cells\n"
            "  0  a\n"
            "  1  b\n");
}

TEST(TreeLayout, AnArrayOfRowsIsATable) {
  EXPECT_EQ(
      layout(Dictionary{
          {"Cells", Array{Dictionary{{"ARFCN", "62"}, {"Name", "b"}},
                          Dictionary{{"ARFCN", "1024"}, {"Name", "long"}, {"RxLev", "-7"}}}}}),
      "Cells\n"
      "  #  ARFCN  Name  RxLev\n"
      "  0     62  b\n"
      "  1   1024  long     -7\n");
}

TEST(TreeLayout, ATableThatIsTooWideIsAList) {
  const Value display{Dictionary{{"C", Array{Dictionary{{"Key A", "1"}, {"Key B", "2"}}}}}};
  EXPECT_EQ(layout(display, 17),
            "C\n"
            "  #  Key A  Key B\n"
            "  0      1      2\n");
  EXPECT_EQ(layout(display, 16),
            "C\n"
            "  0\n"
            "    Key A  1\n"
            "    Key B  2\n");
}

TEST(TreeLayout, RowsThatHoldSectionsAreAList) {
  EXPECT_EQ(layout(Dictionary{{"C", Array{Dictionary{{"k", Array{"x"}}}}}}),
            "C\n"
            "  0\n"
            "    k\n"
            "      0  x\n");
}

TEST(TreeLayout, ARowWithOneNameTwiceLosesNothing) {
  const Dictionary row{{"_sorted", "yes"}, {"01;A", "x"}, {"02;A", "y"}};
  EXPECT_EQ(layout(Dictionary{{"C", Array{row}}}),
            "C\n"
            "  0\n"
            "    A  x\n"
            "    A  y\n");
}

TEST(TreeLayout, RowsOfMoreNamesThanATableShowsAreAList) {
  Dictionary row;
  for (int i = 0; i < 65; ++i) row.set("k" + std::to_string(i), "v");
  EXPECT_TRUE(layout(Dictionary{{"C", Array{row}}}).starts_with("C\n  0\n    k0   v\n"));
}

TEST(TreeLayout, WithoutAPreviousTreeNothingIsChanged) {
  const auto blocks = layoutTree(*treeOf(Dictionary{{"a", "1"}}), nullptr);
  EXPECT_THAT(textsInStyle(blocks[0], TextStyle::Changed), IsEmpty());
}

TEST(TreeLayout, ValuesThatDifferOrAreNewAreChanged) {
  EXPECT_THAT(
      changed(Dictionary{{"a", "1"}, {"b", "2"}}, Dictionary{{"new", "0"}, {"a", "1"}, {"b", "3"}}),
      ElementsAre("0", "3"));
}

TEST(TreeLayout, ValuesAreComparedAtTheirOwnPath) {
  EXPECT_THAT(changed(Dictionary{{"A", Dictionary{{"k", "1"}}}, {"B", Dictionary{{"k", "2"}}}},
                      Dictionary{{"A", Dictionary{{"k", "2"}}}, {"B", Dictionary{{"k", "2"}}}}),
              ElementsAre("2"));
}

TEST(TreeLayout, AValueThatWasASectionIsChanged) {
  EXPECT_THAT(changed(Dictionary{{"a", Array()}}, Dictionary{{"a", "1"}}), ElementsAre("1"));
}

TEST(TreeLayout, CellsOfATableAreComparedByRow) {
  EXPECT_THAT(changed(Dictionary{{"C", Array{Dictionary{{"k", "1"}}, Dictionary{{"k", "2"}}}}},
                      Dictionary{{"C", Array{Dictionary{{"k", "1"}}, Dictionary{{"k", "9"}}}}}),
              ElementsAre("9"));
}

}  // namespace
}  // namespace kestro
