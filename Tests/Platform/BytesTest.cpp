// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <memory>

#include "Platform/Bytes.h"

namespace kestro {
namespace {

/// Bytes 0x11, 0x22, … 0x99 in memory that ends with the last one.
class BytesTest : public ::testing::Test {
 protected:
  BytesTest() {
    for (std::size_t i = 0; i < kSize; ++i) memory[i] = static_cast<std::uint8_t>(0x11 * (i + 1));
  }

  static constexpr std::size_t kSize = 9;
  std::unique_ptr<std::uint8_t[]> memory = std::make_unique<std::uint8_t[]>(kSize);
  ByteView bytes{memory.get(), kSize};
};

TEST_F(BytesTest, LoadsTheLeastSignificantByteFirst) {
  EXPECT_EQ(loadLittleEndian<std::uint8_t>(bytes, 1), 0x22);
  EXPECT_EQ(loadLittleEndian<std::uint16_t>(bytes, 1), 0x3322);
  EXPECT_EQ(loadLittleEndian<std::uint32_t>(bytes, 1), 0x55443322U);
  EXPECT_EQ(loadLittleEndian<std::uint64_t>(bytes, 1), 0x9988776655443322U);
}

TEST_F(BytesTest, LoadsTheMostSignificantByteFirst) {
  EXPECT_EQ(loadBigEndian<std::uint8_t>(bytes, 1), 0x22);
  EXPECT_EQ(loadBigEndian<std::uint16_t>(bytes, 1), 0x2233);
  EXPECT_EQ(loadBigEndian<std::uint32_t>(bytes, 1), 0x22334455U);
  EXPECT_EQ(loadBigEndian<std::uint64_t>(bytes, 1), 0x2233445566778899U);
}

TEST_F(BytesTest, BytesPastTheEndReadAsZero) {
  EXPECT_EQ(loadLittleEndian<std::uint32_t>(bytes, 6), 0x00998877U);
  EXPECT_EQ(loadLittleEndian<std::uint64_t>(bytes, 2), 0x0099887766554433U);
  EXPECT_EQ(loadLittleEndian<std::uint16_t>(bytes, 8), 0x0099);
  EXPECT_EQ(loadBigEndian<std::uint32_t>(bytes, 6), 0x77889900U);
  EXPECT_EQ(loadBigEndian<std::uint64_t>(bytes, 2), 0x3344556677889900U);
  EXPECT_EQ(loadBigEndian<std::uint16_t>(bytes, 8), 0x9900);
  EXPECT_EQ(loadLittleEndian<std::uint8_t>(bytes, 9), 0);
  EXPECT_EQ(loadBigEndian<std::uint64_t>(bytes, 9), 0U);
}

TEST_F(BytesTest, OffsetsMayBeAsLargeAsTheyCome) {
  constexpr std::size_t kLargest = std::numeric_limits<std::size_t>::max();
  EXPECT_EQ(loadLittleEndian<std::uint64_t>(bytes, kLargest), 0U);
  EXPECT_EQ(loadLittleEndian<std::uint32_t>(bytes, kLargest - 3), 0U);
}

TEST_F(BytesTest, StoresTheLeastSignificantByteFirst) {
  Bytes stored(4, 0xFF);
  storeLittleEndian(std::span(stored), 1, std::uint16_t{0x1234});
  EXPECT_EQ(stored, (Bytes{0xFF, 0x34, 0x12, 0xFF}));
  appendLittleEndian(stored, std::uint32_t{0x89ABCDEF});
  EXPECT_EQ(stored, (Bytes{0xFF, 0x34, 0x12, 0xFF, 0xEF, 0xCD, 0xAB, 0x89}));
}

}  // namespace
}  // namespace kestro
