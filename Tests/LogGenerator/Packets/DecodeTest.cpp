// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Decode.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using testing::entriesOf;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

constexpr NamedValue kFieldNames[] = {{1, "One"}};

constexpr Field kFields[] = {
    {"Hidden", u8(0), hidden()},
    {"Number", u8(1), decimal()},
    {"Wide", u32(2), decimal("%u")},
    {"Name", u8(6), named(kFieldNames, "Other")},
};

// --- Filling a dictionary ------------------------------------------------------------------------

class FillTest : public ::testing::Test {
 protected:
  void fill(std::span<const Field> fields, const Bytes& bytes) {
    BoundFields bound(fields);
    bound.fill(section, PacketView(bytes));
  }

  Dictionary section;
};

TEST_F(FillTest, WritesShownFieldsInTheLayoutsOrder) {
  fill(kFields, {9, 200, 1, 0, 0, 0xF0, 1});
  EXPECT_THAT(entriesOf(section),
              ElementsAre(Pair("Number", "200"), Pair("Wide", "4026531841"), Pair("Name", "One")));
}

TEST_F(FillTest, KeysThatAreThereKeepTheirPlace) {
  section = {{"Name", "old"}, {"Else", "kept"}, {"Number", "old"}};
  BoundFields bound(kFields);
  for (const std::uint8_t number : {std::uint8_t{1}, std::uint8_t{2}}) {
    const Bytes bytes = {0, number};
    bound.fill(section, PacketView(bytes));
    EXPECT_THAT(entriesOf(section),
                ElementsAre(Pair("Name", "Other"), Pair("Else", "kept"),
                            Pair("Number", std::to_string(number)), Pair("Wide", "0")));
  }
}

TEST_F(FillTest, FindsItsKeysAfterOthersChangedTheDictionary) {
  BoundFields bound(kFields);
  const Bytes bytes = {0, 1};
  bound.fill(section, PacketView(bytes));
  section.remove("Number");
  bound.fill(section, PacketView(bytes));
  EXPECT_THAT(entriesOf(section),
              ElementsAre(Pair("Wide", "0"), Pair("Name", "Other"), Pair("Number", "1")));
  Dictionary another;
  bound.fill(another, PacketView(bytes));
  EXPECT_THAT(entriesOf(another),
              ElementsAre(Pair("Number", "1"), Pair("Wide", "0"), Pair("Name", "Other")));
}

TEST_F(FillTest, RemovesKeysWhereTheLayoutSaysSo) {
  constexpr Field kRemoving[] = {{"A", u8(0), decimal()}, {"Gone", removed()}};
  section = {{"Gone", "x"}, {"B", "y"}};
  fill(kRemoving, {5});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("B", "y"), Pair("A", "5")));
  fill(kRemoving, {6});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("B", "y"), Pair("A", "6")));
}

TEST_F(FillTest, LeavesKeysOfFieldsWhoseConditionFails) {
  constexpr Field kConditional[] = {{"A", u8(1), decimal(), when(between(u8(0), 2, 3))}};
  fill(kConditional, {2, 7});
  fill(kConditional, {4, 8});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("A", "7")));
}

TEST_F(FillTest, MayShowATextWhereTheConditionFails) {
  constexpr Field kConditional[] = {
      {"A", u8(1), decimal(), when(equals(u8(0), 1)).elseText("none")}};
  fill(kConditional, {1, 7});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("A", "7")));
  fill(kConditional, {0, 7});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("A", "none")));
}

TEST_F(FillTest, ShowsAnArrayOfEachPlace) {
  constexpr Field kEach[] = {{"A", {u8(2), u8(0), s8(1)}, eachDecimal()}};
  fill(kEach, {10, 0xFF, 12});
  EXPECT_EQ(section["A"], Value(Array{"12", "10", "-1"}));
}

TEST_F(FillTest, LeavesADictionaryThatIsNoneAlone) {
  Dictionary none = Dictionary::null();
  BoundFields bound(kFields);
  bound.fill(none, {});
  EXPECT_TRUE(none.isNull());
}

// --- Building rows -------------------------------------------------------------------------------

constexpr Place kKind = u8(1);
constexpr Field kRecord[] = {
    {"ID", u8(0), decimal()},
    {"Kind", kKind, decimal()},
    {"Left", u8(2), decimal("L%d"), when(equals(kKind, 1))},
    {"Right", u8(2), decimal("R%d"), when(equals(kKind, 2))},
};
static_assert(isLayout(kRecord));
constexpr ListReading kList = {
    .table = {.name = "record", .count = u8(0), .base = 1, .stride = 3, .fields = kRecord}};
constexpr ListReading kPlain = {
    .table = {.name = "record", .count = u8(0), .base = 1, .stride = 3, .fields = kRecord},
    .isPlain = true};

