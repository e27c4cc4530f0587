// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "LogGenerator/Packets/PlacedKey.h"

namespace kestro {
namespace {

TEST(PlacedKeyTest, FindsItsValueWhereverItStands) {
  PlacedKey key("B");
  EXPECT_EQ(key.in(Dictionary{{"A", "1"}, {"B", "2"}}), Value("2"));
  EXPECT_EQ(key.in(Dictionary{{"A", "1"}, {"B", "3"}}), Value("3"));
  EXPECT_EQ(key.in(Dictionary{{"B", "4"}, {"A", "1"}}), Value("4"));
}

TEST(PlacedKeyTest, HasNoValueWhereTheKeyIsMissing) {
  PlacedKey key("B", 1);
  EXPECT_TRUE(key.in(Dictionary{{"A", "1"}, {"C", "2"}}).isNull());
  EXPECT_TRUE(key.in(Dictionary()).isNull());
  EXPECT_TRUE(key.in(Dictionary::null()).isNull());
  EXPECT_EQ(key.in(Dictionary{{"B", "3"}}), Value("3"));
}

TEST(PlacedKeyTest, SetsItsValueInPlaceOrAppendsIt) {
  PlacedKey key("B");
  Dictionary dictionary{{"A", "1"}, {"B", "2"}, {"C", "3"}};
  key.set(dictionary, "4");
  EXPECT_EQ(Value(dictionary), Value(Dictionary{{"A", "1"}, {"B", "4"}, {"C", "3"}}));
  Dictionary other{{"A", "1"}};
  key.set(other, "5");
  EXPECT_EQ(Value(other), Value(Dictionary{{"A", "1"}, {"B", "5"}}));
}

TEST(PlacedKeyTest, RewritesItsValueOnlyWhereItStoodBefore) {
  PlacedKey key("B");
  Dictionary dictionary{{"A", "1"}, {"B", "2"}};
  EXPECT_EQ(key.toRewrite(dictionary), nullptr);
  key.set(dictionary, "3");
  Value* const value = key.toRewrite(dictionary);
  ASSERT_NE(value, nullptr);
  *value = "4";
  EXPECT_EQ(dictionary["B"], Value("4"));
  Dictionary shorter{{"B", "1"}};
  EXPECT_EQ(key.toRewrite(shorter), nullptr);
  Dictionary other{{"B", "1"}, {"A", "2"}};
  EXPECT_EQ(key.toRewrite(other), nullptr);
}

}  // namespace
}  // namespace kestro
