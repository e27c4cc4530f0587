// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <string>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Recordings/StorableValue.h"

namespace kestro {
namespace {

using namespace std::string_view_literals;

/// `levels` arrays inside one another.
Value nested(std::size_t levels) {
  Array value;
  for (std::size_t i = 1; i < levels; ++i) value = Array{value};
  return value;
}

std::size_t levelsOf(const Value& value) {
  return value.isArray() && !value.array().empty() ? 1 + levelsOf(value.array()[0])
                                                   : (value.isArray() ? 1 : 0);
}

TEST(StorableText, OrdinaryTextsStay) {
  for (const std::string_view text : {""sv, "a"sv, "caf\xC3\xA9 <&> \xF0\x9F\x98\x80"sv,
                                      "tab\tline\nreturn\r"sv, "\x7F\xC2\x80\xEF\xBF\xBD"sv}) {
    EXPECT_EQ(storableText(text), text);
  }
}

TEST(StorableText, EveryByteThatIsNoUtf8IsReplaced) {
  EXPECT_EQ(storableText("\xFF"), "\uFFFD");
  EXPECT_EQ(storableText("a\xC3(b\xE4\xB8"), "a\uFFFD(b\uFFFD\uFFFD");
  EXPECT_EQ(storableText("\xED\xA0\x80"), "\uFFFD\uFFFD\uFFFD");  // a surrogate
  EXPECT_EQ(storableText("\xC0\x80 caf\xC3\xA9"), "\uFFFD\uFFFD caf\xC3\xA9");
}

TEST(StorableText, NulAndControlCharactersAreReplaced) {
  EXPECT_EQ(storableText("a\0b"sv), "a\uFFFDb");
  EXPECT_EQ(storableText("\x01\x08\x0B\x0C\x0E\x1B\x1F"),
            "\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD");
}

TEST(StorableText, TheNoncharactersThatXmlForbidsAreReplacedWhole) {
  EXPECT_EQ(storableText("a\xEF\xBF\xBE\xEF\xBF\xBF"), "a\uFFFD\uFFFD");
}

TEST(StorableValue, OneBadTextSpoilsNoOther) {
  EXPECT_EQ(storableValue(Array{"good", "b\xFF\x64", Dictionary{{"k\xFF", "v"}, {"l", "w\0x"sv}}}),
            Value(Array{"good", "b\uFFFDd", Dictionary{{"k\uFFFD", "v"}, {"l", "w\uFFFDx"}}}));
}

TEST(StorableValue, KeysThatBecomeTheSameAreToldApart) {
  EXPECT_EQ(
      storableValue(Dictionary{{"k\xFE", "1"}, {"k\xFF", "2"}, {"k\x01", "3"}}),
      Value(Dictionary{{"k\uFFFD", "1"}, {"k\uFFFD\uFFFD", "2"}, {"k\uFFFD\uFFFD\uFFFD", "3"}}));
}

TEST(StorableValue, OtherKindsOfValuesStay) {
  const Value value = Array{Value::integer(-1),    Value::unsignedInteger(UINT64_MAX),
                            Value::real(0.5),      Value::boolean(true),
                            Value::date(Moment()), Value::data({0x00, 0xFF})};
  EXPECT_EQ(storableValue(value), value);
}

TEST(StorableValue, EntriesThatADisplayLeavesOutAreLeftOut) {
  EXPECT_EQ(storableValue(Dictionary{{"a", Value()}, {Value::integer(1), "b"}, {"c", "d"}}),
            Value(Dictionary{{"c", "d"}}));
}

TEST(StorableValue, ANullElsewhereIsUnknown) {
  EXPECT_EQ(storableValue(Value()), Value("(unknown)"));
  EXPECT_EQ(storableValue(Array{"a", Value()}), Value(Array{"a", "(unknown)"}));
}

TEST(StorableValue, TheLevel129IsUnknown) {
  EXPECT_EQ(storableValue(nested(128)), nested(128));
  const Value cut = storableValue(nested(131));
  EXPECT_EQ(levelsOf(cut), 128U);
  EXPECT_TRUE(createPropertyListCoding()->xml(cut));
}

TEST(StorableValue, IsACopy) {
  Dictionary inner{{"k", "before"}};
  const Value copy = storableValue(Array{inner});
  inner.set("k", "after");
  EXPECT_EQ(copy, Value(Array{Dictionary{{"k", "before"}}}));
}

}  // namespace
}  // namespace kestro
