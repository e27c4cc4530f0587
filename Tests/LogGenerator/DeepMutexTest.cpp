// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <chrono>
#include <future>
#include <limits>
#include <mutex>
#include <thread>

#include "LogGenerator/DeepMutex.h"

namespace kestro {
namespace {

/// A mutex that this thread holds, and another thread that waits for it.
class DeepMutexTest : public ::testing::Test {
 protected:
  /// Starts the other thread; call it when the mutex is held.
  void letAnotherWait() {
    other =
        std::async(std::launch::async, [this] { const std::lock_guard<DeepMutex> held(mutex); });
  }

  bool otherWaits() const {
    return other.wait_for(std::chrono::milliseconds(20)) == std::future_status::timeout;
  }

  DeepMutex mutex;
  std::future<void> other;
};

TEST_F(DeepMutexTest, IsFreeOnlyAfterTheLastLevel) {
  mutex.lock();
  mutex.lock();
  mutex.unlock();
  letAnotherWait();
  EXPECT_TRUE(otherWaits());
  mutex.unlock();
  other.get();
}

TEST_F(DeepMutexTest, CountsBeyond32BitsOfLevels) {
  constexpr std::uint64_t kMostIn32Bits = std::numeric_limits<std::uint32_t>::max();
  mutex.lock(kMostIn32Bits);
  mutex.lock();
  mutex.lock();
  // Of 2^32 + 1 levels, 32 bits would keep one.
  mutex.unlock();
  letAnotherWait();
  EXPECT_TRUE(otherWaits());
  mutex.unlock(kMostIn32Bits);
  EXPECT_TRUE(otherWaits());
  mutex.unlock();
  other.get();
}

TEST_F(DeepMutexTest, KeepsThreadsApart) {
  constexpr int kRounds = 20'000;
  int count = 0;
  const auto add = [&] {
    for (int i = 0; i < kRounds; ++i) {
      const std::lock_guard<DeepMutex> outer(mutex);
      const std::lock_guard<DeepMutex> inner(mutex);
      ++count;
    }
  };
  std::thread first(add);
  std::thread second(add);
  first.join();
  second.join();
  EXPECT_EQ(count, 2 * kRounds);
}

}  // namespace
}  // namespace kestro
