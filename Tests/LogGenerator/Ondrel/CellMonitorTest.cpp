// SPDX-License-Identifier: MIT
#include <limits>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

constexpr ListedValue kValues[] = {
    {"kTqCellMonitorARFCN", "ARFCN", decimal(), "Failed: ARFCN\n"},
    {"kTqCellMonitorRSSI", "RSSI", decimal("%d dBm", 0, 2).absentAt(kCellMonitorNotMeasured, ""),
     "Failed: RSSI\n"},
    {"kTqCellMonitorRSSI", "Level", decimal("%d"), ""},
};
constexpr CellKind kNeighbors = {
    {kTqCellMonitorRadioAccessTechnologyUMTS, kTqCellMonitorRadioAccessTechnologyGSM},
    kTqCellMonitorCellTypeNeighbor};

constexpr PropertyListReading reading(ListedPart part) {
  return {kCellMonitorPacket, part, kNeighbors, kValues, kMissingCellArrayLine};
}
constexpr PropertyListReading kFirst = reading(ListedPart::FirstCell);
constexpr PropertyListReading kEach = reading(ListedPart::EachCell);

constexpr Section section(SectionKind kind, const PropertyListReading& list) {
  return {.name = "Cells", .kind = kind, .propertyList = &list};
}
constexpr Section kListSection = section(SectionKind::List, kEach);
constexpr Section kFirstCellSection = section(SectionKind::Dictionary, kFirst);
constexpr Section kEachSection = section(SectionKind::Dictionary, kEach);

Dictionary cell(std::string_view technology, std::string_view type) {
  return {{"kTqCellMonitorCellRadioAccessTechnology", technology},
          {"kTqCellMonitorCellType", type}};
}

Dictionary gsmNeighbor(std::int64_t arfcn, std::int64_t rssi) {
  Dictionary result =
      cell("kTqCellMonitorRadioAccessTechnologyGSM", "kTqCellMonitorCellTypeNeighbor");
  result.set("kTqCellMonitorARFCN", Value::integer(arfcn));
  result.set("kTqCellMonitorRSSI", Value::integer(rssi));
  return result;
}

// --- Numbers and texts ---------------------------------------------------------------------------

