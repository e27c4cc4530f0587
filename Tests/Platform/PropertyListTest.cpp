// SPDX-License-Identifier: MIT
// Values, their containers, and how both are shared.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>
#include <vector>

#include "Platform/PropertyList.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;

std::vector<std::string> keysOf(const Dictionary& dictionary) {
  std::vector<std::string> result;
  for (const auto& [key, value] : dictionary) result.emplace_back(key.text());
  return result;
}

std::string numbered(int i) { return "key number " + std::to_string(i); }

/// A dictionary of so many entries that its keys are found through an index.
Dictionary largeDictionary(int size) {
  Dictionary result;
  for (int i = 0; i < size; ++i) result.set(numbered(i), Value::integer(i));
  return result;
}

// --- Values

TEST(ValueTest, ADefaultValueIsNull) {
  const Value value;
  EXPECT_TRUE(value.isNull());
  EXPECT_EQ(value.type(), ValueType::Null);
  EXPECT_FALSE(value.isText());
}

TEST(ValueTest, TextsOfEveryLengthReadBack) {
  for (std::size_t length = 0; length <= 40; ++length) {
    const std::string text(length, 'x');
    const Value value(text);
    EXPECT_TRUE(value.isText());
    EXPECT_EQ(value.text(), text);
    const Value copy = value;  // NOLINT(performance-unnecessary-copy-initialization)
    EXPECT_EQ(copy.text(), text);
  }
}

TEST(ValueTest, CopyingATextCopiesNoCharacters) {
  const Value value("a text of more than fifteen bytes");
  const Value copy = value;  // NOLINT(performance-unnecessary-copy-initialization)
  EXPECT_EQ(copy.text().data(), value.text().data());
}

TEST(ValueTest, TypeNamesAreThoseOfTheFamily) {
  EXPECT_EQ(Value().typeName(), "null");
  EXPECT_EQ(Value("x").typeName(), "string");
  EXPECT_EQ(Value("a text of more than fifteen bytes").typeName(), "string");
  EXPECT_EQ(Value::integer(1).typeName(), "number");
  EXPECT_EQ(Value::unsignedInteger(UINT64_MAX).typeName(), "number");
  EXPECT_EQ(Value::real(1).typeName(), "number");
  EXPECT_EQ(Value::boolean(false).typeName(), "boolean");
  EXPECT_EQ(Value::date({}).typeName(), "date");
  EXPECT_EQ(Value::data({}).typeName(), "data");
  EXPECT_EQ(Value(Dictionary()).typeName(), "dictionary");
  EXPECT_EQ(Value(Array()).typeName(), "array");
}

TEST(ValueTest, IntegersKeepTheirBitsAndTheirRange) {
  EXPECT_EQ(Value::integer(-1).integerBits(), -1);
  EXPECT_FALSE(Value::integer(-1).isAboveInt64());
  EXPECT_EQ(Value::unsignedInteger(UINT64_MAX).integerBits(), -1);
  EXPECT_TRUE(Value::unsignedInteger(UINT64_MAX).isAboveInt64());
  EXPECT_EQ(Value::unsignedInteger(7), Value::integer(7));
  EXPECT_NE(Value::unsignedInteger(UINT64_MAX), Value::integer(-1));
}

TEST(ValueTest, WhatAValueIsNotReadsAsNothing) {
  const Value value("5");
  EXPECT_EQ(value.integerBits(), 0);
  EXPECT_EQ(value.realNumber(), 0);
  EXPECT_FALSE(value.flag());
  EXPECT_EQ(value.moment(), Moment());
  EXPECT_TRUE(value.bytes().empty());
  EXPECT_TRUE(value.dictionary().isNull());
  EXPECT_TRUE(value.array().isNull());
  const Value number = Value::integer(5);
  EXPECT_EQ(number.text(), "");
}

TEST(ValueTest, ANullContainerHandleGivesANullValue) {
  EXPECT_TRUE(Value(Dictionary::null()).isNull());
  EXPECT_TRUE(Value(Array::null()).isNull());
}

