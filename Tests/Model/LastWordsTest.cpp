// SPDX-License-Identifier: MIT
#include <fmt/format.h>
#include <gtest/gtest.h>

#include <csignal>
#include <cstdio>

#include "LogGenerator/InternalConsistencyFailure.h"
#include "Model/LastWords.h"

namespace kestro {
namespace {

void fail() { throw InternalConsistencyFailure("No good", "Source", 90); }

/// Fails where nothing catches it.
void failUncaught() noexcept { fail(); }

void failWithLastWords() {
  const LastWords lastWords([](std::string_view line) { fmt::print(stderr, "log: {}\n", line); });
  failUncaught();
}

TEST(LastWordsDeathTest, TheFailureIsNamedThenHandledThenTheProcessAborts) {
  EXPECT_EXIT(failWithLastWords(), ::testing::KilledBySignal(SIGABRT),
              "^log: ended by a failure: No good \\(Source, line 90\\)\n");
}

void failTwice() {
  const LastWords lastWords([](std::string_view) {
    fmt::print(stderr, "once\n");
    fail();
  });
  failUncaught();
}

TEST(LastWordsDeathTest, AFailureOfTheHandlerEndsTheProcessToo) {
  EXPECT_EXIT(failTwice(), ::testing::KilledBySignal(SIGABRT), "^once\n$");
}

void failAfterwards() {
  {
    const LastWords lastWords([](std::string_view) {});
  }
  failUncaught();
}

TEST(LastWordsDeathTest, AfterwardsTerminateIsAsBefore) {
  EXPECT_EXIT(failAfterwards(), ::testing::KilledBySignal(SIGABRT), "^terminate called");
}

}  // namespace
}  // namespace kestro