TEST(CellNumberTest, IsAnIntegersLowThirtyTwoBitsSigned) {
  const auto numberOf = [](const Value& value) { return cellNumber({{"k", value}}, "k"); };
  EXPECT_EQ(numberOf(Value::integer(-40)), -40);
  EXPECT_EQ(numberOf(Value::integer(2147483647)), 2147483647);
  EXPECT_EQ(numberOf(Value::integer(2147483648)), std::numeric_limits<std::int32_t>::min());
  EXPECT_EQ(numberOf(Value::integer(4294967295)), -1);
  EXPECT_EQ(numberOf(Value::integer(0x1'0000'0007)), 7);
  EXPECT_EQ(numberOf(Value::unsignedInteger(0xFFFF'FFFF'0000'0009)), 9);
}

TEST(CellNumberTest, NothingElseConverts) {
  for (const Value& value :
       {Value::real(1.0), Value::boolean(true), Value("1"), Value::data({1}), Value::date(Moment{}),
        Value(Dictionary()), Value(Array{Value::integer(1)})}) {
    EXPECT_FALSE(cellNumber({{"k", value}}, "k")) << value.typeName();
  }
  EXPECT_FALSE(cellNumber(Dictionary(), "k"));
}

TEST(CellTextTest, WrapsInThirtyTwoBits) {
  const ListedValue doubled{"k", "K", decimal("%d dBm", 0, 2), ""};
  EXPECT_EQ(cellText(doubled, -40), Value("-80 dBm"));
  EXPECT_EQ(cellText(doubled, 1073741824), Value("-2147483648 dBm"));
  EXPECT_EQ(cellText(doubled, -1073741825), Value("2147483646 dBm"));
}

TEST(CellTextTest, ComparesTheAbsentValueWithTheLowSixteenBits) {
  const ListedValue level{"k", "K", decimal("%d dBm").absentAt(kCellMonitorNotMeasured, ""), ""};
  EXPECT_EQ(cellText(level, 32767), Value(""));
  EXPECT_EQ(cellText(level, 0x12347FFF), Value(""));
  EXPECT_EQ(cellText(level, -32769), Value(""));  // 0xFFFF7FFF
  EXPECT_EQ(cellText(level, 32766), Value("32766 dBm"));
  EXPECT_EQ(cellText(level, -1), Value("-1 dBm"));
}

// --- Which cells ---------------------------------------------------------------------------------

TEST(CellKindTest, NeedsTheTechnologyAndTheType) {
  const CellKind kind = {{kTqCellMonitorRadioAccessTechnologyLTE}, kTqCellMonitorCellTypeServing};
  const char* lte = "kTqCellMonitorRadioAccessTechnologyLTE";
  const char* serving = "kTqCellMonitorCellTypeServing";
  EXPECT_TRUE(isCellOfKind(cell(lte, serving), kind));
  EXPECT_FALSE(isCellOfKind(cell("kTqCellMonitorRadioAccessTechnologyGSM", serving), kind));
  EXPECT_FALSE(isCellOfKind(cell(lte, "kTqCellMonitorCellTypeNeighbor"), kind));
  EXPECT_FALSE(isCellOfKind(cell("", serving), kind));
  EXPECT_FALSE(isCellOfKind({{"kTqCellMonitorCellType", serving}}, kind));
  EXPECT_FALSE(isCellOfKind({{"kTqCellMonitorCellRadioAccessTechnology", lte}}, kind));
  EXPECT_FALSE(isCellOfKind({{"kTqCellMonitorCellRadioAccessTechnology", Value::integer(1)},
                             {"kTqCellMonitorCellType", serving}},
                            kind));
}

TEST(CellMonitorKeysTest, AreTheirOwnNames) {
  EXPECT_EQ(kTqCellMonitorCellRadioAccessTechnology, "kTqCellMonitorCellRadioAccessTechnology");
  EXPECT_EQ(kTqCellMonitorRadioAccessTechnologyGSM, "kTqCellMonitorRadioAccessTechnologyGSM");
  EXPECT_EQ(kTqCellMonitorRadioAccessTechnologyUMTS, "kTqCellMonitorRadioAccessTechnologyUMTS");
  EXPECT_EQ(kTqCellMonitorRadioAccessTechnologyUTRAN2, "kTqCellMonitorRadioAccessTechnologyUTRAN2");
  EXPECT_EQ(kTqCellMonitorRadioAccessTechnologyLTE, "kTqCellMonitorRadioAccessTechnologyLTE");
  EXPECT_EQ(kTqCellMonitorCellType, "kTqCellMonitorCellType");
  EXPECT_EQ(kTqCellMonitorCellTypeServing, "kTqCellMonitorCellTypeServing");
  EXPECT_EQ(kTqCellMonitorCellTypeNeighbor, "kTqCellMonitorCellTypeNeighbor");
  EXPECT_EQ(kTqCellMonitorMCC, "kTqCellMonitorMCC");
  EXPECT_EQ(kTqCellMonitorMNC, "kTqCellMonitorMNC");
  EXPECT_EQ(kTqCellMonitorLAC, "kTqCellMonitorLAC");
  EXPECT_EQ(kTqCellMonitorTAC, "kTqCellMonitorTAC");
  EXPECT_EQ(kTqCellMonitorCellId, "kTqCellMonitorCellId");
  EXPECT_EQ(kTqCellMonitorPID, "kTqCellMonitorPID");
  EXPECT_EQ(kTqCellMonitorSCN, "kTqCellMonitorSCN");
  EXPECT_EQ(kTqCellMonitorBandInfo, "kTqCellMonitorBandInfo");
  EXPECT_EQ(kTqCellMonitorARFCN, "kTqCellMonitorARFCN");
  EXPECT_EQ(kTqCellMonitorUARFCN, "kTqCellMonitorUARFCN");
  EXPECT_EQ(kTqCellMonitorRSSI, "kTqCellMonitorRSSI");
  EXPECT_EQ(kTqCellMonitorRSCP, "kTqCellMonitorRSCP");
  EXPECT_EQ(kTqCellMonitorECN0, "kTqCellMonitorECN0");
}

// --- A list section ------------------------------------------------------------------------------

class CellListTest : public DecoderFixture<CellMonitorTableDecoder<kListSection>> {
 protected:
  std::vector<ExplainedValue> explain(const Value& root) {
    std::vector<ExplainedValue> values;
    const PacketBytes bytes = packet(kCellMonitorCode).append(*coding->binary(root));
    decoder.explainPacket(bytes.bytes(), kCellMonitorCode,
                          [&](const ExplainedValue& value) { values.push_back(value); });
    return values;
  }
};

TEST_F(CellListTest, HasARowForEachCellOfTheKind) {
  Dictionary umts = gsmNeighbor(10, -30);
  umts.set("kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyUMTS");
  Dictionary serving = gsmNeighbor(1, 1);
  serving.set("kTqCellMonitorCellType", "kTqCellMonitorCellTypeServing");
  decodeList(kCellMonitorCode, Array{gsmNeighbor(9, -40), serving, umts});
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("ARFCN", "9"), Pair("RSSI", "-80 dBm"), Pair("Level", "-40")));
  EXPECT_THAT(row(1),
              ElementsAre(Pair("ARFCN", "10"), Pair("RSSI", "-60 dBm"), Pair("Level", "-30")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Cells")));
}

TEST_F(CellListTest, KeepsARowWithoutValuesAndReportsEachOnce) {
  decodeList(kCellMonitorCode, Array{cell("kTqCellMonitorRadioAccessTechnologyGSM",
                                          "kTqCellMonitorCellTypeNeighbor")});
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Cells"), errorLine("Failed: ARFCN\n"),
                                       errorLine("Failed: RSSI\n")));
}

TEST_F(CellListTest, PassesOverElementsThatAreNoCells) {
  decodeList(kCellMonitorCode,
             Array{"text", Value::integer(1), Array{gsmNeighbor(1, 1)}, gsmNeighbor(9, 0)});
  EXPECT_THAT(column("ARFCN"), ElementsAre("9"));
}

TEST_F(CellListTest, IsEmptiedWhenNoCellIsOfTheKind) {
  decodeList(kCellMonitorCode, Array{gsmNeighbor(9, 0)});
  decodeList(kCellMonitorCode, Array{});
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(CellListTest, IsEmptiedWithoutAList) {
  decodeList(kCellMonitorCode, Array{gsmNeighbor(9, 0)});
  takeLines();
  decode(packet(kCellMonitorCode).append(Bytes{0xFF, 0xFE}));
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Cells"),
                                       errorLine("Cell Info Array data could not be constructed"),
                                       errorLine("Failed to get Cell Array\n")));
}

