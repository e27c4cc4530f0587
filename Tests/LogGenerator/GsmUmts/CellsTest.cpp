// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/Cells.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

Dictionary gsmCell(std::string_view type) {
  return {{"kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyGSM"},
          {"kTqCellMonitorCellType", type},
          {"kTqCellMonitorRSSI", Value::integer(-40)},
          {"kTqCellMonitorARFCN", Value::integer(77)},
          {"kTqCellMonitorCellId", Value::integer(54321)}};
}

Dictionary changed(const Dictionary& cell, std::string_view key, const Value& value) {
  Dictionary result = cell.copy();
  result.set(key, value);
  return result;
}

Dictionary without(const Dictionary& cell, std::string_view key) {
  Dictionary result = cell.copy();
  result.remove(key);
  return result;
}

/// 0x5137 with a serving cell and `count` neighbours, the first at 29.
PacketBytes measurements(unsigned count = 0) {
  return packet(0x5137).u8(15, 63).u32(16, 30).u32(20, 28).u8(28, count);
}

// --- GSMServingCell ------------------------------------------------------------------------------

class GSMServingCellTest : public DecoderFixture<GSMServingCell> {
 protected:
  static PacketBytes identity() {
    return packet(0x5134).u16(13, 77).u16(15, 44).u16(17, 54321).length(26);
  }
  static Dictionary serving() { return gsmCell("kTqCellMonitorCellTypeServing"); }
};

TEST_F(GSMServingCellTest, ShowsTheIdentityFirst) {
  decode(identity());
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Cell ID", "54321"), Pair("ARFCN", "77"), Pair("BSIC", "44")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMServingCell")));
}

TEST_F(GSMServingCellTest, ReadsTheIdentityUnsigned) {
  decode(packet(0x5134).length(13).length(26, 0xFF));
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Cell ID", "65535"), Pair("ARFCN", "65535"), Pair("BSIC", "65535")));
}

TEST_F(GSMServingCellTest, NeedsTwentySixBytesOfIdentity) {
  decode(identity().length(25));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMServingCell")));
}

TEST_F(GSMServingCellTest, ShowsTheMeasurements) {
  decode(measurements());
  EXPECT_THAT(entries(),
              ElementsAre(Pair("RSSI", "63 dBm"), Pair("C1 Value", "30"), Pair("C2 Value", "28")));
}

TEST_F(GSMServingCellTest, ShowsTheLowHalvesOfC1AndC2) {
  decode(measurements().u8(15, 255).u32(16, 0x1234FFFF).u32(20, 0xFFFF8000));
  EXPECT_THAT(entries(), ElementsAre(Pair("RSSI", "255 dBm"), Pair("C1 Value", "65535"),
                                     Pair("C2 Value", "32768")));
}

TEST_F(GSMServingCellTest, NeedsTwentyNineBytesOfMeasurements) {
  decode(measurements().length(28));
  EXPECT_THAT(entries(), IsEmpty());
  decode(measurements().length(29));
  EXPECT_THAT(entries(), SizeIs(3));
}

TEST_F(GSMServingCellTest, ShowsTheLowByteOfTheDedicatedChannel) {
  decode(packet(0x5076).u16(13, 0x0123).length(17));
  EXPECT_THAT(entries(), ElementsAre(Pair("MA Dedicated ARFCN", "35")));
}

TEST_F(GSMServingCellTest, NeedsSeventeenBytesOfDedicatedChannel) {
  decode(packet(0x5076).u16(13, 0x0123).length(16));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMServingCell")));
}

TEST_F(GSMServingCellTest, KeepsWhatAPacketDoesNotCarry) {
  decode(identity());
  decode(measurements());
  decode(packet(0x5076).u16(13, 99).length(17));
  decode(identity().u16(13, 78));
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Cell ID", "54321"), Pair("ARFCN", "78"), Pair("BSIC", "44"),
                          Pair("RSSI", "63 dBm"), Pair("C1 Value", "30"), Pair("C2 Value", "28"),
                          Pair("MA Dedicated ARFCN", "99")));
}

