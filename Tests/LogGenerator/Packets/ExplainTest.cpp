// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "LogGenerator/Packets/Catalogue.h"
#include "LogGenerator/Packets/Explain.h"

namespace kestro {
namespace {

using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr NumberFormat kSumFormat = "%d";

ComputedValue sum(std::span<const std::int64_t> raw) {
  return {.number = static_cast<double>(raw[0] + raw[1]), .format = &kSumFormat};
}

constexpr Field kExplainedFields[] = {
    {"Count", u8(13), hidden()},
    {"Sum", {u8(14), u8(15)}, computed(sum)},
    {"Gone", removed()},
    {"Area", u16(16).bigEndian().bits(4, 11), decimal()},
};
constexpr Field kRecordFields[] = {
    {"ID", u8(0), decimal()},
    {"Odd", u8(1).bits(1, 7), decimal("%d dB")},
};
constexpr ListReading kLists[] = {
    {.table = {.name = "cell", .count = u8(13), .base = 18, .stride = 2, .fields = kRecordFields}}};
constexpr PacketKind kTestPacket = {0x1234, "test packet", 16};
constexpr PacketReading kReadings[] = {{kTestPacket, kExplainedFields, kLists}};
constexpr Section kSection = {.name = "Test", .readings = kReadings};

class ExplainTest : public ::testing::Test {
 protected:
  void explain(const Bytes& packet) {
    values.clear();
    explainReading(kSection, kReadings[0], PacketView(packet),
                   [this](const ExplainedValue& value) { values.push_back(value); });
  }

  static Bytes packet(const Bytes& payload) {
    Bytes bytes(13, 0);
    bytes.insert(bytes.end(), payload.begin(), payload.end());
    return bytes;
  }

  std::vector<std::string_view> keys() {
    std::vector<std::string_view> result;
    for (const ExplainedValue& value : values) result.push_back(value.key);
    return result;
  }

