// SPDX-License-Identifier: MIT
// The running platform: its queue, timers, signals and event loop.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <clocale>
#include <csignal>
#include <cstdio>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/MainQueue.h"
#include "Platform/TextSink.h"
#include "Platform/Uuids.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;
using ::testing::ElementsAre;
using ::testing::MatchesRegex;
using testing::TemporaryDirectory;

class LinuxPlatformTest : public ::testing::Test {
 protected:
  [[nodiscard]] static std::unique_ptr<LinuxPlatform> makePlatform(
      const TemporaryDirectory& directory) {
    return createLinuxPlatform(
        {.logThreshold = std::nullopt, .portDirectory = directory.path().string()});
  }

  [[nodiscard]] MainQueue& queue() { return platform->mainQueue(); }
  /// Serves the queue for a while.
  void runFor(milliseconds time) {
    queue().postAfter(time, [this] { platform->quit(0); });
    platform->run();
  }

  TemporaryDirectory directory;
  std::unique_ptr<LinuxPlatform> platform = makePlatform(directory);
};

TEST_F(LinuxPlatformTest, RunReturnsTheStatusGivenToQuit) {
  queue().post([this] { platform->quit(3); });
  EXPECT_EQ(platform->run(), 3);
}

TEST_F(LinuxPlatformTest, QuitBeforeRunEndsTheNextRunAtOnce) {
  platform->quit(2);
  EXPECT_EQ(platform->run(), 2);
  queue().post([this] { platform->quit(0); });
  EXPECT_EQ(platform->run(), 0);
}

TEST_F(LinuxPlatformTest, PostedBlocksRunInTheirOrder) {
  std::vector<int> order;
  queue().post([&] {
    order.push_back(1);
    queue().post([&] { order.push_back(3); });
  });
  queue().post([&] { order.push_back(2); });
  runFor(milliseconds(20));
  EXPECT_THAT(order, ElementsAre(1, 2, 3));
}

TEST_F(LinuxPlatformTest, NothingRunsInsideThePost) {
  bool ran = false;
  queue().post([&] { ran = true; });
  queue().postAfter(milliseconds(0), [&] { ran = true; });
  EXPECT_FALSE(ran);
}

TEST_F(LinuxPlatformTest, DelayedBlocksRunAfterTheirDelayAndOnce) {
  std::vector<std::string> order;
  const auto start = steady_clock::now();
  steady_clock::duration delay{};
  queue().postAfter(milliseconds(40), [&] {
    order.emplace_back("late");
    delay = steady_clock::now() - start;
  });
  queue().postAfter(milliseconds(10), [&] { order.emplace_back("early"); });
  runFor(milliseconds(100));
  EXPECT_THAT(order, ElementsAre("early", "late"));
  EXPECT_GE(delay, milliseconds(40));
}

TEST_F(LinuxPlatformTest, ABlockThatPostsItselfForEverLetsTimersRun) {
  std::function<void()> again = [&] { queue().post(again); };
  again();
  queue().postAfter(milliseconds(10), [this] { platform->quit(7); });
  EXPECT_EQ(platform->run(), 7);
}

TEST_F(LinuxPlatformTest, BlocksThatNeverRanAreDestroyedWithThePlatform) {
  const auto held = std::make_shared<int>(0);
  queue().post([held] { FAIL() << "nobody serves the queue"; });
  queue().postAfter(std::chrono::hours(1), [held] { FAIL() << "nobody serves the queue"; });
  EXPECT_EQ(held.use_count(), 3);
  platform.reset();
  EXPECT_EQ(held.use_count(), 1);
}

TEST_F(LinuxPlatformTest, WhatABlockHeldIsFreedWhenItHasRun) {
  const auto held = std::make_shared<int>(0);
  queue().postAfter(milliseconds(1), [held] {});
  runFor(milliseconds(30));
  EXPECT_EQ(held.use_count(), 1);
}

TEST_F(LinuxPlatformTest, ARepeatingTimerFiresFirstAfterOneInterval) {
  const auto start = steady_clock::now();
  std::vector<steady_clock::duration> ticks;
  const auto timer = queue().scheduleRepeating(milliseconds(30), [&] {
    ticks.push_back(steady_clock::now() - start);
    if (ticks.size() == 3) platform->quit(0);
  });
  platform->run();
  EXPECT_GE(ticks[0], milliseconds(30));
  EXPECT_GE(ticks[2], milliseconds(90));
}

TEST_F(LinuxPlatformTest, TicksThatCouldNotBeServedAreNotMadeUpFor) {
  int ticks = 0;
  const auto timer = queue().scheduleRepeating(milliseconds(20), [&] { ++ticks; });
  queue().post([] { std::this_thread::sleep_for(milliseconds(300)); });
  runFor(milliseconds(310));
  // The one that was due during the block, and at most one more in what is left.
  EXPECT_GE(ticks, 1);
  EXPECT_LE(ticks, 2);
}