TEST_F(CellListTest, ReadsXmlAsWell) {
  decode(packet(kCellMonitorCode).append(*coding->xml(Array{gsmNeighbor(77, -1)})));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("ARFCN", "77"), Pair("RSSI", "-2 dBm"), Pair("Level", "-1")));
}

TEST_F(CellListTest, ReportsOtherCodes) {
  decodeList(kCellMonitorCode, Array{gsmNeighbor(9, 0)});
  takeLines();
  decodeList(kSimFilesCode, Array{});
  EXPECT_THAT(list(), SizeIs(1));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Cells"),
                                       errorLine("Received an unknown log message: 16711680")));
}

TEST_F(CellListTest, IsExplainedByItsListKeys) {
  Dictionary second = gsmNeighbor(10, 0x7FFF);
  second.remove("kTqCellMonitorARFCN");
  const auto values = explain(Array{gsmNeighbor(9, -40), second});
  ASSERT_THAT(values, SizeIs(6));
  EXPECT_EQ(values[1].section, "Cells");
  EXPECT_EQ(values[1].row, 0U);
  EXPECT_EQ(values[1].key, "RSSI");
  ASSERT_THAT(values[1].sources, SizeIs(1));
  EXPECT_EQ(values[1].sources[0].listKey, "kTqCellMonitorRSSI");
  EXPECT_TRUE(values[1].sources[0].isNumber);
  EXPECT_EQ(values[1].sources[0].raw, -40);
  EXPECT_EQ(values[1].text, Value("-80 dBm"));
  EXPECT_EQ(values[3].row, 1U);
  EXPECT_EQ(values[3].key, "ARFCN");
  EXPECT_TRUE(values[3].text.isNull());
  EXPECT_FALSE(values[3].sources.at(0).isNumber);
  EXPECT_EQ(values[4].text, Value(""));
}