TEST_F(GSMServingCellTest, ShowsTheFirstListedServingCell) {
  decodeList(0xFF0001, Array{gsmCell("kTqCellMonitorCellTypeNeighbor"), serving(),
                             changed(serving(), "kTqCellMonitorARFCN", Value::integer(1))});
  EXPECT_THAT(entries(), ElementsAre(Pair("Cell ID", "54321"), Pair("ARFCN", "77")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMServingCell")));
}

TEST_F(GSMServingCellTest, ReadsListedNumbersSigned) {
  decodeList(0xFF0001,
             Array{changed(changed(serving(), "kTqCellMonitorCellId", Value::integer(0xFFFFFFFF)),
                           "kTqCellMonitorARFCN", Value::integer(32767))});
  EXPECT_THAT(entries(), ElementsAre(Pair("Cell ID", "-1"), Pair("ARFCN", "32767")));
}

TEST_F(GSMServingCellTest, KeepsWhatAListedCellLacks) {
  decode(identity());
  takeLines();
  Dictionary cell = changed(serving(), "kTqCellMonitorCellId", "54322");
  cell.remove("kTqCellMonitorARFCN");
  decodeList(0xFF0001, Array{cell});
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Cell ID", "54321"), Pair("ARFCN", "77"), Pair("BSIC", "44")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMServingCell"),
                                       errorLine("GSMServingCell: Failed to retrieve Cell ID\n"),
                                       errorLine("GSMServingCell: Failed to retrieve ARFCN\n")));
}

TEST_F(GSMServingCellTest, NeedsATechnologyAndATypeOfAListedCell) {
  decodeList(0xFF0001, Array{without(serving(), "kTqCellMonitorCellRadioAccessTechnology"),
                             without(serving(), "kTqCellMonitorCellType"),
                             changed(serving(), "kTqCellMonitorCellRadioAccessTechnology",
                                     "kTqCellMonitorRadioAccessTechnologyUMTS")});
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMServingCell")));
}

TEST_F(GSMServingCellTest, ReportsALostList) {
  decode(identity());
  takeLines();
  decode(packet(0xFF0001));
  EXPECT_THAT(entries(), SizeIs(3));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMServingCell"),
                                       errorLine("Cell Info Array data could not be constructed"),
                                       errorLine("Failed to get Cell Array\n")));
  decodeList(0xFF0001, "text");
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("GSMServingCell"), errorLine("Failed to get Cell Array\n")));
}

// --- NeighboringCells ----------------------------------------------------------------------------

class NeighboringCellsTest : public DecoderFixture<NeighboringCells> {
 protected:
  /// Neighbours with these ARFCNs, RSSI 31, 32, … and C1 14, 15, …
  static PacketBytes neighbours(std::initializer_list<unsigned> arfcns) {
    PacketBytes bytes = measurements(static_cast<unsigned>(arfcns.size()));
    std::size_t offset = 29;
    unsigned number = 0;
    for (const unsigned arfcn : arfcns) {
      bytes.u16(offset, arfcn).u8(offset + 2, 31 + number).u32(offset + 3, 14 + number);
      offset += 14;
      ++number;
    }
    return bytes;
  }
  /// A BSIC list with these entries.
  static PacketBytes bsics(std::initializer_list<std::pair<unsigned, unsigned>> entries) {
    PacketBytes bytes = packet(0x51FF).u8(14, static_cast<unsigned>(entries.size()));
    std::size_t offset = 15;
    for (const auto& [arfcn, bsic] : entries) {
      bytes.u16(offset, arfcn).u8(offset + 2, bsic).u8(offset + 3, 0xEE);
      offset += 4;
    }
    return bytes;
  }
  static Dictionary listed() { return gsmCell("kTqCellMonitorCellTypeNeighbor"); }
};

TEST_F(NeighboringCellsTest, ShowsNeighbours) {
  decode(neighbours({77, 512}));
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0), ElementsAre(Pair("ARFCN", "77"), Pair("RSSI", "31"), Pair("C1 Value", "14")));
  EXPECT_THAT(row(1),
              ElementsAre(Pair("ARFCN", "512"), Pair("RSSI", "32"), Pair("C1 Value", "15")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("NeighboringCells")));
}

TEST_F(NeighboringCellsTest, ReadsTheWidestValues) {
  decode(measurements(1).length(29).length(43, 0xFF));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("ARFCN", "65535"), Pair("RSSI", "255"), Pair("C1 Value", "-1")));
}

TEST_F(NeighboringCellsTest, AddsTheBSICOfTheLastList) {
  decode(bsics({{77, 44}, {900, 45}}));
  decode(neighbours({512, 77, 900}));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("ARFCN", "512"), Pair("RSSI", "31"), Pair("C1 Value", "14")));
  EXPECT_THAT(row(1), ElementsAre(Pair("ARFCN", "77"), Pair("RSSI", "32"), Pair("C1 Value", "15"),
                                  Pair("BSIC", "44")));
  EXPECT_THAT(column("BSIC"), ElementsAre("", "44", "45"));
}

