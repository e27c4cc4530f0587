// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <string>

#include "Options/HelpText.h"

namespace kestro {
namespace {

TEST(HelpTextTest, AValueIsShownWithItsDefault) {
  std::string name = "Server";
  double seconds = 2;
  double speed = 0.5;
  std::uint64_t count = 0;
  LogPriority priority = LogPriority::Notice;
  EXPECT_EQ(valueText({.name = "--name", .value = "NAME", .target = &name}),
            "NAME (default: Server)");
  EXPECT_EQ(valueText({.name = "--for", .value = "SECONDS", .target = &seconds}),
            "SECONDS (default: 2)");
  EXPECT_EQ(valueText({.name = "--speed", .value = "X", .target = &speed}), "X (default: 0.5)");
  EXPECT_EQ(valueText({.name = "--count", .value = "N", .target = &count}), "N (default: 0)");
  EXPECT_EQ(valueText({.name = "--priority", .value = "N", .target = &priority}), "N (default: 5)");
}

TEST(HelpTextTest, WhatHoldsNothingHasNoDefault) {
  std::string file;
  std::optional<std::uint64_t> count;
  EXPECT_EQ(valueText({.name = "--file", .value = "FILE", .target = &file}), "FILE");
  EXPECT_EQ(valueText({.name = "--count", .value = "N", .target = &count}), "N");
}

TEST(HelpTextTest, AValueThatMayBeMissingStandsInBrackets) {
  std::string source;
  EXPECT_EQ(
      valueText(
          {.name = "--demo", .value = "SOURCE", .target = &source, .impliedValue = "simulation"}),
      "[=SOURCE] (default: simulation)");
  EXPECT_EQ(
      valueText({.name = "--description", .value = "TEXT", .target = &source, .impliedValue = ""}),
      "TEXT");
}

TEST(HelpTextTest, ChoicesAreTheValueUnlessItHasAName) {
  std::string format = "tree";
  OptionRow row{.name = "--format",
                .target = &format,
                .choices = {{"tree", "for people"}, {"json", "for programs"}}};
  EXPECT_EQ(valueText(row), "tree|json (default: tree)");
  row.value = "NAME";
  EXPECT_EQ(valueText(row), "NAME (default: tree)");
}

TEST(HelpTextTest, FlagsAndPositionalArgumentsShowNoValue) {
  bool flag = true;
  std::string file = "a";
  EXPECT_EQ(valueText({.name = "--flag", .target = &flag}), "");
  EXPECT_EQ(valueText({.name = "--version", .target = [] { return std::string(); }}), "");
  EXPECT_EQ(valueText({.name = "FILE", .target = &file}), " ");
}

TEST(HelpTextTest, ACommandWithoutSectionsHasNoFooter) {
  EXPECT_EQ(footerText({.name = "command"}), "");
}

TEST(HelpTextTest, SectionsAreSetApartByALine) {
  EXPECT_EQ(footerText({.name = "command",
                        .sections = {{.text = "Some words\nin two lines."},
                                     {.title = "Examples", .text = "  command a\n"}}}),
            "Some words\nin two lines.\n\nExamples:\n  command a");
}

TEST(HelpTextTest, RowsAreTwoColumnsWithTheTextBelow) {
  EXPECT_EQ(footerText({.name = "command",
                        .sections = {{.title = "Formats",
                                      .rows = {{"tree", "for people,\nin colours"},
                                               {"ndjson", "a line a refresh"}},
                                      .text = "Times are UTC."}}}),
            "Formats:\n"
            "  tree    for people,\n"
            "          in colours\n"
            "  ndjson  a line a refresh\n"
            "Times are UTC.");
}

}  // namespace
}  // namespace kestro