TEST(ValueTest, EqualityIsOfTypeAndContents) {
  EXPECT_EQ(Value("a text of more than fifteen bytes"), Value("a text of more than fifteen bytes"));
  EXPECT_NE(Value("abc"), Value("abd"));
  EXPECT_NE(Value("1"), Value::integer(1));
  EXPECT_NE(Value::integer(1), Value::real(1));
  EXPECT_NE(Value::integer(1), Value::boolean(true));
  EXPECT_EQ(Value::real(0.0), Value::real(-0.0));
  EXPECT_EQ(Value::data({1, 2}), Value::data({1, 2}));
  EXPECT_NE(Value::data({1, 2}), Value::data({1}));
  EXPECT_EQ(Value::date(Moment(5s)), Value::date(Moment(5s)));
  EXPECT_NE(Value::date(Moment(5s)), Value::date(Moment(6s)));
  EXPECT_NE(Value(), Value(""));
}

TEST(ValueTest, EqualityOfContainersIsOfContentsInOrder) {
  EXPECT_EQ(Value(Dictionary{{"a", "1"}, {"b", "2"}}), Value(Dictionary{{"a", "1"}, {"b", "2"}}));
  EXPECT_NE(Value(Dictionary{{"a", "1"}, {"b", "2"}}), Value(Dictionary{{"b", "2"}, {"a", "1"}}));
  EXPECT_NE(Value(Dictionary{{"a", "1"}}), Value(Dictionary{{"a", "1"}, {"b", "2"}}));
  EXPECT_EQ(Value(Array{"a", Array{}}), Value(Array{"a", Array{}}));
  EXPECT_NE(Value(Array{"a"}), Value(Array{"a", "b"}));
  EXPECT_NE(Value(Array{}), Value(Dictionary{}));
}

TEST(ValueTest, AContainerThatHoldsItselfEqualsItself) {
  Array array;
  array.append(array);
  EXPECT_EQ(Value(array), Value(array));
  array.clear();
}

TEST(ValueTest, AMovedFromValueIsNull) {
  Value value("a text of more than fifteen bytes");
  const Value moved = std::move(value);
  EXPECT_TRUE(value.isNull());  // NOLINT(bugprone-use-after-move): that is the test
  EXPECT_EQ(moved.text(), "a text of more than fifteen bytes");
}

TEST(ValueTest, AssigningAValueToItselfKeepsIt) {
  Value value = Array{"x"};
  const Value& same = value;
  value = same;
  EXPECT_EQ(value.array().size(), 1U);
}

TEST(ValueTest, AssigningAnElementOfTheValuesOwnContainerKeepsTheElement) {
  Value value = Array{Array{"inner"}};
  value = value.array()[0];
  EXPECT_EQ(value, Value(Array{"inner"}));
}

TEST(ValueTest, KnowsWhetherItAloneRefersToItsContainer) {
  Value value = Array{"a"};
  EXPECT_TRUE(value.isOnlyReference());
  {
    const Value copy = value;  // NOLINT(performance-unnecessary-copy-initialization)
    EXPECT_FALSE(value.isOnlyReference());
  }
  EXPECT_TRUE(value.isOnlyReference());
  {
    const WeakValue weak(value);
    EXPECT_FALSE(value.isOnlyReference());
  }
  EXPECT_TRUE(value.isOnlyReference());
  const Value dictionary = Dictionary();
  EXPECT_TRUE(dictionary.isOnlyReference());
  EXPECT_FALSE(Value("a text of more than fifteen bytes").isOnlyReference());
  EXPECT_FALSE(Value().isOnlyReference());
}

TEST(ValueTest, CopiesOfAContainerValueShareTheContainer) {
  const Value value = Dictionary{{"a", "1"}};
  const Value copy = value;  // NOLINT(performance-unnecessary-copy-initialization)
  copy.dictionary().set("a", "2");
  EXPECT_EQ(value.dictionary()["a"], Value("2"));
}

TEST(ValueTest, ADeepCopySharesNoContainer) {
  const Value value = Dictionary{{"rows", Array{Dictionary{{"a", "1"}}}}};
  const Value copy = value.deepCopy();
  EXPECT_EQ(copy, value);
  copy.dictionary()["rows"].array()[0].dictionary().set("a", "2");
  EXPECT_EQ(value.dictionary()["rows"].array()[0].dictionary()["a"], Value("1"));
}

// --- Weak references

TEST(WeakValueTest, FindsItsContainerWhileThatLives) {
  Value value = Dictionary{{"a", "1"}};
  const WeakValue weak(value);
  EXPECT_TRUE(weak.lock().dictionary().isSame(value.dictionary()));
  value = Value();
  EXPECT_TRUE(weak.lock().isNull());
}

