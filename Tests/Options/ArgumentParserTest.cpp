// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include "Options/ArgumentParser.h"
#include "Tests/Options/Parsing.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

TEST(ArgumentParserTest, WithoutArgumentsDefaultsStay) {
  std::string file = "a.pcap";
  double speed = 1.5;
  bool loop = false;
  const CommandRow program = programOf({{.name = "--file", .value = "FILE", .target = &file},
                                        {.name = "--speed", .value = "X", .target = &speed},
                                        {.name = "--loop", .target = &loop}});
  EXPECT_EQ(chosen(program, {}), &program);
  EXPECT_EQ(file, "a.pcap");
  EXPECT_EQ(speed, 1.5);
  EXPECT_FALSE(loop);
}

TEST(ArgumentParserTest, EveryKindOfTargetIsFilled) {
  std::string text;
  bool flag = false;
  double real = 0;
  std::uint64_t count = 0;
  std::optional<int> number;
  std::optional<std::uint32_t> code;
  std::optional<std::uint64_t> message;
  LogPriority priority = LogPriority::Error;
  const CommandRow program = programOf({{.name = "TEXT", .target = &text},
                                        {.name = "--flag", .target = &flag},
                                        {.name = "--real", .target = &real},
                                        {.name = "--count", .target = &count},
                                        {.name = "--number", .target = &number},
                                        {.name = "--code", .target = &code},
                                        {.name = "--message", .target = &message},
                                        {.name = "--priority", .target = &priority}});
  chosen(program, {"--real=0.25", "some text", "--flag", "--count", "18446744073709551615",
                   "--number=-7", "--code=0xB179", "--message=3", "--priority=7"});
  EXPECT_EQ(text, "some text");
  EXPECT_TRUE(flag);
  EXPECT_EQ(real, 0.25);
  EXPECT_EQ(count, 18446744073709551615U);
  EXPECT_EQ(number, -7);
  EXPECT_EQ(code, 0xB179U);
  EXPECT_EQ(message, 3U);
  EXPECT_EQ(priority, LogPriority::Debug);
}

TEST(ArgumentParserTest, APositionalListTakesAllThatThereAreInTheirOrder) {
  std::vector<std::string> files;
  bool flag = false;
  const CommandRow program =
      programOf({{.name = "FILE",
                  .target = &files,
                  .isRequired = true,
                  .problem =
                      [](const std::string& file) {
                        return file == "bad" ? std::string("bad is no file") : std::string();
                      }},
                 {.name = "--flag", .target = &flag}});
  chosen(program, {"b", "--flag", "a,[c]", "./[d,e]", "-", "b"});
  EXPECT_THAT(files, ElementsAre("b", "a,[c]", "./[d,e]", "-", "b"));
  EXPECT_TRUE(flag);
  EXPECT_THAT(refusal(program, {"b", "bad"}), HasSubstr("bad is no file"));
  EXPECT_EQ(refusal(program, {}), "FILE is required");
  EXPECT_THAT(said(program, {"--help"}).text, HasSubstr("FILE..."));
}

TEST(ArgumentParserTest, AnOptionThatIsAListMayBeGivenAgainWithOneValueEach) {
  std::vector<std::string> rules;
  std::string file;
  const CommandRow program =
      programOf({{.name = "--rule", .target = &rules}, {.name = "FILE", .target = &file}});
  chosen(program, {"--rule", "a < b", "drive", "--rule=c, d", "--rule=[e]"});
  EXPECT_THAT(rules, ElementsAre("a < b", "c, d", "[e]"));
  EXPECT_EQ(file, "drive");
}

TEST(ArgumentParserTest, AnOptionMayHaveAShortName) {
  std::string output;
  const CommandRow program = programOf({{.name = "-o,--output", .target = &output}});
  chosen(program, {"-o", "a"});
  EXPECT_EQ(output, "a");
  chosen(program, {"--output=b"});
  EXPECT_EQ(output, "b");
}

