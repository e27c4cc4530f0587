// SPDX-License-Identifier: MIT
#include <exception>
#include <type_traits>

#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using LogCode_0xFF0000::UnknownDataException;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

static_assert(std::is_empty_v<UnknownDataException>);
static_assert(!std::is_base_of_v<std::exception, UnknownDataException>);

// --- SimInfo -------------------------------------------------------------------------------------

class SimInfoTest : public DecoderFixture<SimInfo> {
 protected:
  static Dictionary files() {
    // The display's order is the table's, not the payload's.
    return {{"kSimFile_OPLMNAcT", "14"}, {"kSimFile_OPL", "13"},    {"kSimFile_PNN", "12"},
            {"kSimFile_RATMODE", "11"},  {"kSimFile_AHPLMN", "10"}, {"kSimFile_FPLMN", "9"},
            {"kSimFile_AD", "8"},        {"kSimFile_ACC", "7"},     {"kSimFile_PSLOCI", "6"},
            {"kSimFile_LOCI", "5"},      {"kSimFile_HPPLMN", "4"},  {"kSimFile_MBDN", "3"},
            {"kSimFile_MSISDN", "2"},    {"kSimFile_ICCID", "1"},   {"kSimFile_Unknown", "0"}};
  }
};

TEST_F(SimInfoTest, ShowsEveryFileInOrder) {
  decodeList(kSimFilesCode, files());
  EXPECT_THAT(entries(),
              ElementsAre(Pair("EF-ICCID", "1"), Pair("EF-MSISDN", "2"),
                          Pair("EF-3GPP MAIL BOX DIALING NUMBER", "3"),
                          Pair("EF-HPPLMN SEARCH PERIOD", "4"), Pair("EF-LOCI", "5"),
                          Pair("EF-GPRS/PS-LOCI", "6"), Pair("EF-ACCESS CONTROL CLASS", "7"),
                          Pair("EF-ADMINISTRATIVE DATA", "8"), Pair("EF-FPLMN", "9"),
                          Pair("EF-ACTING HPLMN", "10"), Pair("EF-RAT MODE", "11"),
                          Pair("EF-PLMN NETWORK NAME", "12"), Pair("EF-OPERATOR PLMN LIST", "13"),
                          Pair("EF-OPLMNAcT", "14")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("SimInfo")));
}

TEST_F(SimInfoTest, KeepsFilesThatAPacketLacks) {
  decodeList(kSimFilesCode, Dictionary{{"kSimFile_ICCID", "1"}, {"kSimFile_LOCI", "5"}});
  decodeList(kSimFilesCode, Dictionary{{"kSimFile_ICCID", "2"}});
  EXPECT_THAT(entries(), ElementsAre(Pair("EF-ICCID", "2"), Pair("EF-LOCI", "5")));
}

TEST_F(SimInfoTest, PassesValuesOfAnyTypeOn) {
  const Value list = Array{"a", Value::integer(2)};
  decodeList(kSimFilesCode,
             Dictionary{{"kSimFile_ICCID", Value::integer(7)}, {"kSimFile_PNN", list}});
  EXPECT_EQ(section()["EF-ICCID"], Value::integer(7));
  EXPECT_EQ(section()["EF-PLMN NETWORK NAME"], list);
}

TEST_F(SimInfoTest, ThrowsForAPayloadThatIsNoPropertyList) {
  EXPECT_THROW(decode(packet(kSimFilesCode).append(Bytes{'x'})), UnknownDataException);
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("SimInfo"),
                          errorLine("SIM File dictionary data could not be constructed")));
}

TEST_F(SimInfoTest, ThrowsForAPacketOfNoMoreThanTheHeader) {
  for (const std::size_t size : {11U, 12U, 13U}) {
    EXPECT_THROW(decode(packet(kSimFilesCode).length(size)), UnknownDataException);
    EXPECT_THAT(takeLines(), SizeIs(2));
  }
}

TEST_F(SimInfoTest, ARootThatIsNoDictionaryChangesNothing) {
  decodeList(kSimFilesCode, Dictionary{{"kSimFile_ICCID", "1"}});
  takeLines();
  decodeList(kSimFilesCode, Array{Dictionary{{"kSimFile_ICCID", "2"}}});
  decodeList(kSimFilesCode, "kSimFile_ICCID");
  EXPECT_THAT(entries(), ElementsAre(Pair("EF-ICCID", "1")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("SimInfo"), warningLine("SimInfo")));
}