TEST(WeakValueTest, OutlivesItsContainerInEveryOrder) {
  Value value = Array{"x"};
  const WeakValue first(value);
  {
    const WeakValue second = first;  // NOLINT(performance-unnecessary-copy-initialization)
    value = Value();
    EXPECT_TRUE(second.lock().isNull());
  }
  EXPECT_TRUE(first.lock().isNull());
}

TEST(WeakValueTest, RefersToNothingWhenTheValueIsNoContainer) {
  EXPECT_TRUE(WeakValue(Value("a text of more than fifteen bytes")).lock().isNull());
  EXPECT_TRUE(WeakValue().lock().isNull());
}

TEST(WeakValueTest, MayBeAssignedAndMoved) {
  const Value value = Array{};
  WeakValue weak(value);
  WeakValue moved = std::move(weak);
  EXPECT_FALSE(moved.lock().isNull());
  moved = WeakValue();
  EXPECT_TRUE(moved.lock().isNull());
}

// --- Dictionaries

TEST(DictionaryTest, EntriesKeepTheOrderOfTheirKeys) {
  Dictionary dictionary{{"zebra", "1"}, {"ant", "2"}};
  dictionary.set("mole", "3");
  dictionary.set("zebra", "4");
  EXPECT_THAT(keysOf(dictionary), ElementsAre("zebra", "ant", "mole"));
  EXPECT_EQ(dictionary["zebra"], Value("4"));
}

TEST(DictionaryTest, AMissingKeyReadsAsNull) {
  const Dictionary dictionary{{"a", "1"}};
  EXPECT_TRUE(dictionary["b"].isNull());
  EXPECT_EQ(dictionary.find("b"), nullptr);
  EXPECT_FALSE(dictionary.contains("b"));
  EXPECT_TRUE(dictionary.contains("a"));
}

TEST(DictionaryTest, ANullHandleReadsAsEmptyAndIgnoresWrites) {
  Dictionary dictionary = Dictionary::null();
  dictionary.set("a", "1");
  dictionary.clear();
  EXPECT_FALSE(dictionary.remove("a"));
  EXPECT_TRUE(dictionary.empty());
  EXPECT_TRUE(dictionary["a"].isNull());
  EXPECT_TRUE(dictionary.copy().empty());
}

TEST(DictionaryTest, RemovingMovesLaterEntriesUp) {
  Dictionary dictionary{{"a", "1"}, {"b", "2"}, {"c", "3"}};
  EXPECT_TRUE(dictionary.remove("b"));
  EXPECT_FALSE(dictionary.remove("b"));
  EXPECT_THAT(keysOf(dictionary), ElementsAre("a", "c"));
  EXPECT_EQ(dictionary["c"], Value("3"));
}

TEST(DictionaryTest, KeysMayBeOtherValuesThanTexts) {
  Dictionary dictionary{{Value::integer(1), "one"}, {"1", "text"}, {Value::real(1), "real"}};
  EXPECT_EQ(*dictionary.find(Value::integer(1)), Value("one"));
  EXPECT_EQ(*dictionary.find(Value::real(1)), Value("real"));
  EXPECT_EQ(dictionary["1"], Value("text"));
  EXPECT_TRUE(dictionary[""].isNull());
  EXPECT_EQ(dictionary.find(Value()), nullptr);
}

TEST(DictionaryTest, ManyEntriesAreFoundReplacedAndRemoved) {
  constexpr int kSize = 1000;
  Dictionary dictionary = largeDictionary(kSize);
  for (int i = 0; i < kSize; ++i) EXPECT_EQ(dictionary[numbered(i)], Value::integer(i));
  EXPECT_TRUE(dictionary[numbered(kSize)].isNull());
  dictionary.set(numbered(500), "new");
  EXPECT_TRUE(dictionary.remove(numbered(0)));
  EXPECT_EQ(dictionary.size(), 999U);
  EXPECT_EQ(dictionary.keyAt(499), Value(numbered(500)));
  EXPECT_EQ(dictionary[numbered(500)], Value("new"));
  EXPECT_EQ(dictionary[numbered(999)], Value::integer(999));
}

