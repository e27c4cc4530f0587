// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <sys/resource.h>

#include "TelephonyServer/DescriptorLimit.h"

namespace kestro {
namespace {

class DescriptorLimitTest : public ::testing::Test {
 protected:
  DescriptorLimitTest() {
    EXPECT_EQ(::getrlimit(RLIMIT_NOFILE, &_earlier), 0);
    const rlimit few{100, _earlier.rlim_max};
    EXPECT_EQ(::setrlimit(RLIMIT_NOFILE, &few), 0);
  }
  ~DescriptorLimitTest() override { EXPECT_EQ(::setrlimit(RLIMIT_NOFILE, &_earlier), 0); }

  [[nodiscard]] static rlim_t current() {
    rlimit limit{};
    EXPECT_EQ(::getrlimit(RLIMIT_NOFILE, &limit), 0);
    return limit.rlim_cur;
  }
  [[nodiscard]] rlim_t most() const { return _earlier.rlim_max; }

 private:
  rlimit _earlier{};
};

TEST_F(DescriptorLimitTest, AsManyAreAllowedAsAreAskedFor) {
  allowDescriptors(200);
  EXPECT_EQ(current(), 200U);
}

TEST_F(DescriptorLimitTest, WhatIsAllowedAlreadyStays) {
  allowDescriptors(50);
  EXPECT_EQ(current(), 100U);
}

TEST_F(DescriptorLimitTest, NoMoreThanTheSystemAllows) {
  if (most() == RLIM_INFINITY) GTEST_SKIP() << "this system allows any number";
  allowDescriptors(static_cast<std::size_t>(most()) + 1);
  EXPECT_EQ(current(), most());
}

}  // namespace
}  // namespace kestro