TEST(ArgumentParserTest, NothingElseIsTaken) {
  const CommandRow program = programOf({});
  EXPECT_EQ(refusal(program, {"--other"}), "The following argument was not expected: --other");
  EXPECT_EQ(refusal(program, {"more"}), "The following argument was not expected: more");
}

TEST(ArgumentParserTest, WhatIsRequiredMustBeThere) {
  std::string file;
  std::string output;
  const CommandRow program =
      programOf({{.name = "FILE", .target = &file, .isRequired = true},
                 {.name = "-o,--output", .target = &output, .isRequired = true}});
  EXPECT_EQ(refusal(program, {"-o", "a"}), "FILE is required");
  EXPECT_EQ(refusal(program, {"a"}), "--output is required");
  EXPECT_EQ(refusal(program, {"a", "-o"}), "-o: a value is missing");
}

TEST(ArgumentParserTest, AnImpliedValueStandsWhereNoneIsGiven) {
  std::string source;
  bool loop = false;
  const CommandRow program =
      programOf({{.name = "--demo", .target = &source, .impliedValue = "simulation"},
                 {.name = "--loop", .target = &loop}});
  chosen(program, {"--demo", "--loop"});
  EXPECT_EQ(source, "simulation");
  chosen(program, {"--demo=capture:a", "--loop"});
  EXPECT_EQ(source, "capture:a");
  chosen(program, {"--demo="});
  EXPECT_EQ(source, "simulation");
}

TEST(ArgumentParserTest, AnImpliedEmptyValueOverwritesTheDefault) {
  std::string text = "default";
  std::optional<int> process;
  const CommandRow program =
      programOf({{.name = "--description", .target = &text, .impliedValue = ""},
                 {.name = "--parent", .target = &process, .impliedValue = ""}});
  chosen(program, {"--description="});
  EXPECT_EQ(text, "");
  EXPECT_EQ(process, std::nullopt);
  chosen(program, {"--parent", "--description=a"});
  EXPECT_EQ(process, 0);
}

TEST(ArgumentParserTest, OnlyTheChoicesAreTaken) {
  std::string format;
  const CommandRow program =
      programOf({{.name = "--format", .target = &format, .choices = {{"tree", ""}, {"csv", ""}}}});
  chosen(program, {"--format=csv"});
  EXPECT_EQ(format, "csv");
  EXPECT_EQ(refusal(program, {"--format=xml"}), "--format: xml not in {tree,csv}");
  EXPECT_EQ(refusal(program, {"--format=CSV"}), "--format: CSV not in {tree,csv}");
}

TEST(ArgumentParserTest, ARangeHoldsItsEnds) {
  double speed = 0;
  const CommandRow program =
      programOf({{.name = "--speed", .target = &speed, .range = NumberRange{0.5, 20}}});
  chosen(program, {"--speed=0.5"});
  EXPECT_EQ(speed, 0.5);
  chosen(program, {"--speed=20"});
  EXPECT_EQ(speed, 20);
  EXPECT_EQ(refusal(program, {"--speed=0.49"}), "--speed: 0.49 is not a number from 0.5 to 20");
  EXPECT_EQ(refusal(program, {"--speed=20.01"}), "--speed: 20.01 is not a number from 0.5 to 20");
}

TEST(ArgumentParserTest, WhatIsNoNumberIsInNoRange) {
  double speed = 0;
  const CommandRow program =
      programOf({{.name = "--speed", .target = &speed, .range = NumberRange{}}});
  for (const char* text : {"--speed=nan", "--speed=x", "--speed=5x", "--speed=1,5"}) {
    EXPECT_THAT(refusal(program, {text}), HasSubstr("is not a number of at least 0")) << text;
  }
  EXPECT_EQ(speed, 0);
}

