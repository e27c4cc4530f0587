// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <iterator>
#include <set>
#include <span>
#include <string>

#include "LogGenerator/Packets/Texts.h"

namespace kestro {
namespace {

constexpr NamedValue kNames[] = {{0, "Zero"}, {3, "Three"}, {-1, "Minus one"}};

std::string textOf(const TextRule& rule, std::int64_t raw) {
  TextBuffer text;
  writeText(rule, raw, text);
  return std::string(text.text());
}

std::int64_t difference(std::span<const std::int64_t> raw) { return raw[0] - raw[1]; }

constexpr NumberFormat kSquared = "%d squared";

ComputedValue sumOfSquares(std::span<const std::int64_t> raw) {
  std::int64_t sum = 0;
  for (const std::int64_t number : raw) sum += number * number;
  return {.number = static_cast<double>(sum), .format = &kSquared};
}

TEST(TextRuleTest, MultipliesAndAddsWholeNumbers) {
  EXPECT_EQ(textOf(decimal(), 1300), "1300");
  EXPECT_EQ(textOf(decimal("%d dBm", -140, 2), 8), "-124 dBm");
  EXPECT_EQ(textOf(decimal("%d dB", 0, -1), 5), "-5 dB");
}

TEST(TextRuleTest, WidensUnsignedNumbersBeforeItCalculates) {
  EXPECT_EQ(textOf(decimal("%d", -30), 0), "-30");
  EXPECT_EQ(textOf(decimal("%d"), 4294967295), "-1");
}

TEST(TextRuleTest, ScalesInDoublePrecision) {
  EXPECT_EQ(textOf(scaled("%4.2f dBm", -140, 0.25), 165), "-98.75 dBm");
  EXPECT_EQ(textOf(scaled("%4.2f dB", -20, 0.125), 3), "-19.62 dB");
  EXPECT_EQ(textOf(scaled("%f dB", 0, 0.5), -15), "-7.500000 dB");
}

TEST(TextRuleTest, NamesListedValuesOnly) {
  const TextRule rule = named(kNames, "Unknown");
  EXPECT_EQ(textOf(rule, 0), "Zero");
  EXPECT_EQ(textOf(rule, 3), "Three");
  EXPECT_EQ(textOf(rule, -1), "Minus one");
  EXPECT_EQ(textOf(rule, 1), "Unknown");
}

TEST(TextRuleTest, MayFormatValuesThatAreNotListed) {
  const TextRule rule = namedElse(kNames, "[Reserved %d]");
  EXPECT_EQ(textOf(rule, 3), "Three");
  EXPECT_EQ(textOf(rule, 4), "[Reserved 4]");
}

TEST(TextRuleTest, ShowsTheAbsentTextForTheRawValue) {
  EXPECT_EQ(textOf(decimal("%d dBm", -30).absentAt(64, "Not Present"), 64), "Not Present");
  EXPECT_EQ(textOf(decimal("%d dBm", -30).absentAt(64, "Not Present"), 94), "64 dBm");
  EXPECT_EQ(textOf(scaled("%.1f", 0, 0.5).absentAt(0, ""), 0), "");
  EXPECT_EQ(textOf(named(kNames, "?").absentAt(0, "none"), 0), "none");
}

TEST(MakeTextTest, GivesAFunctionAllValues) {
  const std::int64_t raw[] = {2, -3, 1};
  EXPECT_EQ(makeText(computed(sumOfSquares), raw), Value("14 squared"));
}

TEST(MakeTextTest, ShowsTheNumberOfAllValues) {
  const std::int64_t raw[] = {2, 100002};
  EXPECT_EQ(makeText(decimal("%d dB", 1).of(difference), raw), Value("-99999 dB"));
  EXPECT_EQ(makeText(decimal().of(difference).absentAt(-100000, "none"), raw), Value("none"));
}

TEST(MakeTextTest, MakesAnArrayOfEachValue) {
  const std::int64_t raw[] = {2, 65535, 0};
  EXPECT_EQ(makeText(eachDecimal(), raw), Value(Array{"2", "65535", "0"}));
}

// --- Kept texts ----------------------------------------------------------------------------------

TEST(TextCacheTest, OfAWiderPlaceKeepsTheTextsOfSixteenBits) {
  const TextCache* cache = TextCache::forField({"A", u16(0), decimal()});
  EXPECT_NE(cache, nullptr);
  EXPECT_EQ(TextCache::forField({"A", u32(0).bits(8, 23), decimal()}), cache);
  EXPECT_EQ(TextCache::forField({"A", u32(0).bits(8, 24), decimal()}), cache);
  EXPECT_EQ(TextCache::forField({"A", u32(0), decimal()}), cache);
  EXPECT_EQ(TextCache::forField({"A", s32(0), decimal()}), cache);
  EXPECT_NE(TextCache::forField({"A", s16(0), decimal()}), cache);
}

TEST(TextCacheTest, OfANumberOfSeveralPlacesKeepsTheTextsOfSixteenBitsSigned) {
  TextCache* cache = TextCache::forField({"A", {u32(0), u32(4)}, decimal("%d dB").of(difference)});
  EXPECT_EQ(TextCache::forField({"A", s16(0), decimal("%d dB")}), cache);
  EXPECT_EQ(cache->text(0xFFFF), Value("-1 dB"));
}

TEST(TextCacheTest, KeepsNoneOfSeveralPlacesOrOfNone) {
  EXPECT_EQ(TextCache::forField({"A", {u8(0), u8(1)}, eachDecimal()}), nullptr);
  EXPECT_EQ(TextCache::forField({"A", {u8(0), u8(1)}, computed(sumOfSquares)}), nullptr);
  EXPECT_EQ(TextCache::forField({"A", removed()}), nullptr);
}

TEST(TextCacheTest, IsSharedByFieldsOfOneRuleAndWidth) {
  const TextCache* cache = TextCache::forField({"A", u16(4).bits(0, 8), decimal("%d dB", -7)});
  EXPECT_EQ(TextCache::forField({"B", u32(20).bits(9, 17), decimal("%d dB", -7)}), cache);
  EXPECT_NE(TextCache::forField({"B", u16(4).bits(0, 7), decimal("%d dB", -7)}), cache);
  EXPECT_NE(TextCache::forField({"B", u16(4).bits(0, 8), decimal("%d dB", -8)}), cache);
  EXPECT_NE(TextCache::forField({"B", u16(4).bits(0, 8), decimal("%d dBm", -7)}), cache);
}

constexpr NamedValue kCacheNames[] = {{0, "Off"}, {1, "On"}};
constexpr NamedValue kSameNames[] = {{0, "Off"}, {1, "On"}};
constexpr NamedValue kOtherTexts[] = {{0, "Off"}, {1, "Up"}};
constexpr NamedValue kOtherValues[] = {{0, "Off"}, {2, "On"}};

ComputedValue alwaysOne(std::span<const std::int64_t> /*raw*/) { return {1, &kSquared}; }
ComputedValue alwaysTwo(std::span<const std::int64_t> /*raw*/) { return {2, &kSquared}; }

TEST(TextCacheTest, IsSharedByRulesThatAreEqualInEveryPartOnly) {
  const auto cacheOf = [](const TextRule& rule) { return TextCache::forField({"A", u8(0), rule}); };
  EXPECT_EQ(cacheOf(named(kCacheNames, "?")), cacheOf(named(kSameNames, "?")));
  const TextRule rules[] = {
      named(kCacheNames, "?"),
      named(kCacheNames, "-"),
      named(kOtherTexts, "?"),
      named(kOtherValues, "?"),
      named(std::span(kCacheNames).first<1>(), "?"),
      namedElse(kCacheNames, "%d"),
      namedElse(kCacheNames, "%u"),
      decimal("%d w"),
      decimal("%d w", 1),
      decimal("%d w", 0, 2),
      decimal("%d w").absentAt(0, ""),
      decimal("%d w").absentAt(1, ""),
      decimal("%d w").absentAt(1, "none"),
      scaled("%f w", 0, 1),
      scaled("%f w", 1, 1),
      scaled("%f w", 0, 2),
      computed(alwaysOne),
      computed(alwaysTwo),
  };
  std::set<TextCache*> caches;
  for (const TextRule& rule : rules) caches.insert(cacheOf(rule));
  EXPECT_EQ(caches.size(), std::size(rules));
}

TEST(TextCacheTest, TellsSignedPlacesFromUnsignedOnes) {
  TextCache* whole = TextCache::forField({"A", u8(0), decimal("%d x")});
  TextCache* two = TextCache::forField({"A", s8(0), decimal("%d x")});
  ASSERT_NE(whole, two);
  EXPECT_EQ(whole->text(0xFF), Value("255 x"));
  EXPECT_EQ(two->text(0xFF), Value("-1 x"));
  EXPECT_EQ(two->text(0x80), Value("-128 x"));
}

TEST(TextCacheTest, TellsAbsentTextsApart) {
  TextCache* shown = TextCache::forField({"A", u8(0), decimal("%d y").absentAt(3, "none")});
  TextCache* empty = TextCache::forField({"A", u8(0), decimal("%d y").absentAt(3, "")});
  EXPECT_EQ(shown->text(3), Value("none"));
  EXPECT_EQ(empty->text(3), Value(""));
  EXPECT_EQ(empty->text(4), Value("4 y"));
}

TEST(TextCacheTest, KnowsEveryValueOfAWidePlace) {
  TextCache* cache = TextCache::forField({"A", u16(0), decimal("%d z")});
  for (std::uint32_t bits = 0; bits < 65536; ++bits) {
    ASSERT_EQ(cache->text(bits), Value(std::to_string(bits) + " z"));
  }
  EXPECT_EQ(&cache->text(65535), &cache->text(65535));
}

}  // namespace
}  // namespace kestro