TEST_F(NeighboringCellsTest, TakesTheLaterOfTwoBSICs) {
  decode(bsics({{77, 44}, {77, 255}}));
  decode(neighbours({77}));
  EXPECT_THAT(column("BSIC"), ElementsAre("255"));
}

TEST_F(NeighboringCellsTest, ForgetsAnEarlierBSICList) {
  decode(bsics({{77, 44}}));
  decode(bsics({{512, 45}}));
  decode(neighbours({77, 512}));
  EXPECT_THAT(column("BSIC"), ElementsAre("", "45"));
  EXPECT_THAT(row(0), SizeIs(3));
}

TEST_F(NeighboringCellsTest, KnowsNoBSICAfterAnEmptyList) {
  decode(bsics({{77, 44}}));
  decode(bsics({}));
  decode(neighbours({77}));
  EXPECT_THAT(row(0), SizeIs(3));
}

TEST_F(NeighboringCellsTest, ABSICListDoesNotTouchTheDisplay) {
  decode(neighbours({77}));
  takeLines();
  decode(bsics({{77, 44}}));
  EXPECT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0), SizeIs(3));
  decode(bsics({}));
  EXPECT_THAT(list(), SizeIs(1));
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("NeighboringCells"), warningLine("NeighboringCells")));
}

TEST_F(NeighboringCellsTest, ABSICListNeedsFifteenBytes) {
  decode(bsics({{77, 44}}));
  decode(packet(0x51FF).length(14));
  decode(neighbours({77}));
  EXPECT_THAT(column("BSIC"), ElementsAre("44"));
  decode(packet(0x51FF).length(15));
  decode(neighbours({77}));
  EXPECT_THAT(column("BSIC"), ElementsAre(""));
}

TEST_F(NeighboringCellsTest, IsEmptiedByAPacketWithoutNeighbours) {
  decode(neighbours({77}));
  decode(measurements(0).length(29));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(NeighboringCellsTest, NeedsTwentyNineBytes) {
  decode(neighbours({77}));
  decode(measurements(0).length(28));
  EXPECT_THAT(list(), SizeIs(1));
}

TEST_F(NeighboringCellsTest, ShowsListedNeighboursWithTwiceTheirLevel) {
  decodeList(0xFF0001, Array{listed(), gsmCell("kTqCellMonitorCellTypeServing"),
                             changed(listed(), "kTqCellMonitorARFCN", Value::integer(512))});
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0), ElementsAre(Pair("ARFCN", "77"), Pair("RSSI", "-80 dBm")));
  EXPECT_THAT(row(1), ElementsAre(Pair("ARFCN", "512"), Pair("RSSI", "-80 dBm")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("NeighboringCells")));
}

TEST_F(NeighboringCellsTest, ShowsNoBSICOfListedNeighbours) {
  decode(bsics({{77, 44}}));
  decodeList(0xFF0001, Array{listed()});
  EXPECT_THAT(row(0), SizeIs(2));
}

TEST_F(NeighboringCellsTest, DoublesLevelsInThirtyTwoBits) {
  decodeList(0xFF0001, Array{changed(listed(), "kTqCellMonitorRSSI", Value::integer(32767)),
                             changed(listed(), "kTqCellMonitorRSSI", Value::integer(-32769)),
                             changed(listed(), "kTqCellMonitorRSSI", Value::integer(1073741824)),
                             changed(listed(), "kTqCellMonitorARFCN", Value::integer(32767))});
  EXPECT_THAT(column("RSSI"), ElementsAre("", "", "-2147483648 dBm", "-80 dBm"));
  EXPECT_THAT(column("ARFCN"), ElementsAre("77", "77", "77", "32767"));
}

TEST_F(NeighboringCellsTest, NamesEveryValueThatAListedNeighbourLacks) {
  Dictionary cell = changed(listed(), "kTqCellMonitorRSSI", Value::boolean(true));
  cell.remove("kTqCellMonitorARFCN");
  decodeList(0xFF0001, Array{cell});
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("NeighboringCells"),
                                       errorLine("NeighboringCells: Failed to retrieve ARFCN\n"),
                                       errorLine("NeighboringCells: Failed to retrieve RSSI\n")));
}

TEST_F(NeighboringCellsTest, IsEmptiedByAListWithoutNeighbours) {
  decode(neighbours({77}));
  decodeList(0xFF0001, Array{changed(listed(), "kTqCellMonitorCellRadioAccessTechnology",
                                     "kTqCellMonitorRadioAccessTechnologyUMTS")});
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(NeighboringCellsTest, IsEmptiedByALostList) {
  decode(neighbours({77}));
  takeLines();
  decode(packet(0xFF0001).length(14));
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("NeighboringCells"),
                                       errorLine("Cell Info Array data could not be constructed"),
                                       errorLine("Failed to get Cell Array\n")));
  decode(neighbours({77}));
  takeLines();
  decodeList(0xFF0001, Dictionary());
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("NeighboringCells"),
                                       errorLine("Failed to get Cell Array\n")));
}

