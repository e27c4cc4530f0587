// SPDX-License-Identifier: MIT
// The system log's queue, with writers that are slow, stuck, or fine.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <condition_variable>
#include <mutex>
#include <vector>

#include "Platform/Linux/QueuedSystemLog.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;

/// A logger that can be stopped and let go again.
class Logger {
 public:
  [[nodiscard]] QueuedSystemLog::Writer writer() const {
    return [state = _state](LogPriority priority, const std::string& line) {
      std::unique_lock lock(state->mutex);
      ++state->arrived;
      state->changed.notify_all();
      state->changed.wait(lock, [&] { return !state->stalled; });
      state->lines.emplace_back(priority, line);
    };
  }

  void stall() const { setStalled(true); }
  void letGo() const { setStalled(false); }

  /// Waits until the log's thread is inside the writer.
  void waitForALine() const {
    std::unique_lock lock(_state->mutex);
    _state->changed.wait(lock, [this] { return _state->arrived > 0; });
  }

  [[nodiscard]] std::vector<std::pair<LogPriority, std::string>> lines() const {
    const std::lock_guard lock(_state->mutex);
    return _state->lines;
  }

 private:
  struct State {
    std::mutex mutex;
    std::condition_variable changed;
    std::vector<std::pair<LogPriority, std::string>> lines;
    int arrived = 0;
    bool stalled = false;
  };

  void setStalled(bool stalled) const {
    const std::lock_guard lock(_state->mutex);
    _state->stalled = stalled;
    _state->changed.notify_all();
  }

  std::shared_ptr<State> _state = std::make_shared<State>();
};

TEST(QueuedSystemLogTest, LinesArriveWholeAndInOrder) {
  const Logger logger;
  QueuedSystemLog log(LogPriority::Notice, logger.writer());
  log.write(LogPriority::Error, " ***** 100% of it %s %n\nsecond line\n");
  log.log(LogPriority::Warning, "{} and {}", 1, "two");
  EXPECT_TRUE(log.flush());
  EXPECT_THAT(logger.lines(),
              ElementsAre(Pair(LogPriority::Error, " ***** 100% of it %s %n\nsecond line\n"),
                          Pair(LogPriority::Warning, "1 and two")));
}

TEST(QueuedSystemLogTest, LinesAboveTheThresholdAreDropped) {
  const Logger logger;
  QueuedSystemLog log(LogPriority::Warning, logger.writer());
  log.write(LogPriority::Notice, "no");
  log.write(LogPriority::Warning, "yes");
  EXPECT_TRUE(log.flush());
  EXPECT_THAT(logger.lines(), ElementsAre(Pair(LogPriority::Warning, "yes")));
}

TEST(QueuedSystemLogTest, TheDestructorWritesWhatWaits) {
  const Logger logger;
  {
    QueuedSystemLog log(LogPriority::Notice, logger.writer());
    for (int i = 0; i < 100; ++i) log.log(LogPriority::Error, "{}", i);
  }
  EXPECT_EQ(logger.lines().size(), 100U);
}

TEST(QueuedSystemLogTest, WhatFindsTheQueueFullIsCountedAndTheCountLogged) {
  const Logger logger;
  logger.stall();
  const std::string line(1000, 'x');
  QueuedSystemLog log(LogPriority::Notice, logger.writer(), 5 * (1000 + 100), milliseconds(5000));
  log.write(LogPriority::Error, "first");
  logger.waitForALine();
  for (int i = 0; i < 12; ++i) log.write(LogPriority::Error, line);
  logger.letGo();
  EXPECT_TRUE(log.flush());
  // Five lines of 1000 characters have room, so the other seven are lost.
  EXPECT_THAT(logger.lines(),
              ElementsAre(Pair(LogPriority::Error, "first"), Pair(LogPriority::Error, line),
                          Pair(LogPriority::Error, line), Pair(LogPriority::Error, line),
                          Pair(LogPriority::Error, line), Pair(LogPriority::Error, line),
                          Pair(LogPriority::Warning, "7 log lines were dropped: the log stalled")));
}

TEST(QueuedSystemLogTest, LinesFlowAgainAfterAStall) {
  const Logger logger;
  logger.stall();
  QueuedSystemLog log(LogPriority::Notice, logger.writer(), 200, milliseconds(5000));
  log.write(LogPriority::Error, "first");
  logger.waitForALine();
  for (int i = 0; i < 10; ++i) log.write(LogPriority::Error, std::string(150, 'x'));
  logger.letGo();
  EXPECT_TRUE(log.flush());
  log.write(LogPriority::Error, "last");
  EXPECT_TRUE(log.flush());
  EXPECT_EQ(logger.lines().back(), std::pair(LogPriority::Error, std::string("last")));
}

TEST(QueuedSystemLogTest, AStuckLoggerStallsNeitherWritingNorFlushingNorTheEnd) {
  const Logger logger;
  logger.stall();
  const auto start = std::chrono::steady_clock::now();
  {
    QueuedSystemLog log(LogPriority::Notice, logger.writer(), 100'000, milliseconds(20));
    for (int i = 0; i < 10'000; ++i) log.log(LogPriority::Error, "line {}", i);
    EXPECT_FALSE(log.flush());
  }
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));
  EXPECT_THAT(logger.lines(), IsEmpty());
  logger.letGo();
}

}  // namespace
}  // namespace kestro