std::vector<Value> rowsOf(const ListReading& reading, const Bytes& bytes) {
  return BoundTable(reading).rows(PacketView(bytes));
}

TEST(RowsTest, ShowTheFieldsOfEachRecord) {
  const auto rows = rowsOf(kList, {3, 10, 1, 50, 11, 2, 51, 12, 3, 52});
  ASSERT_THAT(rows, SizeIs(3));
  EXPECT_THAT(entriesOf(rows[0].dictionary()),
              ElementsAre(Pair("ID", "10"), Pair("Kind", "1"), Pair("Left", "L50")));
  EXPECT_THAT(entriesOf(rows[1].dictionary()),
              ElementsAre(Pair("ID", "11"), Pair("Kind", "2"), Pair("Right", "R51")));
  EXPECT_THAT(entriesOf(rows[2].dictionary()), ElementsAre(Pair("ID", "12"), Pair("Kind", "3")));
}

TEST(RowsTest, MayBePlainTexts) {
  EXPECT_THAT(rowsOf(kPlain, {2, 10, 0, 0, 11}), ElementsAre(Value("10"), Value("11")));
  EXPECT_THAT(rowsOf(kPlain, {0}), IsEmpty());
}

TEST(RowsTest, RowsOfTheSameFieldsShareTheirKeysUntilOneChanges) {
  BoundTable table(kList);
  const Bytes bytes = {3, 10, 1, 50, 11, 2, 51, 12, 1, 52};
  const auto rows = table.rows(PacketView(bytes));
  Dictionary first = rows[0].dictionary();
  first.set("BSIC", "7");
  first.remove("ID");
  EXPECT_THAT(entriesOf(first),
              ElementsAre(Pair("Kind", "1"), Pair("Left", "L50"), Pair("BSIC", "7")));
  EXPECT_THAT(entriesOf(rows[2].dictionary()),
              ElementsAre(Pair("ID", "12"), Pair("Kind", "1"), Pair("Left", "L52")));
}

TEST(RowsTest, UseEarlierRowsButNotThoseThatSomebodyElseHolds) {
  BoundTable table(kList);
  const Bytes first = {3, 10, 1, 50, 11, 1, 51, 12, 1, 52};
  auto rows = table.rows(PacketView(first));
  const Dictionary held = rows[1].dictionary();
  const Bytes second = {2, 20, 1, 60, 21, 1, 61};
  rows = table.rows(PacketView(second), std::move(rows));
  ASSERT_THAT(rows, SizeIs(2));
  EXPECT_THAT(entriesOf(rows[0].dictionary()),
              ElementsAre(Pair("ID", "20"), Pair("Kind", "1"), Pair("Left", "L60")));
  EXPECT_THAT(entriesOf(rows[1].dictionary()),
              ElementsAre(Pair("ID", "21"), Pair("Kind", "1"), Pair("Left", "L61")));
  EXPECT_THAT(entriesOf(held),
              ElementsAre(Pair("ID", "11"), Pair("Kind", "1"), Pair("Left", "L51")));
}

TEST(RowsTest, ReplaceEarlierRowsOfOtherFields) {
  BoundTable table(kList);
  const Bytes first = {2, 10, 1, 50, 11, 3, 51};
  auto rows = table.rows(PacketView(first));
  const Bytes second = {3, 20, 3, 60, 21, 2, 61, 22, 1, 62};
  rows = table.rows(PacketView(second), std::move(rows));
  EXPECT_THAT(entriesOf(rows[0].dictionary()), ElementsAre(Pair("ID", "20"), Pair("Kind", "3")));
  EXPECT_THAT(entriesOf(rows[1].dictionary()),
              ElementsAre(Pair("ID", "21"), Pair("Kind", "2"), Pair("Right", "R61")));
  EXPECT_THAT(entriesOf(rows[2].dictionary()),
              ElementsAre(Pair("ID", "22"), Pair("Kind", "1"), Pair("Left", "L62")));
}

TEST(RowsTest, ReplaceWhateverStoodInTheirPlace) {
  BoundTable table(kList);
  const Bytes bytes = {1, 10, 3};
  const auto rows = table.rows(PacketView(bytes), {"text", Dictionary{{"A", "1"}}, Array()});
  ASSERT_THAT(rows, SizeIs(1));
  EXPECT_THAT(entriesOf(rows[0].dictionary()), ElementsAre(Pair("ID", "10"), Pair("Kind", "3")));
}

// --- Values from elsewhere -----------------------------------------------------------------------

constexpr Field kSuppliedRecord[] = {
    {"ID", u8(0), decimal()},
    {"Name", supplied()},
    {"Level", u8(1), decimal()},
};
constexpr ListReading kSuppliedList = {
    .table = {.name = "record", .count = u8(0), .base = 1, .stride = 2, .fields = kSuppliedRecord}};

