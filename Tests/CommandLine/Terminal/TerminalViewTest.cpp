// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "CommandLine/Terminal/TerminalView.h"
#include "Tests/CommandLine/Formats/DisplayTrees.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using testing::screenOf;
using ::testing::SizeIs;
using ::testing::StartsWith;
using testing::textsInStyle;
using testing::treeOf;

constexpr const char* kUpdated = "Updated 2012-03-04 at 13:05:09";

std::vector<StyledLine> view(const NodePointer& tree, TerminalSize size,
                             const NodePointer& previous = nullptr) {
  return terminalView({.status = kUpdated, .tree = tree.get(), .previous = previous.get()}, size);
}

Dictionary section(int values) {
  Dictionary result;
  for (int i = 1; i <= values; ++i) result.set("k" + std::to_string(i), std::to_string(i));
  return result;
}

TEST(TerminalView, BeforeTheFirstDataThereIsTheTitleLineAlone) {
  EXPECT_EQ(screenOf(terminalView({.status = "Connecting..."}, {30, 5})),
            " Kestro         Connecting...\n");
}

TEST(TerminalView, TheTitleLineFillsTheWidth) {
  const auto lines = terminalView({.status = "Connecting..."}, {30, 5});
  ASSERT_THAT(lines, SizeIs(1));
  EXPECT_EQ(lines[0].width(), 30U);
  EXPECT_THAT(textsInStyle(lines, TextStyle::Bar), ElementsAre(" Kestro         Connecting... "));
}

TEST(TerminalView, SectionsStandApartWhereThereIsRoom) {
  const NodePointer tree = treeOf(
      Dictionary{{"Serving Cell", Dictionary{{"ARFCN", "62"}, {"RxLev", "-71 dBm"}}},
                 {"Neighbour Cells", Array{Dictionary{{"ARFCN", "62"}, {"RxLev", "-80"}},
                                           Dictionary{{"ARFCN", "1018"}, {"RxLev", "-101"}}}}});
  EXPECT_EQ(screenOf(view(tree, {50, 10})),
            " Kestro            Updated 2012-03-04 at 13:05:09\n"
            "Serving Cell\n"
            "  ARFCN  62\n"
            "  RxLev  -71 dBm\n"
            "\n"
            "Neighbour Cells\n"
            "  #  ARFCN  RxLev\n"
            "  0     62    -80\n"
            "  1   1018   -101\n");
}

TEST(TerminalView, AWideWindowTakesTwoColumns) {
  const NodePointer tree = treeOf(Dictionary{{"A", section(2)}, {"B", section(2)}});
  EXPECT_EQ(screenOf(view(tree, {79, 5})),
            " Kestro                                         Updated 2012-03-04 at 13:05:09\n"
            "A                                      │ B\n"
            "  k1  1                                │   k1  1\n"
            "  k2  2                                │   k2  2\n");
}

TEST(TerminalView, OneCellLessThanTwoColumnsNeedIsOneColumn) {
  const NodePointer tree = treeOf(Dictionary{{"A", section(2)}, {"B", section(1)}});
  EXPECT_EQ(screenOf(view(tree, {78, 6})),
            " Kestro                                        Updated 2012-03-04 at 13:05:09\n"
            "A\n"
            "  k1  1\n"
            "  k2  2\n"
            "B\n"
            "  k1  1\n");
}

TEST(TerminalView, ABlockTallerThanAColumnGoesOnInTheNext) {
  const NodePointer tree = treeOf(Dictionary{{"A", section(4)}});
  EXPECT_EQ(screenOf(view(tree, {79, 4})),
            " Kestro                                         Updated 2012-03-04 at 13:05:09\n"
            "A                                      │   k3  3\n"
            "  k1  1                                │   k4  4\n"
            "  k2  2                                │\n");
}

TEST(TerminalView, WhatHasNoRoomIsCounted) {
  EXPECT_EQ(screenOf(view(treeOf(Dictionary{{"A", section(9)}}), {40, 5})),
            " Kestro  Updated 2012-03-04 at 13:05:09\n"
            "A\n"
            "  k1  1\n"
            "  k2  2\n"
            "… 7 more lines\n");
}

