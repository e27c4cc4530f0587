// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <initializer_list>
#include <string>
#include <vector>

#include "Options/ValueCheck.h"

namespace kestro {
namespace {

/// `program` takes an option, and `program show` one of each kind.
std::string problem(std::initializer_list<const char*> arguments) {
  std::string config;
  std::string server;
  std::string file;
  std::string demo;
  std::optional<int> number;
  bool loop = false;
  const CommandRow program{
      .name = "program",
      .options = {{.name = "--config", .target = &config}},
      .commands = {{.name = "show",
                    .options = {{.name = "FILE", .target = &file},
                                {.name = "--server", .value = "NAME", .target = &server},
                                {.name = "-n,--number", .target = &number},
                                {.name = "--demo", .target = &demo, .impliedValue = "simulation"},
                                {.name = "--loop", .target = &loop}}}}};
  const std::vector<const char*> given(arguments);
  return valueProblem(program, given);
}

TEST(ValueCheckTest, WhatIsWholeIsLeftToTheParser) {
  EXPECT_EQ(problem({}), "");
  EXPECT_EQ(problem({"show", "a", "--server=b", "-n", "-5", "--loop", "--demo"}), "");
  EXPECT_EQ(problem({"show", "--server", "b", "--demo=", "-", "--unknown="}), "");
  EXPECT_EQ(problem({"show", "-n", "-.5", "--server", "-"}), "");
}

TEST(ValueCheckTest, AnEmptyValueIsRefused) {
  EXPECT_EQ(problem({"show", "--server=", "--loop"}), "--server: the value is empty");
  EXPECT_EQ(problem({"show", "--number="}), "--number: the value is empty");
}

TEST(ValueCheckTest, AnotherOptionIsNoValue) {
  EXPECT_EQ(problem({"show", "--server", "--loop"}), "--server: a value is missing (NAME)");
  EXPECT_EQ(problem({"show", "-n", "--loop"}), "-n: a value is missing");
  EXPECT_EQ(problem({"show", "--server"}), "--server: a value is missing (NAME)");
  EXPECT_EQ(problem({"show", "--server", "--"}), "--server: a value is missing (NAME)");
}

TEST(ValueCheckTest, WhatBeginsWithAHyphenStandsBehindAnEqualsSign) {
  EXPECT_EQ(problem({"show", "--server=--loop"}), "");
}

TEST(ValueCheckTest, AFlagTakesNoValue) {
  EXPECT_EQ(problem({"show", "--loop=5"}), "--loop takes no value");
  EXPECT_EQ(problem({"show", "--loop="}), "--loop takes no value");
}

TEST(ValueCheckTest, WhatIsAValueIsNoCommandAndNoOption) {
  EXPECT_EQ(problem({"--config", "a", "show", "--loop=5"}), "--loop takes no value");
  EXPECT_EQ(problem({"--config", "show", "--loop=5"}), "");
  EXPECT_EQ(problem({"show", "--", "--loop=5"}), "");
  EXPECT_EQ(problem({"--server="}), "");  // the program itself has no such option
}

}  // namespace
}  // namespace kestro