TEST(DictionaryTest, AHintedWriteReplacesOrAppendsWhateverTheHint) {
  Dictionary dictionary{{"a", "1"}, {"b", "2"}};
  dictionary.set("b", "3", 1);
  dictionary.set("a", "4", 1);
  dictionary.set("c", "5", 2);
  dictionary.set("d", "6", 100);
  EXPECT_EQ(Value(dictionary), Value(Dictionary{{"a", "4"}, {"b", "3"}, {"c", "5"}, {"d", "6"}}));
}

TEST(DictionaryTest, AllEntriesAreExchangedAtOnce) {
  Dictionary dictionary{{"a", "1"}, {"b", "2"}};
  std::vector<Value> keys{"c"};
  std::vector<Value> values{"3"};
  dictionary.swapEntries(keys, values);
  EXPECT_EQ(Value(dictionary), Value(Dictionary{{"c", "3"}}));
  EXPECT_THAT(keys, ElementsAre(Value("a"), Value("b")));
  EXPECT_THAT(values, ElementsAre(Value("1"), Value("2")));
  Dictionary empty;
  empty.swapEntries(keys, values);
  EXPECT_EQ(Value(empty), Value(Dictionary{{"a", "1"}, {"b", "2"}}));
  EXPECT_TRUE(keys.empty() && values.empty());
}

TEST(DictionaryTest, ExchangingEntriesLeavesSharedKeysAlone) {
  Dictionary first{{"a", "1"}};
  const Dictionary second = first.copy();
  std::vector<Value> keys{"c"};
  std::vector<Value> values{"3"};
  first.swapEntries(keys, values);
  EXPECT_EQ(Value(first), Value(Dictionary{{"c", "3"}}));
  EXPECT_EQ(Value(second), Value(Dictionary{{"a", "1"}}));
  EXPECT_TRUE(keys.empty());
}

TEST(DictionaryTest, ManyExchangedEntriesAreFound) {
  constexpr int kSize = 1000;
  Dictionary dictionary = largeDictionary(2 * kSize);
  std::vector<Value> keys;
  std::vector<Value> values;
  for (int i = kSize; i < 2 * kSize; ++i) {
    keys.emplace_back(numbered(i));
    values.push_back(Value::integer(-i));
  }
  dictionary.swapEntries(keys, values);
  for (int i = kSize; i < 2 * kSize; ++i) EXPECT_EQ(dictionary[numbered(i)], Value::integer(-i));
  EXPECT_TRUE(dictionary[numbered(1)].isNull());
}

TEST(DictionaryTest, RowsOfATableShareTheirKeysUntilOneChanges) {
  const KeyList keys{"Cell", "RSRP"};
  Dictionary first(keys);
  Dictionary second(keys);
  first.setValueAt(0, "1");
  second.set("RSRP", "-80");
  EXPECT_EQ(&first.keyAt(0), &second.keyAt(0));
  second.set("RSRQ", "-9");
  EXPECT_NE(&first.keyAt(0), &second.keyAt(0));
  EXPECT_THAT(keysOf(first), ElementsAre("Cell", "RSRP"));
  EXPECT_THAT(keysOf(second), ElementsAre("Cell", "RSRP", "RSRQ"));
  EXPECT_EQ(second["RSRP"], Value("-80"));
  EXPECT_TRUE(first["RSRP"].isNull());
}

TEST(DictionaryTest, TheValuesOfARowAreForItsOnlyHolderToWriteOver) {
  const KeyList keys{"Cell", "RSRP"};
  Value row = Dictionary(keys, {"1", "-80"});
  const std::span<Value> values = row.soleRow(keys);
  ASSERT_EQ(values.size(), 2U);
  values[1] = "-90";
  EXPECT_EQ(row, Value(Dictionary{{"Cell", "1"}, {"RSRP", "-90"}}));
  EXPECT_TRUE(row.soleRow(KeyList{"Cell", "RSRP"}).empty()) << "equal keys are another list";
  {
    const Value second = row;
    EXPECT_TRUE(row.soleRow(keys).empty());
  }
  {
    const WeakValue watcher(row);
    EXPECT_TRUE(row.soleRow(keys).empty());
  }
  EXPECT_EQ(row.soleRow(keys).size(), 2U);
  row.dictionary().set("RSRQ", "-9");
  EXPECT_TRUE(row.soleRow(keys).empty());
  EXPECT_TRUE(Value("text").soleRow(keys).empty());
  EXPECT_TRUE(Value(Array()).soleRow(keys).empty());
}