TEST_F(SimInfoTest, IsSilentOnAnotherCode) {
  decode(packet(kCellMonitorCode).append(Bytes{'x'}));
  decodeList(kCellMonitorCode, files());
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("SimInfo"), warningLine("SimInfo")));
}

TEST_F(SimInfoTest, IsExplainedByItsFileKeys) {
  std::vector<ExplainedValue> values;
  const Bytes bytes =
      packet(kSimFilesCode)
          .append(*coding->binary(Dictionary{{"kSimFile_AD", "8"}, {"kSimFile_ICCID", "1"}}))
          .bytes();
  decoder.explainPacket(bytes, kSimFilesCode,
                        [&](const ExplainedValue& value) { values.push_back(value); });
  ASSERT_THAT(values, SizeIs(2));
  EXPECT_EQ(values[0].key, "EF-ICCID");
  EXPECT_EQ(values[0].sources.at(0).listKey, "kSimFile_ICCID");
  EXPECT_FALSE(values[0].sources[0].isNumber);
  EXPECT_EQ(values[0].text, Value("1"));
  EXPECT_EQ(values[1].key, "EF-ADMINISTRATIVE DATA");
}

TEST_F(SimInfoTest, IsCataloguedWithAllItsKeys) {
  const CatalogueEntry entry = decoder.catalogueCode(kSimFilesCode);
  ASSERT_THAT(entry.keys, SizeIs(14));
  EXPECT_EQ(entry.keys[0].key, "EF-ICCID");
  ASSERT_NE(entry.keys[0].listed, nullptr);
  EXPECT_EQ(entry.keys[0].listed->listKey, "kSimFile_ICCID");
  ASSERT_NE(entry.propertyList, nullptr);
  EXPECT_EQ(entry.propertyList->part, ListedPart::Root);
}

// --- PDPContextList ------------------------------------------------------------------------------

class PDPContextListTest : public DecoderFixture<PDPContextList> {};

TEST_F(PDPContextListTest, ShowsTheElementsAsTheyAre) {
  const Array contexts{Dictionary{{"APN", "internet"}, {"State", Value::integer(1)}}, "text"};
  decodeList(kPacketDataContextsCode, contexts);
  EXPECT_EQ(Value(list()), Value(contexts));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("PDPContextList")));
}

TEST_F(PDPContextListTest, IsReplacedAsAWhole) {
  decodeList(kPacketDataContextsCode, Array{"a", "b"});
  decodeList(kPacketDataContextsCode, Array{"c"});
  EXPECT_EQ(Value(list()), Value(Array{"c"}));
  decodeList(kPacketDataContextsCode, Array{});
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(PDPContextListTest, KeepsItsContextsWithoutAnArray) {
  decodeList(kPacketDataContextsCode, Array{"a"});
  takeLines();
  decodeList(kPacketDataContextsCode, Dictionary{{"APN", "internet"}});
  decode(packet(kPacketDataContextsCode).append(Bytes{'x'}));
  decode(packet(kPacketDataContextsCode));
  decode(packet(kPacketDataContextsCode).length(11));
  EXPECT_EQ(Value(list()), Value(Array{"a"}));
  EXPECT_EQ(takeLines(), std::vector<Line>(4, warningLine("PDPContextList")));
}

TEST_F(PDPContextListTest, DecodesWhateverCodeItIsGiven) {
  decode(packet(0x1234).append(*coding->binary(Array{"a"})));
  EXPECT_EQ(Value(list()), Value(Array{"a"}));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("PDPContextList")));
}

TEST_F(PDPContextListTest, IsExplainedContextByContext) {
  std::vector<std::string> lines;
  const Bytes bytes = packet(kPacketDataContextsCode)
                          .append(*coding->binary(Array{Dictionary{{"APN", "a"}, {"State", "up"}},
                                                        Dictionary{{"APN", "b"}}}))
                          .bytes();
  decoder.explainPacket(bytes, kPacketDataContextsCode, [&](const ExplainedValue& value) {
    lines.push_back(std::to_string(*value.row) + " " + value.sources.at(0).listKey + "=" +
                    std::string(value.text.text()));
    EXPECT_EQ(value.key, value.sources.at(0).listKey);
  });
  EXPECT_THAT(lines, ElementsAre("0 APN=a", "0 State=up", "1 APN=b"));
}

}  // namespace
}  // namespace kestro::testing