// --- GSMSet --------------------------------------------------------------------------------------

class GSMSetTest : public DecoderFixture<GSMSet> {};

TEST_F(GSMSetTest, ShowsRankedCells) {
  // -75 = 0xB5, -3 = 0xFFFD
  decode(packet(0x4005).u8(14, 2).u16(15, 77).u16(17, 44).u8(19, 0xB5).u16(20, 0xFFFD).u16(22, 78));
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0), ElementsAre(Pair("ARFCN", "77"), Pair("BSIC", "44"), Pair("RSSI", "-75 dBm"),
                                  Pair("Ranking Value", "-3")));
  EXPECT_THAT(row(1), ElementsAre(Pair("ARFCN", "78"), Pair("BSIC", "0"), Pair("RSSI", "0 dBm"),
                                  Pair("Ranking Value", "0")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSMSet")));
}

TEST_F(GSMSetTest, ReadsEachFieldsSign) {
  decode(packet(0x4005).u8(14, 1).length(15).length(22, 0xFF));
  EXPECT_THAT(row(0), ElementsAre(Pair("ARFCN", "65535"), Pair("BSIC", "65535"),
                                  Pair("RSSI", "-1 dBm"), Pair("Ranking Value", "-1")));
}

TEST_F(GSMSetTest, BeginsWhereTheUMTSCellsBegin) {
  // Two UMTS cells; the GSM cell is read from the first one's first seven bytes.
  decode(packet(0x4005).u8(13, 2).u8(14, 1).u16(15, 10712).u16(17, 321).u8(19, 0xBA).u16(20, 5));
  EXPECT_THAT(row(0), ElementsAre(Pair("ARFCN", "10712"), Pair("BSIC", "321"),
                                  Pair("RSSI", "-70 dBm"), Pair("Ranking Value", "5")));
}

TEST_F(GSMSetTest, IsEmptiedByAPacketWithoutCells) {
  decode(packet(0x4005).u8(14, 1).length(22));
  decode(packet(0x4005).u8(13, 1).length(25));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(GSMSetTest, NeedsFifteenBytes) {
  decode(packet(0x4005).u8(14, 1).length(22));
  decode(packet(0x4005).length(14));
  EXPECT_THAT(list(), SizeIs(1));
  decode(packet(0x4005).length(15));
  EXPECT_THAT(list(), IsEmpty());
}

// --- MobileAllocation ----------------------------------------------------------------------------

class MobileAllocationTest : public DecoderFixture<MobileAllocation> {
 protected:
  std::vector<std::string> frequencies() {
    std::vector<std::string> texts;
    for (const Value& frequency : section()["ARFCNs"].array()) texts.emplace_back(frequency.text());
    return texts;
  }
};

TEST_F(MobileAllocationTest, ShowsSequenceNumberAndFrequencies) {
  decode(packet(0x51F8).u8(13, 33).u8(14, 3).u16(15, 514).u16(17, 65535).u16(19, 512));
  EXPECT_THAT(keysOf(section()), ElementsAre("HSN", "ARFCNs"));
  EXPECT_EQ(text("HSN"), "33");
  EXPECT_THAT(frequencies(), ElementsAre("514", "65535", "512"));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("MobileAllocation")));
}

TEST_F(MobileAllocationTest, ShowsAnEmptyListForNoFrequency) {
  decode(packet(0x51F8).u8(13, 33).u8(14, 1).u16(15, 514));
  decode(packet(0x51F8).u8(13, 255).length(15));
  EXPECT_EQ(text("HSN"), "255");
  EXPECT_TRUE(section()["ARFCNs"].isArray());
  EXPECT_THAT(frequencies(), IsEmpty());
}

TEST_F(MobileAllocationTest, ASequenceNumberOfZeroIsNoBound) {
  decode(packet(0x51F8).u8(13, 0).u8(14, 1).u16(15, 514));
  EXPECT_THAT(frequencies(), ElementsAre("514"));
}

TEST_F(MobileAllocationTest, NeedsFifteenBytes) {
  decode(packet(0x51F8).u8(13, 33).length(14));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("MobileAllocation")));
}

}  // namespace
}  // namespace kestro::testing
