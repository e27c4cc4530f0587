// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "CommandLine/Progress.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class ProgressTest : public ::testing::Test {
 protected:
  Progress make() {
    return Progress(
        Progress::Terminal{.write = [this](std::string_view text) { _written.emplace_back(text); },
                           .now = [this] { return _now; }});
  }

  /// So many messages that the progress looks at the clock.
  void read(Progress& progress, std::chrono::milliseconds at) {
    _now = Progress::Clock::time_point(at);
    for (int i = 0; i < 64; ++i) progress.step([this] { return _fraction; });
  }

  Progress::Clock::time_point _now{};
  std::optional<double> _fraction = 0.25;
  std::vector<std::string> _written;
};

TEST_F(ProgressTest, SaysHowFarAndHowLongItTakesStill) {
  EXPECT_EQ(progressText(0.25, 2s), "25 %, 0:06 left");
  EXPECT_EQ(progressText(0.5, 65s), "50 %, 1:05 left");
  EXPECT_EQ(progressText(0.01, 100s), "1 %, 2:45:00 left");
  EXPECT_EQ(progressText(0.999, 1s), "99 %, 0:01 left");
  EXPECT_EQ(progressText(1, 3s), "100 %, 0:00 left");
}

TEST_F(ProgressTest, AtTheVeryBeginningNobodyKnowsHowLong) {
  EXPECT_EQ(progressText(0, 2s), "0 %");
  EXPECT_EQ(progressText(-1, 2s), "0 %");
}

TEST_F(ProgressTest, WithinASecondNothingIsShown) {
  auto progress = make();
  read(progress, 0ms);
  read(progress, 999ms);
  EXPECT_THAT(_written, IsEmpty());
}

TEST_F(ProgressTest, AfterASecondALineComesAndIsRenewedNowAndThen) {
  auto progress = make();
  read(progress, 1000ms);
  read(progress, 1100ms);
  _fraction = 0.5;
  read(progress, 1200ms);
  EXPECT_THAT(_written, ElementsAre("\r\033[K25 %, 0:03 left\r", "\r\033[K50 %, 0:02 left\r"));
}

TEST_F(ProgressTest, WithoutAFractionItTellsTheTimeThatHasPassed) {
  auto progress = make();
  _fraction = std::nullopt;
  read(progress, 61'500ms);
  EXPECT_THAT(_written, ElementsAre("\r\033[K1:01\r"));
}

TEST_F(ProgressTest, TheLineGoesWithIt) {
  {
    auto progress = make();
    read(progress, 2s);
    _written.clear();
    const Progress moved = std::move(progress);
    EXPECT_THAT(_written, IsEmpty());
  }
  EXPECT_THAT(_written, ElementsAre("\r\033[K"));
}

TEST_F(ProgressTest, WhatWasNotShownIsNotTakenAway) {
  make().erase();
  EXPECT_THAT(_written, IsEmpty());
}

TEST_F(ProgressTest, WithoutATerminalNothingIsAsked) {
  Progress progress{std::optional<Progress::Terminal>()};
  for (int i = 0; i < 1000; ++i) {
    progress.step([]() -> std::optional<double> {
      ADD_FAILURE();
      return 0;
    });
  }
}

}  // namespace
}  // namespace kestro