TEST_F(LinuxPlatformTest, AnInvalidatedTimerFiresNoMore) {
  int ticks = 0;
  std::unique_ptr<Timer> timer;
  timer = queue().scheduleRepeating(milliseconds(5), [&] {
    ++ticks;
    timer->invalidate();
    timer->invalidate();
  });
  runFor(milliseconds(60));
  EXPECT_EQ(ticks, 1);
}

TEST_F(LinuxPlatformTest, ATimerMayBeDestroyedInItsOwnHandler) {
  std::string held = "what the handler holds lives until it returns";
  std::string seen;
  std::unique_ptr<Timer> timer;
  timer = queue().scheduleRepeating(milliseconds(5), [&timer, &seen, held] {
    timer.reset();
    seen += held;
  });
  runFor(milliseconds(60));
  EXPECT_EQ(seen, held);
}

TEST_F(LinuxPlatformTest, ADestroyedTimerFiresNoMore) {
  int ticks = 0;
  auto timer = queue().scheduleRepeating(milliseconds(5), [&] { ++ticks; });
  timer.reset();
  runFor(milliseconds(40));
  EXPECT_EQ(ticks, 0);
}

TEST_F(LinuxPlatformTest, TheTerminationHandlerRunsOnTheMainThread) {
  std::vector<std::thread::id> threads;
  platform->setTerminationHandler([&] {
    threads.push_back(std::this_thread::get_id());
    if (threads.size() == 3) platform->quit(0);
  });
  queue().post([] { ::raise(SIGTERM); });
  queue().postAfter(milliseconds(10), [] { ::raise(SIGINT); });
  queue().postAfter(milliseconds(20), [] { ::raise(SIGHUP); });
  platform->run();
  const auto here = std::this_thread::get_id();
  EXPECT_THAT(threads, ElementsAre(here, here, here));
}

TEST_F(LinuxPlatformTest, TheResizeHandlerRunsWhenTheTerminalChanges) {
  int resizes = 0;
  platform->setResizeHandler([&] {
    ++resizes;
    platform->quit(0);
  });
  queue().post([] { ::raise(SIGWINCH); });
  platform->run();
  EXPECT_EQ(resizes, 1);
}

TEST_F(LinuxPlatformTest, SignalsThatWereIgnoredStayIgnored) {
  ::signal(SIGHUP, SIG_IGN);
  bool terminated = false;
  platform->setTerminationHandler([&] { terminated = true; });
  queue().post([] { ::raise(SIGHUP); });
  runFor(milliseconds(20));
  EXPECT_FALSE(terminated);
  ::signal(SIGHUP, SIG_DFL);
}

using LinuxPlatformDeathTest = LinuxPlatformTest;

TEST_F(LinuxPlatformDeathTest, WithoutAHandlerASignalEndsTheProcess) {
  EXPECT_EXIT(
      {
        platform->setTerminationHandler([] {});
        platform->setTerminationHandler(nullptr);
        ::raise(SIGTERM);
      },
      ::testing::KilledBySignal(SIGTERM), "");
}

TEST_F(LinuxPlatformDeathTest, AnExceptionInABlockEndsTheProcess) {
  EXPECT_EXIT(
      {
        queue().post([] { throw std::runtime_error("the end"); });
        platform->run();
      },
      ::testing::KilledBySignal(SIGABRT), "the end");
}

TEST_F(LinuxPlatformTest, NumbersKeepThePointWhateverTheLocale) {
  EXPECT_STREQ(std::setlocale(LC_NUMERIC, nullptr), "C");
}

TEST_F(LinuxPlatformTest, UuidsAreFreshAndInUpperCase) {
  const auto first = platform->uuids().create();
  const auto second = platform->uuids().create();
  ASSERT_TRUE(first && second);
  EXPECT_THAT(*first, MatchesRegex("[0-9A-F]{8}-[0-9A-F]{4}-4[0-9A-F]{3}-[89AB][0-9A-F]{3}-"
                                   "[0-9A-F]{12}"));
  EXPECT_NE(*first, *second);
}

TEST_F(LinuxPlatformTest, TheLibrarysOutputGoesToStandardErrorByDefault) {
  ::testing::internal::CaptureStderr();
  ::testing::internal::CaptureStdout();
  platform->standardOutput().writeLine("a line with 100%s");
  platform->consoleLog().writeLine("another");
  EXPECT_EQ(::testing::internal::GetCapturedStdout(), "");
  EXPECT_EQ(::testing::internal::GetCapturedStderr(), "a line with 100%s\nanother\n");
}

TEST_F(LinuxPlatformTest, TheLibrarysOutputGoesToStandardOutputWhenAsked) {
  platform.reset();
  platform = createLinuxPlatform({.logThreshold = std::nullopt,
                                  .portDirectory = directory.path().string(),
                                  .standardOutputToStandardError = false});
  ::testing::internal::CaptureStdout();
  platform->standardOutput().writeLine("a line");
  EXPECT_EQ(::testing::internal::GetCapturedStdout(), "a line\n");
}

TEST_F(LinuxPlatformTest, WithoutAThresholdNothingIsLogged) {
  EXPECT_FALSE(platform->systemLog().accepts(LogPriority::Error));
}

}  // namespace
}  // namespace kestro