TEST(TerminalView, ATreeThatJustFitsIsNotCut) {
  EXPECT_EQ(screenOf(view(treeOf(Dictionary{{"A", section(3)}}), {40, 5})),
            " Kestro  Updated 2012-03-04 at 13:05:09\n"
            "A\n"
            "  k1  1\n"
            "  k2  2\n"
            "  k3  3\n");
}

TEST(TerminalView, ANarrowWindowShowsTheStatusRatherThanTheTitle) {
  EXPECT_EQ(screenOf(terminalView({.status = "Connecting..."}, {20, 1})), "      Connecting...\n");
  EXPECT_EQ(screenOf(terminalView({.status = "Connecting..."}, {10, 1})), "Connectin…\n");
}

TEST(TerminalView, LongValuesAreCutAtTheWindow) {
  EXPECT_EQ(
      screenOf(view(treeOf(Dictionary{{"Key", "0123456789abcdefghijklmnopqrstuvw"}}), {33, 3})),
      "  Updated 2012-03-04 at 13:05:09\n"
      "Key  0123456789abcdefghijklmnopq…\n");
}

TEST(TerminalView, ChangedValuesAreMarked) {
  const auto lines = view(treeOf(Dictionary{{"a", "1"}, {"b", "3"}}), {80, 24},
                          treeOf(Dictionary{{"a", "1"}, {"b", "2"}}));
  EXPECT_THAT(textsInStyle(lines, TextStyle::Changed), ElementsAre("3"));
}

TEST(TerminalView, NoWindowIsTooSmall) {
  const NodePointer tree = treeOf(
      Dictionary{{"Section", section(3)}, {"東京", Array{Dictionary{{"東", "京"}}}}, {"v", "x"}});
  for (std::size_t columns = 0; columns <= 90; ++columns) {
    for (std::size_t rows = 0; rows <= 12; ++rows) {
      const auto lines = view(tree, {columns, rows});
      ASSERT_LE(lines.size(), rows);
      for (const StyledLine& line : lines) ASSERT_LE(line.width(), columns);
    }
  }
}

TEST(TerminalView, TheTitleSaysAsMuchOfTheOriginAsFits) {
  const auto title = [](std::size_t columns) {
    const auto lines = terminalView(
        {.technology = "LTE", .source = "capture a.pcap", .place = "Server", .status = kUpdated},
        {columns, 1});
    const std::string text = lines[0].plainText();
    return text.substr(0, text.find("  Updated"));
  };
  EXPECT_THAT(title(80), StartsWith(" Kestro · LTE · capture a.pcap · Server "));
  EXPECT_EQ(title(72), " Kestro · LTE · capture a.pcap · Server");
  EXPECT_EQ(title(71), " Kestro · LTE · capture a.pcap        ");
  EXPECT_EQ(title(63), " Kestro · LTE · capture a.pcap");
  EXPECT_EQ(title(54), " LTE · capture a.pcap");
  EXPECT_EQ(title(46), " Kestro · LTE");
  EXPECT_EQ(title(40), " Kestro");
  EXPECT_EQ(title(39), "      ");
}

TEST(TerminalView, ANoticeStandsAboveTheTreeInWholeWords) {
  const NodePointer tree = treeOf(Dictionary{{"a", "1"}});
  EXPECT_EQ(screenOf(terminalView({.status = "Connecting...",
                                   .notice = "no server is there: start one",
                                   .tree = tree.get()},
                                  {24, 6})),
            " Kestro   Connecting...\n"
            " no server is there:\n"
            " start one\n"
            "a  1\n");
}

TEST(TerminalView, ValuesThatAreNotRenewedAreFaint) {
  const NodePointer tree = treeOf(Dictionary{{"S", Dictionary{{"a", "1"}, {"b", "2"}}}});
  const NodePointer before = treeOf(Dictionary{{"S", Dictionary{{"a", "1"}, {"b", "1"}}}});
  const auto lines = terminalView(
      {.status = kUpdated, .tree = tree.get(), .previous = before.get(), .isRenewed = false},
      {80, 24});
  EXPECT_THAT(textsInStyle(lines, TextStyle::Faint), ElementsAre("S", "  a  1", "  b  2"));
  EXPECT_THAT(textsInStyle(lines, TextStyle::Changed), IsEmpty());
}

}  // namespace
}  // namespace kestro