TEST(DictionaryTest, RemovingFromARowLeavesTheOthersTheirKeys) {
  const KeyList keys{"Cell", "RSRP"};
  const Dictionary first(keys);
  Dictionary second(keys);
  EXPECT_TRUE(second.remove("Cell"));
  EXPECT_THAT(keysOf(first), ElementsAre("Cell", "RSRP"));
  EXPECT_THAT(keysOf(second), ElementsAre("RSRP"));
}

TEST(DictionaryTest, ARowOfManyKeysFindsThemAfterItsListBecameItsOwn) {
  Dictionary original = largeDictionary(100);
  Dictionary copy = original.copy();
  copy.set("another", "x");
  EXPECT_TRUE(original.remove(numbered(0)));
  EXPECT_EQ(copy.size(), 101U);
  EXPECT_EQ(copy[numbered(0)], Value::integer(0));
  EXPECT_EQ(copy[numbered(99)], Value::integer(99));
  EXPECT_EQ(original[numbered(99)], Value::integer(99));
}

TEST(DictionaryTest, ACopyHasItsOwnEntriesButSharesContainers) {
  const Dictionary original{{"a", "1"}, {"rows", Array{}}};
  Dictionary copy = original.copy();
  copy.set("a", "2");
  copy["rows"].array().append("row");
  EXPECT_EQ(original["a"], Value("1"));
  EXPECT_EQ(original["rows"].array().size(), 1U);
}

TEST(DictionaryTest, ClearingKeepsTheContainer) {
  Dictionary dictionary{{"a", "1"}};
  const Dictionary same = dictionary;  // NOLINT(performance-unnecessary-copy-initialization)
  dictionary.clear();
  EXPECT_TRUE(same.empty());
  dictionary.set("b", "2");
  EXPECT_THAT(keysOf(same), ElementsAre("b"));
}

TEST(DictionaryTest, AKeyOfItsOwnMayBeSetAgain) {
  Dictionary dictionary{{"a key of more than fifteen bytes", "1"}};
  dictionary.set(dictionary.keyAt(0), dictionary.valueAt(0));
  dictionary.set(dictionary.valueAt(0), dictionary.keyAt(0));
  EXPECT_THAT(keysOf(dictionary), ElementsAre("a key of more than fifteen bytes", "1"));
}

// --- Arrays

TEST(ArrayTest, ElementsKeepTheirOrder) {
  Array array{"a", "b"};
  array.append("c");
  EXPECT_THAT(array.elements(), ElementsAre(Value("a"), Value("b"), Value("c")));
}

TEST(ArrayTest, ANullHandleReadsAsEmptyAndIgnoresWrites) {
  Array array = Array::null();
  array.append("a");
  array.reserve(10);
  array.removeFirst(1);
  array.clear();
  EXPECT_TRUE(array.empty());
  EXPECT_TRUE(array.copy().empty());
}

TEST(ArrayTest, RemoveFirstTakesThatManyOrAll) {
  Array array{"a", "b", "c"};
  array.removeFirst(2);
  EXPECT_THAT(array.elements(), ElementsAre(Value("c")));
  array.removeFirst(5);
  EXPECT_TRUE(array.empty());
}

TEST(ArrayTest, GivesItsElementsAway) {
  Array array{"a", "b"};
  EXPECT_THAT(array.take(), ElementsAre(Value("a"), Value("b")));
  EXPECT_TRUE(array.empty());
  EXPECT_THAT(Array::null().take(), ElementsAre());
}

TEST(ArrayTest, HandlesShareTheContainer) {
  Array array;
  const Array same = array;  // NOLINT(performance-unnecessary-copy-initialization)
  array.append("x");
  EXPECT_EQ(same.size(), 1U);
  EXPECT_TRUE(same.isSame(array));
  EXPECT_FALSE(array.copy().isSame(array));
}

TEST(ArrayTest, AnElementMayBeAppendedAgain) {
  Array array{"a text of more than fifteen bytes"};
  for (int i = 0; i < 20; ++i) array.append(array[0]);
  EXPECT_EQ(array[20], Value("a text of more than fifteen bytes"));
}

}  // namespace
}  // namespace kestro