TEST(ArgumentParserTest, AWholeNumberHasNoFractionAndNoSign) {
  std::optional<std::uint64_t> count;
  const CommandRow program =
      programOf({{.name = "--count", .target = &count, .range = NumberRange{1}}});
  for (const char* text : {"--count=0", "--count=1.5", "--count=-1", "--count=nan"}) {
    EXPECT_THAT(refusal(program, {text}), HasSubstr("is not a whole number of at least 1")) << text;
  }
  EXPECT_EQ(count, std::nullopt);
}

TEST(ArgumentParserTest, APrioritysNumberIsInRange) {
  LogPriority priority = LogPriority::Notice;
  const CommandRow program =
      programOf({{.name = "--priority", .target = &priority, .range = NumberRange{3, 7}}});
  EXPECT_EQ(refusal(program, {"--priority=8"}), "--priority: 8 is not a whole number from 3 to 7");
  EXPECT_EQ(priority, LogPriority::Notice);
}

TEST(ArgumentParserTest, AProblemOfTheRowsOwnRefuses) {
  std::string name;
  const CommandRow program =
      programOf({{.name = "--name", .target = &name, .problem = [](const std::string& text) {
                    return text == "good" ? std::string() : "'" + text + "' is not good";
                  }}});
  chosen(program, {"--name=good"});
  EXPECT_EQ(name, "good");
  EXPECT_EQ(refusal(program, {"--name=bad"}), "--name: 'bad' is not good");
}

TEST(ArgumentParserTest, ExcludedOptionsDoNotStandTogether) {
  std::string server;
  std::string demo;
  const CommandRow program = programOf({{.name = "--demo", .target = &demo, .excludes = "--server"},
                                        {.name = "--server", .target = &server}});
  EXPECT_EQ(refusal(program, {"--server=a", "--demo=b"}), "--demo excludes --server");
  chosen(program, {"--demo=b"});
  chosen(program, {"--server=a"});
}

TEST(ArgumentParserTest, ANeededOptionStandsBesideTheOther) {
  std::string picture;
  double delay = 0;
  const CommandRow program =
      programOf({{.name = "-p,--picture", .target = &picture},
                 {.name = "-a,--after", .target = &delay, .needs = "--picture"}});
  EXPECT_EQ(refusal(program, {"--after=2"}), "--after requires --picture");
  chosen(program, {"--after=2", "--picture=a"});
  EXPECT_EQ(delay, 2);
}

TEST(ArgumentParserTest, AnAnswerIsSaidInsteadOfRunning) {
  const CommandRow program =
      programOf({{.name = "--version", .target = [] { return std::string("program 1.2"); }}});
  const OptionsText text = said(program, {"--version"});
  EXPECT_EQ(text.text, "program 1.2\n");
  EXPECT_EQ(text.exitStatus, 0);
  EXPECT_EQ(chosen(program, {}), &program);
}

TEST(ArgumentParserTest, TheInnermostCommandIsChosen) {
  std::string file;
  const CommandRow program{
      .name = "program",
      .commands = {
          {.name = "show"},
          {.name = "snapshot",
           .commands = {{.name = "save"},
                        {.name = "show", .options = {{.name = "FILE", .target = &file}}}}}}};
  EXPECT_EQ(chosen(program, {"show"}), &program.commands[0]);
  EXPECT_EQ(chosen(program, {"snapshot", "show", "a"}), &program.commands[1].commands[1]);
  EXPECT_EQ(file, "a");
}

TEST(ArgumentParserTest, OneOfTheCommandsMustBeGiven) {
  const CommandRow program{.name = "program", .commands = {{.name = "show"}, {.name = "save"}}};
  EXPECT_EQ(refusal(program, {}), "program needs a command: show, save");
  EXPECT_THAT(refusal(program, {"show", "save"}), HasSubstr("not expected"));
}