TEST_F(CellListTest, ExplainsNothingOfAPacketWithoutAList) {
  std::size_t visits = 0;
  const Bytes bytes = packet(kCellMonitorCode).append(Bytes{1, 2, 3}).bytes();
  decoder.explainPacket(bytes, kCellMonitorCode, [&](const ExplainedValue&) { ++visits; });
  EXPECT_EQ(visits, 0U);
  EXPECT_THAT(explain(Dictionary()), IsEmpty());
}

TEST_F(CellListTest, IsCataloguedWithoutAPacket) {
  const CatalogueEntry entry = decoder.catalogueCode(kCellMonitorCode);
  EXPECT_EQ(entry.code, 0xFF0001U);
  EXPECT_EQ(entry.packetName, "Cell-monitor list");
  EXPECT_EQ(entry.minimumLength, 0U);
  EXPECT_EQ(entry.kind, SectionKind::List);
  std::vector<std::string_view> keys;
  for (const CatalogueKey& key : entry.keys) keys.push_back(key.key);
  EXPECT_THAT(keys, ElementsAre("ARFCN", "RSSI", "Level"));
}

// --- Dictionary sections -------------------------------------------------------------------------

class FirstCellTest : public DecoderFixture<CellMonitorTableDecoder<kFirstCellSection>> {};

TEST_F(FirstCellTest, ShowsTheFirstCellOfTheKind) {
  decodeList(kCellMonitorCode, Array{gsmNeighbor(9, -40), gsmNeighbor(10, -41)});
  EXPECT_THAT(entries(),
              ElementsAre(Pair("ARFCN", "9"), Pair("RSSI", "-80 dBm"), Pair("Level", "-40")));
}

TEST_F(FirstCellTest, KeepsItsValuesWithoutACellOrAList) {
  decodeList(kCellMonitorCode, Array{gsmNeighbor(9, -40)});
  decodeList(kCellMonitorCode, Array{});
  decodeList(kCellMonitorCode, "no list");
  decode(packet(kCellMonitorCode));
  EXPECT_THAT(keysOf(section()), ElementsAre("ARFCN", "RSSI", "Level"));
}

class EachCellTest : public DecoderFixture<CellMonitorTableDecoder<kEachSection>> {};

TEST_F(EachCellTest, TheLastCellOfTheKindWins) {
  Dictionary last = gsmNeighbor(10, 0x7FFF);
  last.remove("kTqCellMonitorARFCN");
  decodeList(kCellMonitorCode, Array{gsmNeighbor(9, -40), last});
  EXPECT_THAT(entries(), ElementsAre(Pair("ARFCN", "9"), Pair("RSSI", ""), Pair("Level", "32767")));
}

}  // namespace
}  // namespace kestro::testing
