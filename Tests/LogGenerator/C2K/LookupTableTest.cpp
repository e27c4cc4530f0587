// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "LogGenerator/C2K/LookupTable.h"

namespace kestro {
namespace {

using ::testing::IsEmpty;

class LookupTableTest : public ::testing::Test {
 protected:
  /// Two display dictionaries, each with a leaf under "A".
  LookupTableTest() {
    table.addTarget("name", "A", first);
    table.addTarget("name", "A", second);
  }

  void store(std::string_view text, const Value& value) {
    LookupName name(text);
    table.store(name, value);
  }

  Array targets() { return contents["name"].array(); }

  Dictionary first;
  Dictionary second;
  Dictionary contents;
  LookupTable table{contents};
};

TEST_F(LookupTableTest, KeepsTargetsAsKeyAndDictionary) {
  EXPECT_EQ(Value(contents),
            Value(Dictionary{{"name", Array{Dictionary{{"key", "A"}, {"dict", first}},
                                            Dictionary{{"key", "A"}, {"dict", second}}}}}));
}

TEST_F(LookupTableTest, StoresAtEveryTarget) {
  store("name", "1");
  EXPECT_EQ(first["A"], Value("1"));
  EXPECT_EQ(second["A"], Value("1"));
}

TEST_F(LookupTableTest, PassesOverANameThatItLacks) {
  store("other", "1");
  EXPECT_THAT(first, IsEmpty());
  EXPECT_THAT(second, IsEmpty());
}

TEST_F(LookupTableTest, PassesOverANameWithoutAnArray) {
  contents.set("name", Dictionary{{"key", "A"}, {"dict", first}});
  store("name", "1");
  EXPECT_THAT(first, IsEmpty());
}

TEST_F(LookupTableTest, StopsAtATargetWithoutADictionary) {
  for (const Value& broken : {Value(Dictionary{{"key", "A"}, {"dict", "text"}}),
                              Value(Dictionary{{"key", "A"}}), Value("no target")}) {
    contents.set("name", Array{broken, Dictionary{{"key", "A"}, {"dict", second}}});
    store("name", "1");
    EXPECT_THAT(second, IsEmpty());
  }
}

TEST_F(LookupTableTest, StopsAtATargetWhoseKeyIsNoText) {
  Array all = targets();
  contents.set("name",
               Array{all[0], Dictionary{{"key", Value::integer(7)}, {"dict", second}}, all[1]});
  store("name", "1");
  EXPECT_EQ(first["A"], Value("1"));
  EXPECT_THAT(second, IsEmpty());
}

TEST_F(LookupTableTest, ANameHasItsOwnTargetsInEveryTable) {
  LookupName name("name");
  table.store(name, "1");
  Dictionary third;
  LookupTable other{Dictionary()};
  other.addTarget("before", "B", third);
  other.addTarget("name", "A", third);
  other.store(name, "2");
  EXPECT_EQ(Value(third), Value(Dictionary{{"A", "2"}}));
  EXPECT_EQ(first["A"], Value("1"));
  table.store(name, "3");
  EXPECT_EQ(first["A"], Value("3"));
  EXPECT_EQ(second["A"], Value("3"));
  EXPECT_EQ(third["A"], Value("2"));
}

TEST_F(LookupTableTest, TheValueOfAnOnlyTargetMayBeWrittenOver) {
  first.set("A", "");
  table.addTarget("single", "B", first);
  LookupName single("single");
  EXPECT_EQ(table.onlyValue(single), nullptr);
  table.store(single, "1");
  ASSERT_NE(table.onlyValue(single), nullptr);
  *table.onlyValue(single) = "2";
  EXPECT_EQ(Value(first), Value(Dictionary{{"A", ""}, {"B", "2"}}));
  first.remove("A");
  EXPECT_EQ(table.onlyValue(single), nullptr);
  table.store(single, "3");
  EXPECT_EQ(*table.onlyValue(single), Value("3"));
}

TEST_F(LookupTableTest, OtherNamesHaveNoOnlyValue) {
  LookupName name("name");
  table.store(name, "1");
  EXPECT_EQ(table.onlyValue(name), nullptr);
  LookupName other("other");
  table.store(other, "1");
  EXPECT_EQ(table.onlyValue(other), nullptr);
}

TEST_F(LookupTableTest, ANullTableHasNoNames) {
  LookupName name("name");
  LookupTable(Dictionary::null()).store(name, "1");
  EXPECT_THAT(first, IsEmpty());
}

}  // namespace
}  // namespace kestro