TEST(ArgumentParserTest, AWordThatNobodyKnowsIsNamed) {
  std::string file;
  const CommandRow program{
      .name = "program",
      .commands = {
          {.name = "show", .options = {{.name = "FILE", .target = &file, .isRequired = true}}},
          {.name = "snapshot", .commands = {{.name = "save"}, {.name = "load"}}}}};
  EXPECT_EQ(refusal(program, {"shwo", "a"}),
            "there is no command 'shwo'; there are show, snapshot");
  EXPECT_EQ(refusal(program, {"snapshot", "bogus"}),
            "there is no command 'bogus'; there are save, load");
  EXPECT_EQ(refusal(program, {"snapshot"}), "snapshot needs a command: save, load");
  EXPECT_EQ(refusal(program, {"--bogus"}), "'--bogus' was not expected");
  EXPECT_EQ(refusal(program, {"show", "--bogus"}), "'--bogus' was not expected");
  EXPECT_EQ(refusal(program, {"show"}), "FILE is required");
}

TEST(ArgumentParserTest, ANumberThatNoNumberHoldsIsTooLarge) {
  std::optional<std::uint64_t> count;
  const CommandRow program =
      programOf({{.name = "--count", .target = &count, .range = NumberRange{1}}});
  chosen(program, {"--count=18446744073709551615"});
  EXPECT_EQ(count, 18446744073709551615U);
  EXPECT_EQ(refusal(program, {"--count=18446744073709551616"}),
            "--count: 18446744073709551616 is too large");
}

TEST(ArgumentParserTest, ARowMayReadItsValueItself) {
  std::string read;
  const CommandRow program =
      programOf({{.name = "-s,--span", .value = "A-B", .target = [&read](const std::string& text) {
                    read = text;
                    return text == "1-2" ? std::string() : "'" + text + "' is no span";
                  }}});
  chosen(program, {"--span=1-2"});
  EXPECT_EQ(read, "1-2");
  EXPECT_EQ(refusal(program, {"-s", "x"}), "--span: 'x' is no span");
}

TEST(ArgumentParserTest, HelpTellsAllRowsButTheHidden) {
  std::string file;
  bool hidden = false;
  CommandRow program =
      programOf({{.name = "--file", .value = "FILE", .help = "What to read", .target = &file},
                 {.name = "--hidden", .target = &hidden, .isHidden = true}});
  program.sections = {{.title = "Examples", .text = "  program --file=a"}};
  const OptionsText text = said(program, {"--help"});
  EXPECT_EQ(text.exitStatus, 0);
  EXPECT_THAT(text.text, StartsWith("Does something.\nUsage: program [OPTIONS]\n"));
  EXPECT_THAT(text.text, HasSubstr("--file FILE"));
  EXPECT_THAT(text.text, HasSubstr("What to read"));
  EXPECT_THAT(text.text, HasSubstr("\nExamples:\n  program --file=a\n"));
  EXPECT_THAT(text.text, Not(HasSubstr("hidden")));
  chosen(program, {"--hidden"});
  EXPECT_TRUE(hidden);
}

TEST(ArgumentParserTest, HelpOfACommandTellsItsRows) {
  std::string file;
  const CommandRow program{
      .name = "program",
      .commands = {{.name = "show",
                    .help = "Shows it",
                    .options = {{.name = "FILE", .help = "What to show", .target = &file}}}}};
  EXPECT_THAT(said(program, {"--help"}).text, HasSubstr("Shows it"));
  EXPECT_THAT(said(program, {"show", "--help"}).text, HasSubstr("What to show"));
}

TEST(ArgumentParserTest, RowsThatAreWrongThrow) {
  std::string first;
  std::string second;
  const CommandRow twice =
      programOf({{.name = "--a", .target = &first}, {.name = "--a", .target = &second}});
  EXPECT_THROW((void)parse(twice, {}), std::runtime_error);
  const CommandRow unknown = programOf({{.name = "--a", .target = &first, .excludes = "--b"}});
  EXPECT_THROW((void)parse(unknown, {}), std::runtime_error);
}

}  // namespace
}  // namespace kestro