  std::vector<ExplainedValue> values;
};

TEST_F(ExplainTest, VisitsEveryFieldAndRecordInOrder) {
  explain(packet({2, 3, 4, 0xAB, 0xCD, 1, 0x07, 2, 0x09}));
  EXPECT_THAT(keys(),
              ElementsAre("Count", "Sum", "Gone", "Area", "count", "ID", "Odd", "ID", "Odd"));
}

TEST_F(ExplainTest, NamesBytesBitsAndRawValue) {
  explain(packet({1, 3, 4, 0xAB, 0xCD, 9, 0x07}));
  const ExplainedSource& odd = values[6].sources.at(0);
  EXPECT_EQ(odd.offset, 19U);
  EXPECT_EQ(odd.width, 1U);
  EXPECT_EQ(odd.firstBit, 1U);
  EXPECT_EQ(odd.bitCount, 7U);
  EXPECT_EQ(odd.raw, 3);
  EXPECT_FALSE(odd.isPastEnd);
  EXPECT_EQ(values[6].text, Value("3 dB"));
  EXPECT_EQ(values[6].row, 0U);
  EXPECT_EQ(values[6].list, "cell");
}

TEST_F(ExplainTest, ShowsAComputedValueWithEverySource) {
  explain(packet({0, 3, 4}));
  ASSERT_EQ(values[1].sources.size(), 2U);
  EXPECT_EQ(values[1].sources[0].raw, 3);
  EXPECT_EQ(values[1].sources[1].offset, 15U);
  EXPECT_EQ(values[1].text, Value("7"));
}

TEST_F(ExplainTest, ReadsBigEndianPlaces) {
  explain(packet({0, 0, 0, 0xAB, 0xCD}));
  EXPECT_EQ(values[3].sources[0].raw, 0xBC);
  EXPECT_TRUE(values[3].sources[0].isBigEndian);
}

TEST_F(ExplainTest, HasNoTextForHiddenAndRemovedFields) {
  explain(packet({0, 3, 4}));
  EXPECT_TRUE(values[0].text.isNull());
  EXPECT_TRUE(values[2].text.isNull());
  EXPECT_THAT(values[2].sources, IsEmpty());
}

TEST_F(ExplainTest, ACountThatIsStoredAsItIsHasNoText) {
  explain(packet({2, 3, 4, 0xAB, 0xCD, 1, 0x07, 2, 0x09}));
  EXPECT_EQ(values[4].sources.at(0).raw, 2);
  EXPECT_TRUE(values[4].text.isNull());
}

TEST_F(ExplainTest, ACountThatIsStoredOtherwiseIsToldInRecords) {
  constexpr ListReading kOneMore[] = {{.table = {.name = "cell",
                                                 .count = u8(13),
                                                 .countAddend = 1,
                                                 .base = 14,
                                                 .stride = 2,
                                                 .fields = kRecordFields}}};
  const PacketKind shortPacket = {0x1234, "test packet", 14};
  const PacketReading reading = {shortPacket, {}, kOneMore};
  const Bytes bytes = packet({1, 7, 0x07, 8, 0x09});
  explainReading(kSection, reading, PacketView(bytes),
                 [this](const ExplainedValue& value) { values.push_back(value); });
  EXPECT_THAT(keys(), ElementsAre("count", "ID", "Odd", "ID", "Odd"));
  EXPECT_EQ(values[0].sources.at(0).raw, 1);
  EXPECT_EQ(values[0].text, Value("2"));
}

TEST_F(ExplainTest, MarksWhatLiesPastTheEnd) {
  explain(packet({2, 3, 4, 0xAB, 0xCD, 1}));
  EXPECT_FALSE(values[5].sources[0].isPastEnd);
  EXPECT_TRUE(values[6].sources[0].isPastEnd);
  EXPECT_TRUE(values[7].sources[0].isPastEnd);
  EXPECT_EQ(values[7].text, Value("0"));
}

TEST_F(ExplainTest, MarksAPlaceThatIsCutOff) {
  explain(packet({0, 3, 4, 0xAB}));
  EXPECT_TRUE(values[3].sources[0].isPastEnd);
}

TEST_F(ExplainTest, SaysNothingOfAPacketThatIsTooShort) {
  explain(packet({1, 2}));
  EXPECT_THAT(values, IsEmpty());
}

TEST(CatalogueTest, ListsKeysOnceAndHiddenOnesNever) {
  const CatalogueEntry entry = catalogueReading(kSection, kReadings[0]);
  EXPECT_EQ(entry.code, 0x1234U);
  EXPECT_EQ(entry.packetName, "test packet");
  EXPECT_EQ(entry.minimumLength, 16U);
  EXPECT_EQ(entry.section, "Test");
  std::vector<std::string_view> keys;
  for (const CatalogueKey& key : entry.keys) keys.push_back(key.key);
  EXPECT_THAT(keys, ElementsAre("Sum", "Gone", "Area", "ID", "Odd"));
  EXPECT_THAT(entry.keys, Each(::testing::Field(&CatalogueKey::isKept, false)));
  EXPECT_THAT(entry.shorterKeys, IsEmpty());
}

TEST(CatalogueTest, SaysWhereEachKeyComesFrom) {
  const CatalogueEntry entry = catalogueReading(kSection, kReadings[0]);
  EXPECT_THAT(entry.keys[2].fields, ElementsAre(&kExplainedFields[3]));
  EXPECT_EQ(entry.keys[2].table, nullptr);
  EXPECT_THAT(entry.keys[3].fields, ElementsAre(&kRecordFields[0]));
  EXPECT_EQ(entry.keys[3].table, &kLists[0].table);
}

constexpr Field kChoice[] = {
    {"Level", u8(14), decimal(), when(equals(u8(13), 0))},
    {"Level", s8(14), decimal(), when(equals(u8(13), 1))},
    {"Kind", u8(13).shared(), hidden()},
};

TEST(CatalogueTest, HasEveryFieldThatConditionsChooseBetween) {
  const std::vector<CatalogueKey> keys = catalogueFields(kChoice);
  ASSERT_EQ(keys.size(), 1U);
  EXPECT_EQ(keys[0].key, "Level");
  EXPECT_THAT(keys[0].fields, ElementsAre(&kChoice[0], &kChoice[1]));
}

constexpr ListReading kNotedLists[] = {{.table = kLists[0].table, .use = RowsUse::Noted}};
constexpr PacketReading kNotedReading = {kTestPacket, {}, kNotedLists};

TEST(CatalogueTest, ListsRowsThatAreOnlyNotedAsKept) {
  const CatalogueEntry entry = catalogueReading(kSection, kNotedReading);
  EXPECT_THAT(entry.keys, ElementsAre(::testing::Field(&CatalogueKey::key, "ID"),
                                      ::testing::Field(&CatalogueKey::key, "Odd")));
  EXPECT_THAT(entry.keys, Each(::testing::Field(&CatalogueKey::isKept, true)));
}

constexpr ListReading kDroppedLists[] = {{.table = kLists[0].table, .use = RowsUse::Dropped}};
constexpr PacketReading kDroppedReading = {kTestPacket, {}, kDroppedLists};

TEST(CatalogueTest, ListsNoKeysOfRowsThatAreDropped) {
  EXPECT_THAT(catalogueReading(kSection, kDroppedReading).keys, IsEmpty());
}

constexpr ListReading kPlainLists[] = {
    {.table = kLists[0].table, .key = "Frequencies", .isPlain = true}};
constexpr PacketReading kPlainReading = {kTestPacket, {}, kPlainLists};

TEST(CatalogueTest, PlainTextsHaveAListAndNoKeys) {
  const CatalogueEntry entry = catalogueReading(kSection, kPlainReading);
  EXPECT_THAT(entry.keys, Each(::testing::Field(&CatalogueKey::list, "Frequencies")));
  EXPECT_THAT(entry.keys, Each(::testing::Field(&CatalogueKey::key, "")));
}

constexpr Field kShorterFields[] = {{"Area", u8(14), decimal()}};
constexpr PacketKind kShortPacket = {0x1234, "short test packet", 0};
constexpr PacketKind kOtherPacket = {0x1235, "other", 0};
constexpr PacketReading kTwoReadings[] = {
    kReadings[0], {kShortPacket, kShorterFields}, {kOtherPacket, kChoice}};
constexpr Section kShortSection = {.name = "Test", .readings = kTwoReadings};

TEST(CatalogueTest, ListsWhatAShorterPacketWrites) {
  const CatalogueEntry entry = catalogueReading(kShortSection, kTwoReadings[0]);
  EXPECT_EQ(entry.minimumLength, 16U);
  EXPECT_EQ(entry.keys.size(), 5U);
  ASSERT_EQ(entry.shorterKeys.size(), 1U);
  EXPECT_EQ(entry.shorterKeys[0].key, "Area");
  EXPECT_THAT(entry.shorterKeys[0].fields, ElementsAre(&kShorterFields[0]));
}

TEST(CatalogueTest, APacketOfWhichNothingIsTakenHasNoName) {
  const PacketReading reading = {.packet = kTestPacket};
  const CatalogueEntry entry = catalogueReading(kSection, reading);
  EXPECT_EQ(entry.code, 0x1234U);
  EXPECT_EQ(entry.packetName, "");
  EXPECT_EQ(entry.minimumLength, 0U);
}

TEST(SectionTest, WantsEachCodeOnceAndThatOfItsPropertyListLast) {
  const PacketKind packet = {.code = 0xFF0001};
  const PropertyListReading list = {.packet = packet, .part = ListedPart::Root};
  EXPECT_THAT(codesOf(kShortSection), ElementsAre(0x1234, 0x1235));
  EXPECT_THAT(codesOf({.name = "Test", .readings = kTwoReadings, .propertyList = &list}),
              ElementsAre(0x1234, 0x1235, 0xFF0001));
}

}  // namespace
}  // namespace kestro
