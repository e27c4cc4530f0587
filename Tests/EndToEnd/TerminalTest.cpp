// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <string>

#include "Tests/EndToEnd/LiveFixture.h"

namespace kestro::testing {
namespace {

using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

constexpr const char* kEnter = "\033[?1049h\033[?25l";
constexpr const char* kLeave = "\033[0m\033[?25h\033[?1049l";

class TerminalTest : public LiveTest {
 protected:
  /// Starts `watch` and waits for its first display.
  void watchUntilDisplay() {
    startServer();
    watch = start({"kestro-cli", "watch"}, Process::Terminal::Own);
    ASSERT_TRUE(watch->waitForOutput("Updated "));
  }

  std::unique_ptr<Process> watch;
};

TEST_F(TerminalTest, TheDisplayStandsOnTheAlternateScreen) {
  watchUntilDisplay();
  EXPECT_THAT(watch->output(), StartsWith(kEnter));
  EXPECT_THAT(watch->output(), HasSubstr("Connecting..."));
  EXPECT_THAT(watch->output(), HasSubstr("\033[1mCount\033[0m  "));
  EXPECT_THAT(watch->output(), Not(HasSubstr(kLeave)));
}

TEST_F(TerminalTest, ChangedValuesAreInverse) {
  watchUntilDisplay();
  watch->forgetOutput();
  ASSERT_TRUE(watch->waitForOutput("\033[1mCount\033[0m  \033[7m"));
  EXPECT_THAT(watch->output(), Not(HasSubstr("\033[7m62\033[0m")));
}

TEST_F(TerminalTest, CtrlCLeavesTheTerminalClean) {
  watchUntilDisplay();
  watch->type("\x03");
  EXPECT_EQ(watch->wait(), 0);
  EXPECT_THAT(watch->output(), EndsWith(kLeave));
}

TEST_F(TerminalTest, SignalsLeaveTheTerminalClean) {
  startServer();
  for (const int number : {SIGTERM, SIGHUP}) {
    watch = start({"kestro-cli", "watch"}, Process::Terminal::Own);
    ASSERT_TRUE(watch->waitForOutput("Connecting..."));
    watch->signal(number);
    EXPECT_EQ(watch->wait(), 0);
    EXPECT_THAT(watch->output(), EndsWith(kLeave));
  }
}

TEST_F(TerminalTest, TheQuitSignalLeavesTheTerminalClean) {
  watchUntilDisplay();
  watch->signal(SIGQUIT);
  EXPECT_EQ(watch->wait(), -SIGQUIT);
  EXPECT_THAT(watch->output(), EndsWith(kLeave));
}

TEST_F(TerminalTest, AFailureLeavesTheTerminalBeforeItIsNamed) {
  startGarbageServer();
  watch = start({"kestro-cli", "watch"}, Process::Terminal::Own);
  EXPECT_EQ(watch->wait(), -SIGABRT);
  EXPECT_THAT(watch->output(),
              HasSubstr(std::string(kLeave) +
                        "kestro-cli: ended by a failure: Could not deserialize the object "
                        "(LogGenerator/GSM/GSMLogGenerator, line 90)\r\n"));
}

TEST_F(TerminalTest, AnotherWindowSizeIsFollowedAtOnce) {
  watchUntilDisplay();
  watch->forgetOutput();
  watch->resize(60, 10);
  // The title line fills the new width: 60 cells with the status at the right end.
  ASSERT_TRUE(watch->waitForOutput("\033[7m IFX · capture source.pcap   Updated "));
}

TEST_F(TerminalTest, WithoutAServerTheScreenSaysWhatHelps) {
  watch = start({"kestro-cli", "watch"}, Process::Terminal::Own);
  ASSERT_TRUE(watch->waitForOutput("no telephony server"));
  EXPECT_THAT(watch->output(), HasSubstr("start kestro-telephonyd, or use --demo"));
}

TEST_F(TerminalTest, ValuesOfASourceThatHasEndedAreFaint) {
  watch = start({"kestro-cli", "watch", "--demo=capture:" + source.path(), "--speed=100"},
                Process::Terminal::Own);
  ASSERT_TRUE(watch->waitForOutput("the recording has ended"));
  ASSERT_TRUE(watch->waitForOutput("\033[2mCount  "));
  EXPECT_THAT(watch->output(), HasSubstr(" Kestro · IFX · capture source.pcap · demo "));
}

TEST_F(TerminalTest, WithoutATerminalTypeItPrintsPlainly) {
  startServer();
  Process::Options plain = options(Process::Terminal::Own);
  plain.environment.emplace_back("TERM", "dumb");
  watch = std::make_unique<Process>(std::vector<std::string>{"kestro-cli", "watch"}, plain);
  ASSERT_TRUE(watch->waitForOutput("Updated "));
  EXPECT_THAT(watch->output(), Not(HasSubstr("\033")));
}

}  // namespace
}  // namespace kestro::testing
