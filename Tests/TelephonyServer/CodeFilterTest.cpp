// SPDX-License-Identifier: MIT
// Which messages a client's codes let through.
#include <gtest/gtest.h>

#include "TelephonyServer/CodeFilter.h"

namespace kestro {
namespace {

const Bytes kPacketB179 = {0x01, 12, 0, 0x79, 0xB1, 1, 2, 3, 4, 5, 6, 7, 8};
const Bytes kPrefixedB179 = {0x81, 0x00, 0x01, 12, 0, 0x79, 0xB1, 1, 2, 3, 4, 5, 6};
const Bytes kExtra1 = {0xFF, 12, 0, 0x01, 0x00, 1, 2, 3, 4, 5, 6, 7, 8};

TEST(CodeFilterTest, AcceptsEverythingWithoutCodes) {
  const CodeFilter filter;
  EXPECT_TRUE(filter.accepts(kPacketB179));
  EXPECT_TRUE(filter.accepts(kExtra1));
  EXPECT_TRUE(filter.accepts(Bytes{'b', 'p'}));
  EXPECT_TRUE(filter.accepts({}));
}

TEST(CodeFilterTest, AcceptsTheCodesAskedFor) {
  const CodeFilter filter({0xB17F, 0xB179});
  EXPECT_TRUE(filter.accepts(kPacketB179));
  EXPECT_FALSE(filter.accepts(kExtra1));
  EXPECT_FALSE(CodeFilter({0xB17F}).accepts(kPacketB179));
}

TEST(CodeFilterTest, APrefixMovesTheCodeByTwoBytes) {
  EXPECT_TRUE(CodeFilter({0xB179}).accepts(kPrefixedB179));
  EXPECT_FALSE(CodeFilter({0x000C}).accepts(kPrefixedB179));
}

TEST(CodeFilterTest, ExtraCodesAreCodesOfTheirOwn) {
  EXPECT_TRUE(CodeFilter({0xFF0001}).accepts(kExtra1));
  EXPECT_FALSE(CodeFilter({0x0001}).accepts(kExtra1));
  const Bytes ordinary1 = {0x01, 12, 0, 0x01, 0x00};
  EXPECT_FALSE(CodeFilter({0xFF0001}).accepts(ordinary1));
  EXPECT_TRUE(CodeFilter({0x0001}).accepts(ordinary1));
}

TEST(CodeFilterTest, AnEmptyListOfCodesAcceptsNothing) {
  EXPECT_FALSE(CodeFilter(std::vector<LogCode>{}).accepts(kPacketB179));
}

TEST(CodeFilterTest, MessagesTooShortForACodeAreNotWanted) {
  const CodeFilter filter({0, 0x79, 0xB179});
  for (std::size_t length = 0; length < 5; ++length) {
    EXPECT_FALSE(filter.accepts(ByteView(kPacketB179).first(length))) << length;
  }
  EXPECT_TRUE(filter.accepts(ByteView(kPacketB179).first(5)));
  for (std::size_t length = 0; length < 7; ++length) {
    EXPECT_FALSE(filter.accepts(ByteView(kPrefixedB179).first(length))) << length;
  }
  EXPECT_TRUE(filter.accepts(ByteView(kPrefixedB179).first(7)));
}

TEST(CodeFilterTest, RepeatedCodesCountOnce) {
  EXPECT_TRUE(CodeFilter({0xB179, 0xB179, 1}).accepts(kPacketB179));
}

}  // namespace
}  // namespace kestro
