// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <memory>
#include <thread>

#include "LogGenerator/ArrayLock.h"

namespace kestro {
namespace {

class ArrayLockTest : public ::testing::Test {
 protected:
  void SetUp() override { ArrayLock::initialize(); }
  void TearDown() override { ArrayLock::initialize(); }

  /// Whether another thread gets the lock within a tenth of a second. Where it does not, that
  /// thread waits for good: by the nesting rule nobody can give a lock back that is held once too
  /// often.
  static bool isFree() {
    const auto entered = std::make_shared<std::atomic<bool>>(false);
    std::thread([entered] {
      ArrayLock::lockArray();
      ArrayLock::unlockArray();
      *entered = true;
    }).detach();
    for (int i = 0; i < 100 && !*entered; ++i) {
      std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    return *entered;
  }
};

TEST_F(ArrayLockTest, CountsNesting) {
  ArrayLock::lockArray();
  EXPECT_EQ(ArrayLock::nesting(), 1);
  ArrayLock::lockArray();
  EXPECT_EQ(ArrayLock::nesting(), 2);
  ArrayLock::unlockArray();
  EXPECT_EQ(ArrayLock::nesting(), 1);
  ArrayLock::unlockArray();
  EXPECT_EQ(ArrayLock::nesting(), 0);
}

TEST_F(ArrayLockTest, IsFreeAfterOneLevel) {
  ArrayLock::lockArray();
  ArrayLock::unlockArray();
  EXPECT_TRUE(isFree());
}

TEST_F(ArrayLockTest, IsHeldDuringAScope) {
  {
    const ArrayLockScope scope;
    EXPECT_EQ(ArrayLock::nesting(), 1);
  }
  EXPECT_EQ(ArrayLock::nesting(), 0);
}

TEST_F(ArrayLockTest, ReleasesTheMutexOnlyOnceAfterNestedUse) {
  ArrayLock::lockArray();
  ArrayLock::lockArray();
  ArrayLock::unlockArray();
  ArrayLock::unlockArray();
  EXPECT_FALSE(isFree());
}

TEST_F(ArrayLockTest, WrapsItsCounterAt256) {
  for (int i = 0; i < 256; ++i) ArrayLock::lockArray();
  EXPECT_EQ(ArrayLock::nesting(), 0);
  ArrayLock::unlockArray();
  EXPECT_EQ(ArrayLock::nesting(), 255);
}

}  // namespace
}  // namespace kestro
