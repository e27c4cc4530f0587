// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "CommandLine/Formats/LayoutText.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;

TEST(LogCodeText, HasFourHexadecimalDigitsAtLeast) {
  EXPECT_EQ(logCodeText(0xB17F), "0xB17F");
  EXPECT_EQ(logCodeText(0x108A), "0x108A");
  EXPECT_EQ(logCodeText(0x5), "0x0005");
  EXPECT_EQ(logCodeText(0xFF0001), "0xFF0001");
}

TEST(PlaceText, NamesIntegerOffsetAndBits) {
  EXPECT_EQ(placeText(u16(19), false), "u16 at 19");
  EXPECT_EQ(placeText(s8(4), false), "s8 at 4");
  EXPECT_EQ(placeText(u16(19).bits(0, 8), false), "u16 at 19, bits 0-8");
  EXPECT_EQ(placeText(u32(29).bit(25), false), "u32 at 29, bit 25");
  EXPECT_EQ(placeText(u24(38).bigEndian(), false), "u24 at 38, big-endian");
}

TEST(PlaceText, CountsFromTheRecordWithinARecord) {
  EXPECT_EQ(placeText(s8(4), true), "s8 at +4");
  EXPECT_EQ(placeText(u32(32).ofTwin(), true), "u32 at +32 of the twin record");
  EXPECT_EQ(placeText(s16(13).ofPacket(), true), "s16 at 13 of the packet");
}

TEST(RuleText, IsAFormatAfterAFormula) {
  EXPECT_EQ(ruleText(decimal()), "%d");
  EXPECT_EQ(ruleText(decimal("%d dBm", -30)), "x - 30 as %d dBm");
  EXPECT_EQ(ruleText(decimal("%d dBm", -140, 2)), "2x - 140 as %d dBm");
  EXPECT_EQ(ruleText(decimal("%d dB", 0, 2)), "2x as %d dB");
  EXPECT_EQ(ruleText(decimal("%d", 6)), "x + 6 as %d");
  EXPECT_EQ(ruleText(scaled("%4.2f dBm", -140, 0.25)), "0.25x - 140 as %4.2f dBm");
  EXPECT_EQ(ruleText(scaled("%+.2f dBm", -63.248, 0.334)), "0.334x - 63.248 as %+.2f dBm");
  EXPECT_EQ(ruleText(scaled("%f dB", 0, 0.5)), "0.5x as %f dB");
  EXPECT_EQ(ruleText(decimal("0x%06x")), "0x%06x");
}

constexpr NamedValue kNames[] = {{0, "Idle"}, {3, "Busy"}};

TEST(RuleText, ListsTheTextsOfATable) {
  EXPECT_EQ(ruleText(named(kNames, "Unknown")), "0: Idle; 3: Busy; else Unknown");
  EXPECT_EQ(ruleText(named({}, "Unknown")), "Unknown");
  EXPECT_EQ(ruleText(namedElse(kNames, "[Reserved %d]")), "0: Idle; 3: Busy; else [Reserved %d]");
}

std::int64_t sum(std::span<const std::int64_t> raw) { return raw[0] + raw[1]; }
constexpr NumberFormat kFormat = "%d";
ComputedValue value(std::span<const std::int64_t>) { return {0, &kFormat}; }

TEST(RuleText, SaysWhatNoFormulaCan) {
  EXPECT_EQ(ruleText(decimal().absentAt(64, "Not Present")), "%d; 64: Not Present");
  EXPECT_EQ(ruleText(decimal().absentAt(32767, "")), "%d; 32767: nothing");
  EXPECT_EQ(ruleText(decimal("%d dB").of(sum)), "computed, %d dB");
  EXPECT_EQ(ruleText(computed(value)), "computed");
  EXPECT_EQ(ruleText(eachDecimal()), "a list of all, each %d");
  EXPECT_EQ(ruleText(supplied()), "known from another packet");
  EXPECT_EQ(ruleText(hidden()), "as it is");
  EXPECT_EQ(ruleText(removed()), "taken out of the section");
}

constexpr Field kLevels[] = {
    {"Level", u8(2), decimal("%d dBm"), when(equals(u8(1).bits(0, 3), 1)).elseText("N/A")},
    {"Level", u8(2), decimal("%d dB"), when(between(u8(1).bits(0, 3), 2, 4))},
    {"Sum", {u8(5), u8(6)}, decimal().of(sum)},
};
constexpr RecordTable kTable = {
    .name = "cell", .count = u8(15), .base = 16, .stride = 9, .fields = kLevels};

TEST(KeyText, HasEveryPlaceAndEveryCondition) {
  const std::vector<CatalogueKey> keys = catalogueFields(kLevels, "Cells", &kTable);
  ASSERT_EQ(keys.size(), 2U);
  EXPECT_EQ(sourcesText(keys[0]), "u8 at +2");
  EXPECT_EQ(shownText(keys[0]),
            "%d dBm when (u8 at +1, bits 0-3) is 1, else N/A; or "
            "%d dB when (u8 at +1, bits 0-3) is 2 to 4");
  EXPECT_EQ(sourcesText(keys[1]), "u8 at +5; u8 at +6");
}

