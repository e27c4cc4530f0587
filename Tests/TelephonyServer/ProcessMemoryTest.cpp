// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <malloc.h>

#include <memory>
#include <vector>

#include "TelephonyServer/ProcessMemory.h"

namespace kestro {
namespace {

#ifndef __SANITIZE_ADDRESS__  // which has an allocator of its own
TEST(ProcessMemory, LargeBlocksAreTheSystemsAgainWhenFreed) {
  giveBackLargeBlocks();
  for (int round = 0; round < 3; ++round) {
    const std::size_t before = ::mallinfo2().hblkhd;
    // What earlier tests left free is not enough for it.
    const std::size_t size = ::mallinfo2().fordblks + 4'000'000;
    auto block = std::make_unique<std::vector<char>>(size);
    EXPECT_GE(::mallinfo2().hblkhd, before + size) << round;
    block.reset();
    EXPECT_EQ(::mallinfo2().hblkhd, before) << round;
  }
}
#endif

}  // namespace
}  // namespace kestro
