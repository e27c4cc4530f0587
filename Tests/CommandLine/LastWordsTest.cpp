// SPDX-License-Identifier: MIT
#include <fmt/format.h>
#include <gtest/gtest.h>

#include <csignal>
#include <cstdio>

#include "CommandLine/LastWords.h"
#include "LogGenerator/InternalConsistencyFailure.h"

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
              "^kestro-cli: ended by a failure: No good \\(Source, line 90\\)\n"
              "log: ended by a failure: No good \\(Source, line 90\\)\n");
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