/// Knows a name for records whose first byte is 7.
class SevenSupplier : public FieldSupplier {
 public:
  [[nodiscard]] Value supply(const Field& field, PacketView packet,
                             const RecordPosition& position) const override {
    return packet.u8(position.here) == 7 ? Value(field.key) : Value();
  }
};

TEST(RowsTest, TakeSuppliedValuesWhereTheirKeyStands) {
  const SevenSupplier supplier;
  BoundTable table(kSuppliedList);
  const Bytes bytes = {2, 7, 1, 8, 2};
  const auto rows = table.rows(PacketView(bytes), {}, &supplier);
  EXPECT_THAT(entriesOf(rows[0].dictionary()),
              ElementsAre(Pair("ID", "7"), Pair("Name", "Name"), Pair("Level", "1")));
  EXPECT_THAT(entriesOf(rows[1].dictionary()), ElementsAre(Pair("ID", "8"), Pair("Level", "2")));
}

TEST(RowsTest, LeaveSuppliedKeysOutWithoutASupplier) {
  EXPECT_THAT(entriesOf(rowsOf(kSuppliedList, {1, 7, 1})[0].dictionary()),
              ElementsAre(Pair("ID", "7"), Pair("Level", "1")));
}

TEST_F(FillTest, LeavesSuppliedKeysAlone) {
  section = {{"Name", "kept"}};
  fill(kSuppliedRecord, {7, 1});
  EXPECT_THAT(entriesOf(section),
              ElementsAre(Pair("Name", "kept"), Pair("ID", "7"), Pair("Level", "1")));
}

// --- Kept and unkept texts -----------------------------------------------------------------------

TEST_F(FillTest, ShowsWideNumbersBelowAndAboveTheKeptOnes) {
  constexpr Field kWide[] = {{"A", u32(0), decimal()}, {"B", s32(0).shared(), decimal("%d dB")}};
  fill(kWide, {0xFF, 0xFF, 0, 0});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("A", "65535"), Pair("B", "65535 dB")));
  fill(kWide, {0, 0, 1, 0});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("A", "65536"), Pair("B", "65536 dB")));
  fill(kWide, {0xFE, 0xFF, 0xFF, 0xFF});
  EXPECT_THAT(entriesOf(section), ElementsAre(Pair("A", "-2"), Pair("B", "-2 dB")));
}

std::int64_t product(std::span<const std::int64_t> raw) { return raw[0] * raw[1]; }

TEST_F(FillTest, ShowsTheNumberThatSeveralPlacesMake) {
  constexpr Field kProduct[] = {{"A", {s16(0), s16(2)}, decimal("%d x", 1).of(product)}};
  const auto shown = [&](const Bytes& bytes) {
    fill(kProduct, bytes);
    return std::string(section["A"].text());
  };
  EXPECT_EQ(shown({7, 0, 0xFE, 0xFF}), "-13 x");
  EXPECT_EQ(shown({0xFF, 0x7F, 1, 0}), "32768 x");  // the last one kept
  EXPECT_EQ(shown({0, 0x40, 2, 0}), "32769 x");     // the first one above
  EXPECT_EQ(shown({0, 0x80, 1, 0}), "-32767 x");    // the lowest one kept
  EXPECT_EQ(shown({0x01, 0x80, 2, 0}), "-65533 x");
}

TEST_F(FillTest, ObeysTheConditionOfANumberThatSeveralPlacesMake) {
  constexpr Field kProduct[] = {
      {"A", {u8(0), u8(1)}, decimal().of(product), when(equals(u8(2), 1)).elseText("none")}};
  fill(kProduct, {2, 3, 1});
  EXPECT_EQ(section["A"], Value("6"));
  fill(kProduct, {2, 3, 0});
  EXPECT_EQ(section["A"], Value("none"));
}

TEST(RowsTest, ThrowPastTheBoundsCount) {
  ListReading reading = kList;
  reading.table.boundsCount = u8(1);
  EXPECT_THROW(rowsOf(reading, {2, 1}), ArrayOutOfBoundsException);
}

TEST(RowsTest, RecordsPastTheEndReadAsZero) {
  const auto rows = rowsOf(kList, {255, 10, 1});
  ASSERT_THAT(rows, SizeIs(255));
  EXPECT_THAT(entriesOf(rows[0].dictionary()),
              ElementsAre(Pair("ID", "10"), Pair("Kind", "1"), Pair("Left", "L0")));
  EXPECT_THAT(entriesOf(rows[254].dictionary()), ElementsAre(Pair("ID", "0"), Pair("Kind", "0")));
}

}  // namespace
}  // namespace kestro
