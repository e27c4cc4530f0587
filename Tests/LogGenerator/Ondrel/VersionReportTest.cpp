// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "LogGenerator/Ondrel/VersionReport.h"

namespace kestro {
namespace {

using ::testing::Each;
using ::testing::ElementsAre;

class VersionReportTest : public ::testing::Test {
 protected:
  int write(std::uint32_t length, std::uint64_t time = 0) {
    return QbxDLFAddVersionReport(buffer, length, written, 1, 1, "Kestro 1.0", "EXECUTABLE_NAME",
                                  "Mar  4 2012 13:05:09", time);
  }

  std::vector<int> bytes(std::size_t offset, std::size_t count) {
    return {buffer.begin() + static_cast<std::ptrdiff_t>(offset),
            buffer.begin() + static_cast<std::ptrdiff_t>(offset + count)};
  }

  std::string text(std::size_t offset, std::size_t count) {
    const auto begin = buffer.begin() + static_cast<std::ptrdiff_t>(offset);
    return {begin, begin + static_cast<std::ptrdiff_t>(count)};
  }

  std::array<std::uint8_t, 200> buffer = [] {
    std::array<std::uint8_t, 200> filled{};
    filled.fill(0xEE);
    return filled;
  }();
  std::uint32_t written = 99;
};

TEST_F(VersionReportTest, RefusesABufferOf160Bytes) {
  EXPECT_EQ(write(160), 3);
  EXPECT_EQ(written, 0U);
  EXPECT_THAT(buffer, Each(0xEE));
}

TEST_F(VersionReportTest, RefusesALengthThatTheBufferDoesNotHave) {
  EXPECT_EQ(QbxDLFAddVersionReport(std::span(buffer).first(100), 161, written, 1, 1, "", "", "", 0),
            3);
}

TEST_F(VersionReportTest, WritesExactly161Bytes) {
  EXPECT_EQ(write(161), 0);
  EXPECT_EQ(written, 161U);
  EXPECT_THAT(bytes(161, 39), Each(0xEE));
}

TEST_F(VersionReportTest, BeginsWithLengthCodeAndAnEmptyTimestamp) {
  write(161);
  EXPECT_THAT(bytes(0, 16),
              ElementsAre(0xA1, 0x00, 0xFD, 0x1F, 0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 1, 0));
}

TEST_F(VersionReportTest, CutsTheVersionToSixCharacters) {
  write(161);
  EXPECT_EQ(text(16, 7), std::string("Kestro\0", 7));
}

TEST_F(VersionReportTest, HoldsTheWholeExecutableNameAndZeros) {
  write(161);
  EXPECT_EQ(text(23, 15), "EXECUTABLE_NAME");
  EXPECT_THAT(bytes(38, 25), Each(0));
}

TEST_F(VersionReportTest, CutsALongerExecutableNameToFifteenCharacters) {
  const std::string name(50, 'N');
  QbxDLFAddVersionReport(buffer, 161, written, 1, 1, "", name, "", 0);
  EXPECT_EQ(text(23, 15), std::string(15, 'N'));
  EXPECT_THAT(bytes(38, 25), Each(0));
}

TEST_F(VersionReportTest, HoldsTheFirstVersionBeforeTheSecond) {
  QbxDLFAddVersionReport(buffer, 161, written, 0x1234, 0x5678, "", "", "", 0);
  EXPECT_THAT(bytes(12, 4), ElementsAre(0x34, 0x12, 0x78, 0x56));
}

TEST_F(VersionReportTest, CutsTheBuildDateToSeventeenCharacters) {
  write(161);
  EXPECT_EQ(text(63, 17), "Mar  4 2012 13:05");
  EXPECT_THAT(bytes(80, 17), Each(0));
}

TEST_F(VersionReportTest, SpreadsThePackedTime) {
  write(161, packedReportTime(0x4F535EF5, -210, true));
  EXPECT_THAT(bytes(97, 8), ElementsAre(0xF5, 0x5E, 0x53, 0x4F, 0x2E, 0xFF, 1, 0));
  EXPECT_THAT(bytes(105, 56), Each(0));
}

TEST_F(VersionReportTest, TakesEightBitsForTheDaylightSavingFlag) {
  write(161, 0xAB01'0000'0000'0000ULL);
  EXPECT_THAT(bytes(103, 3), ElementsAre(1, 0, 0));
}

TEST_F(VersionReportTest, PacksTheTimeFromTheLeastSignificantBit) {
  EXPECT_EQ(packedReportTime(0x4F535EF5, -210, true), 0x0001'FF2E'4F53'5EF5ULL);
  EXPECT_EQ(packedReportTime(0xFFFFFFFF, 60, false), 0x0000'003C'FFFF'FFFFULL);
}

}  // namespace
}  // namespace kestro
