// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <chrono>

#include "Platform/PropertyListDescription.h"

namespace kestro {
namespace {

TEST(PropertyListDescriptionTest, ADictionaryStandsOnOneLine) {
  EXPECT_EQ(describe(Dictionary{{"State", "Cell DCH"}}), "{ State = \"Cell DCH\"; }");
  EXPECT_EQ(describe(Dictionary{{"A", "1"}, {"Cell ID", "x"}}), "{ A = 1; \"Cell ID\" = x; }");
  EXPECT_EQ(describe(Dictionary()), "{ }");
}

TEST(PropertyListDescriptionTest, QuotesTextsOfMoreThanLettersAndDigits) {
  EXPECT_EQ(describe("Disconnected_1"), "Disconnected_1");
  EXPECT_EQ(describe(""), "\"\"");
  EXPECT_EQ(describe("-1"), "\"-1\"");
  EXPECT_EQ(describe("a \"b\" \\ c\nd"), R"("a \"b\" \\ c\nd")");
  EXPECT_EQ(describe("é"), "\"é\"");
}

TEST(PropertyListDescriptionTest, ContainersNest) {
  EXPECT_EQ(describe(Array{"a", Array{}, Dictionary{{"k", Array{"b c"}}}}),
            "( a, ( ), { k = ( \"b c\" ); } )");
}

TEST(PropertyListDescriptionTest, DescribesEveryTypeOfValue) {
  EXPECT_EQ(describe(Value()), "(null)");
  EXPECT_EQ(describe(Dictionary::null()), "(null)");
  EXPECT_EQ(describe(Value::integer(-7)), "-7");
  EXPECT_EQ(describe(Value::unsignedInteger(18446744073709551615U)), "18446744073709551615");
  EXPECT_EQ(describe(Value::real(1.5)), "1.5");
  EXPECT_EQ(describe(Value::boolean(true)), "1");
  EXPECT_EQ(describe(Value::boolean(false)), "0");
  EXPECT_EQ(describe(Value::data({0x0F, 0xBD, 0x77})), "<0fbd77>");
  EXPECT_EQ(describe(Value::data({})), "<>");
  EXPECT_EQ(describe(Value::date(Moment(std::chrono::milliseconds(1500)))), "1.5");
}

}  // namespace
}  // namespace kestro