constexpr NamedValue kThreeNames[] = {{0, "A"}, {1, "B"}, {2, "C"}};
constexpr NamedValue kFourNames[] = {{0, "A"}, {1, "B"}, {2, "C"}, {3, "D"}};
constexpr NamedValue kTwoNames[] = {{0, "A"}, {1, "B"}};
constexpr Place kTwoBits = u8(3).bits(5, 6);

std::string shownTextOf(const Field& field) {
  return shownText({.key = field.key, .fields = {&field}});
}

TEST(KeyText, HasNoElseWhereEveryValueHasAName) {
  EXPECT_EQ(shownTextOf({"S", kTwoBits, named(kFourNames, "X")}), "0: A; 1: B; 2: C; 3: D");
  EXPECT_EQ(shownTextOf({"S", u8(3).bit(7), named(kTwoNames, "X")}), "0: A; 1: B");
  EXPECT_EQ(shownTextOf({"S", kTwoBits, named(kThreeNames, ""), when(between(kTwoBits, 0, 2))}),
            "0: A; 1: B; 2: C when (u8 at 3, bits 5-6) is 0 to 2");
}

TEST(KeyText, HasAnElseWhereAValueHasNoName) {
  EXPECT_EQ(shownTextOf({"S", kTwoBits, named(kThreeNames, "X")}), "0: A; 1: B; 2: C; else X");
  EXPECT_EQ(shownTextOf({"S", kTwoBits, named(kThreeNames, "X"), when(between(kTwoBits, 1, 3))}),
            "0: A; 1: B; 2: C; else X when (u8 at 3, bits 5-6) is 1 to 3");
  EXPECT_EQ(shownTextOf({"S", kTwoBits, named(kThreeNames, "X"), when(between(u8(9), 0, 2))}),
            "0: A; 1: B; 2: C; else X when (u8 at 9) is 0 to 2");
  EXPECT_EQ(shownTextOf({"S", s8(3).bit(0), named(kTwoNames, "X")}), "0: A; 1: B; else X");
}

TEST(KeyText, NamesTheKeyOfAPropertyList) {
  const ListedValue value = {"kTqCellMonitorLAC", "Area", decimal()};
  const CatalogueKey key{.key = "Area", .listed = &value};
  EXPECT_EQ(sourcesText(key), "kTqCellMonitorLAC");
  EXPECT_EQ(shownText(key), "%d");
}

TEST(KeyText, IsEmptyForWhatTheDecoderWorksOut) {
  const CatalogueKey key{.key = "Rate"};
  EXPECT_EQ(sourcesText(key), "");
  EXPECT_EQ(shownText(key), "");
}

TEST(TableText, SaysWhereTheRecordsLie) {
  EXPECT_EQ(tableText(kTable), "one for each cell; count: u8 at 15; from byte 16, 9 bytes each");
  RecordTable table = kTable;
  table.countAddend = 1;
  table.perCount = 6;
  table.counted = u8(27);
  table.keep = equals(u8(8).bits(5, 7), 0);
  EXPECT_EQ(tableText(table),
            "one for each cell; count: u8 at 15 + 1; from byte 16 + 6 x (u8 at 27), 9 bytes each; "
            "only where (u8 at +8, bits 5-7) is 0");
}

TEST(TableText, SaysWhereTheTwinsLie) {
  RecordTable table = kTable;
  table.twinBase = 16;
  table.twinPerCount = 9;
  table.twinStride = 44;
  EXPECT_EQ(tableText(table),
            "one for each cell; count: u8 at 15; from byte 16, 9 bytes each; "
            "twins from byte 16 + 9 x (u8 at 15), 44 bytes each");
}

TEST(RequirementTexts, SayWhatIsMoreThanTheLeastLength) {
  constexpr std::uint8_t kIds[] = {1, 2};
  const Requirement requirements[] = {
      kMinimumLength,
      {Requirement::Kind::ExactLength, ""},
      {Requirement::Kind::HoldsRecords, ""},
      {Requirement::Kind::EndsWithRecords, ""},
      {.kind = Requirement::Kind::Number, .line = "", .condition = between(u8(13), 2, 255)},
      {.kind = Requirement::Kind::SubPackets, .line = "", .subPackets = kIds},
      {.kind = Requirement::Kind::SubPackets, .line = "", .subPackets = std::span(kIds).first(1)}};
  EXPECT_THAT(
      requirementTexts(requirements),
      ElementsAre("exactly that long", "long enough for all its records",
                  "ending with the last of its records", "only where (u8 at 13) is 2 to 255",
                  "with sub-packets 1 and 2", "with sub-packet 1"));
}

TEST(PartText, NamesTheCells) {
  const PacketKind packet = {.code = 0xFF0001, .name = "list"};
  PropertyListReading reading = {.packet = packet,
                                 .part = ListedPart::FirstCell,
                                 .cells = {.technologies = {"A", "B"}, .type = "Serving"}};
  EXPECT_EQ(partText(reading, SectionKind::Dictionary), "from the first Serving of A or B");
  reading.part = ListedPart::EachCell;
  reading.cells.technologies = {"A"};
  EXPECT_EQ(partText(reading, SectionKind::Dictionary), "from every Serving of A");
  EXPECT_EQ(partText(reading, SectionKind::List),
            "a row for every Serving of A; without one the list is empty");
}

}  // namespace
}  // namespace kestro
