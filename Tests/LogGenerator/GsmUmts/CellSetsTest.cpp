// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/CellSets.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

/// 0x417A with `count` cells; cell i is at 16 + 15 i, its energies at 16 + 15 count + 44 i + 32.
PacketBytes setInformation(unsigned count, std::size_t level = 0) {
  return packet(0x417A).u16(13, static_cast<unsigned>(level)).u8(15, count);
}

// --- ActiveSet -----------------------------------------------------------------------------------

class ActiveSetTest : public DecoderFixture<ActiveSet> {
 protected:
  /// One member cell whose first energy is `energy`.
  static PacketBytes oneCell(std::uint32_t energy, int level = 0) {
    return setInformation(1, static_cast<std::uint16_t>(level)).u32(31 + 32, energy).length(75);
  }
};

TEST_F(ActiveSetTest, ShowsAMemberCell) {
  // Byte 7 = 0x91, byte 8 = 0x01: 0x191 = 401. 83563 is above 83562: -8 dB. R = -112: 40 - 106 - 8.
  decode(setInformation(1, 0xFF90).u8(23, 0x91).u8(24, 0x01).u32(63, 83563));
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0), ElementsAre(Pair("Scrambling Code", "401"), Pair("RSCP", "-74 dB"),
                                  Pair("Energy Per Chip", "-8 dB")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ActiveSet")));
}

TEST_F(ActiveSetTest, ReadsThirteenBitsOfScramblingCode) {
  decode(setInformation(1).u8(23, 0xFF).u8(24, 0x1F));
  EXPECT_THAT(column("Scrambling Code"), ElementsAre("8191"));
}

TEST_F(ActiveSetTest, LeavesOutCellsOfOtherSets) {
  for (unsigned setType = 1; setType < 8; ++setType) {
    decode(setInformation(1).u8(24, setType << 5));
    EXPECT_THAT(list(), IsEmpty()) << setType;
  }
}

TEST_F(ActiveSetTest, KeepsTheOrderOfTheRecords) {
  decode(setInformation(3).u8(16 + 7, 3).u8(31 + 7, 1).u8(46 + 7, 2));
  EXPECT_THAT(column("Scrambling Code"), ElementsAre("3", "1", "2"));
}

TEST_F(ActiveSetTest, FindsTheEnergyOfACellBehindSkippedOnes) {
  // Two cells, the first of another set. Energies begin at 46; the second cell's at 90.
  decode(setInformation(2).u8(24, 0x20).u8(38, 9).u32(46 + 32, 417648).u32(90 + 32, 52831));
  EXPECT_THAT(column("Scrambling Code"), ElementsAre("9"));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("-10 dB"));
}

TEST_F(ActiveSetTest, TakesTheFirstEnergyThatIsNotZero) {
  const auto energies = [](std::uint32_t first, std::uint32_t second, std::uint32_t third) {
    return setInformation(1).u32(63, first).u32(67, second).u32(71, third);
  };
  decode(energies(417648, 331809, 263625));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("-1 dB"));
  decode(energies(0, 331809, 263625));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("-2 dB"));
  decode(energies(0, 0, 263625));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("-3 dB"));
  decode(energies(0, 0, 0));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("0 dB"));
  // A first candidate that the table does not know is taken all the same.
  decode(energies(1, 331809, 263625));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("0 dB"));
}

TEST_F(ActiveSetTest, ReadsEnergiesUnsigned) {
  decode(oneCell(0xFFFFFFFF));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("0 dB"));
}

TEST_F(ActiveSetTest, DividesTowardsZero) {
  // 52831 is -10 dB. (-600 + 512) / 10 = -8.
  decode(oneCell(52831, -600));
  EXPECT_THAT(column("RSCP"), ElementsAre("-124 dB"));
  // (-513 + 512) / 10 and (-503 + 512) / 10 are both 0.
  decode(oneCell(52831, -513));
  EXPECT_THAT(column("RSCP"), ElementsAre("-116 dB"));
  decode(oneCell(52831, -503));
  EXPECT_THAT(column("RSCP"), ElementsAre("-116 dB"));
}

TEST_F(ActiveSetTest, ReadsTheLevelSigned) {
  decode(oneCell(0, 32767));  // 33279 / 10 = 3327
  EXPECT_THAT(column("RSCP"), ElementsAre("3221 dB"));
  decode(oneCell(0, -32768));  // -32256 / 10 = -3225
  EXPECT_THAT(column("RSCP"), ElementsAre("-3331 dB"));
}

TEST_F(ActiveSetTest, IsEmptiedByAPacketWithoutCells) {
  decode(oneCell(1));
  decode(setInformation(0).length(16));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(ActiveSetTest, NeedsSixteenBytes) {
  decode(oneCell(1));
  takeLines();
  decode(setInformation(0).length(15));
  EXPECT_THAT(list(), SizeIs(1));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ActiveSet")));
}

TEST_F(ActiveSetTest, ReadsZerosPastTheEnd) {
  decode(setInformation(255).length(16));
  ASSERT_THAT(list(), SizeIs(255));
  EXPECT_THAT(row(254), ElementsAre(Pair("Scrambling Code", "0"), Pair("RSCP", "-55 dB"),
                                    Pair("Energy Per Chip", "0 dB")));
}

// --- DetectedSet, MonitoredSet, VirtualActiveSet -------------------------------------------------

struct EmptySet {
  const char* section;
  const char* className;
};

template <class Decoder>
class EmptySetTest : public DecoderFixture<Decoder> {
 protected:
  static EmptySet names();
};
template <>
EmptySet EmptySetTest<DetectedSet>::names() {
  return {"Detected Set", "DetectedSet"};
}
template <>
EmptySet EmptySetTest<MonitoredSet>::names() {
  return {"Monitored Set", "MonitoredSet"};
}
template <>
EmptySet EmptySetTest<VirtualActiveSet>::names() {
  return {"Virtual Active Set", "VirtualActiveSet"};
}
using EmptySets = ::testing::Types<DetectedSet, MonitoredSet, VirtualActiveSet>;
TYPED_TEST_SUITE(EmptySetTest, EmptySets);

TYPED_TEST(EmptySetTest, IsEmptyWhateverCellsAPacketHas) {
  for (const unsigned count : {0U, 1U, 255U}) {
    this->list().append("old");
    this->decode(setInformation(count).u8(24, 0x20).u8(39, 0x40));
    EXPECT_THAT(this->list(), IsEmpty()) << count;
    EXPECT_THAT(this->takeLines(), ElementsAre(warningLine(this->names().className)));
  }
}

TYPED_TEST(EmptySetTest, TakesItsCountAloneFromItsByte) {
  for (const unsigned neighbour : {0U, 255U}) {
    this->list().append("old");
    this->decode(setInformation(1, neighbour << 8).u8(16, neighbour).length(75));
    EXPECT_THAT(this->list(), IsEmpty()) << neighbour;
  }
}

TYPED_TEST(EmptySetTest, NeedsSixteenBytes) {
  this->list().append("old");
  this->decode(setInformation(0).length(15));
  EXPECT_THAT(this->list(), SizeIs(1));
  EXPECT_THAT(this->takeLines(), ElementsAre(warningLine(this->names().className)));
}

// --- UMTSSet: idle-mode ranking ------------------------------------------------------------------

class UMTSSetTest : public DecoderFixture<UMTSSet> {
 protected:
  /// 0x4005 with one UMTS cell, at 15.
  static PacketBytes ranking() { return packet(0x4005).u8(13, 1).length(25); }

  static Dictionary neighbour() {
    return {{"kTqCellMonitorCellRadioAccessTechnology", "kTqCellMonitorRadioAccessTechnologyUMTS"},
            {"kTqCellMonitorCellType", "kTqCellMonitorCellTypeNeighbor"},
            {"kTqCellMonitorECN0", Value::integer(-9)},
            {"kTqCellMonitorRSCP", Value::integer(-95)},
            {"kTqCellMonitorSCN", Value::integer(321)},
            {"kTqCellMonitorUARFCN", Value::integer(10712)}};
  }
  static Dictionary neighbourWith(std::string_view key, const Value& value) {
    Dictionary cell = neighbour();
    cell.set(key, value);
    return cell;
  }
  static Dictionary neighbourWithout(std::string_view key) {
    Dictionary cell = neighbour();
    cell.remove(key);
    return cell;
  }
};

TEST_F(UMTSSetTest, ShowsARankedCell) {
  // -91 = 0xFFA5, -70 = 0xBA, -15 = 0xF1, -13 = 0xFFF3
  decode(ranking()
             .u16(15, 10712)
             .u16(17, 321)
             .u8(19, 0xBA)
             .u16(20, 0xFFA5)
             .u8(22, 0xF1)
             .u16(23, 0xFFF3));
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Downlink Frequency", "10712"), Pair("Scrambling Code", "321"),
                          Pair("RSCP", "-91 dB"), Pair("Rank Cell RSCP", "-91 dB"),
                          Pair("Energy Per Chip", "-7.500000 dB"), Pair("Ranking Value", "-13")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSSet")));
}

TEST_F(UMTSSetTest, ReadsEachFieldsSign) {
  decode(packet(0x4005).u8(13, 1).length(15).length(25, 0xFF));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Downlink Frequency", "-1"), Pair("Scrambling Code", "65535"),
                          Pair("RSCP", "-22 dB"), Pair("Rank Cell RSCP", "-1 dB"),
                          Pair("Energy Per Chip", "-0.500000 dB"), Pair("Ranking Value", "-1")));
}

TEST_F(UMTSSetTest, ShowsTheExtremes) {
  decode(ranking().u8(19, 0x80).u8(22, 0x80));
  EXPECT_THAT(column("RSCP"), ElementsAre("-149 dB"));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("-64.000000 dB"));
  decode(ranking().u8(19, 0x7F).u8(22, 0x7F));
  EXPECT_THAT(column("RSCP"), ElementsAre("106 dB"));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("63.500000 dB"));
  decode(ranking());
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("0.000000 dB"));
}

TEST_F(UMTSSetTest, FindsEveryRecord) {
  decode(packet(0x4005).u8(13, 3).u16(17, 7).u16(27, 8).u16(37, 9));
  EXPECT_THAT(column("Scrambling Code"), ElementsAre("7", "8", "9"));
}

TEST_F(UMTSSetTest, DoesNotCountTheGSMCells) {
  decode(ranking());
  decode(packet(0x4005).u8(13, 0).u8(14, 2).length(35));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(UMTSSetTest, NeedsFifteenBytes) {
  decode(ranking());
  takeLines();
  decode(packet(0x4005).length(14));
  EXPECT_THAT(list(), SizeIs(1));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSSet")));
  decode(packet(0x4005).length(15));
  EXPECT_THAT(list(), IsEmpty());
}

// --- UMTSSet: cell monitor -----------------------------------------------------------------------

TEST_F(UMTSSetTest, ShowsAListedNeighbour) {
  decodeList(0xFF0001, Array{neighbour()});
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0), ElementsAre(Pair("UARFCN", "10712"), Pair("Scrambling Code", "321"),
                                  Pair("RSCP", "-95 dBm"), Pair("Energy Per Chip", "-9 dB")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSSet")));
}

TEST_F(UMTSSetTest, ShowsNoLevelThatWasNotMeasured) {
  decodeList(0xFF0001, Array{neighbourWith("kTqCellMonitorRSCP", Value::integer(32767)),
                             neighbourWith("kTqCellMonitorECN0", Value::integer(0x57FFF))});
  EXPECT_THAT(column("RSCP"), ElementsAre("", "-95 dBm"));
  EXPECT_THAT(column("Energy Per Chip"), ElementsAre("-9 dB", ""));
}

TEST_F(UMTSSetTest, ShowsChannelsAndCodesOfAnyValue) {
  decodeList(0xFF0001, Array{neighbourWith("kTqCellMonitorUARFCN", Value::integer(32767)),
                             neighbourWith("kTqCellMonitorSCN", Value::integer(32767))});
  EXPECT_THAT(column("UARFCN"), ElementsAre("32767", "10712"));
  EXPECT_THAT(column("Scrambling Code"), ElementsAre("321", "32767"));
}

TEST_F(UMTSSetTest, NamesEveryValueThatANeighbourLacks) {
  Dictionary cell = neighbour();
  for (const char* key :
       {"kTqCellMonitorUARFCN", "kTqCellMonitorSCN", "kTqCellMonitorRSCP", "kTqCellMonitorECN0"}) {
    cell.remove(key);
  }
  decodeList(0xFF0001, Array{cell});
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0), IsEmpty());
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("UMTSSet"), errorLine("UMTSSet: Failed to retrieve UARFCN\n"),
                          errorLine("UMTSSet: Failed to retrieve Scrambling Code\n"),
                          errorLine("UMTSSet: Failed to retrieve RSCP\n"),
                          errorLine("UMTSSet: Failed to retrieve Energy Per Chip\n")));
}

TEST_F(UMTSSetTest, KeepsTheOtherValuesOfANeighbour) {
  decodeList(0xFF0001, Array{neighbourWithout("kTqCellMonitorSCN"),
                             neighbourWith("kTqCellMonitorRSCP", Value::real(-95))});
  EXPECT_THAT(row(0), ElementsAre(Pair("UARFCN", "10712"), Pair("RSCP", "-95 dBm"),
                                  Pair("Energy Per Chip", "-9 dB")));
  EXPECT_THAT(row(1), ElementsAre(Pair("UARFCN", "10712"), Pair("Scrambling Code", "321"),
                                  Pair("Energy Per Chip", "-9 dB")));
}

TEST_F(UMTSSetTest, PassesOverOtherCells) {
  decode(ranking());
  takeLines();
  decodeList(0xFF0001,
             Array{neighbourWith("kTqCellMonitorCellRadioAccessTechnology",
                                 "kTqCellMonitorRadioAccessTechnologyGSM"),
                   neighbourWith("kTqCellMonitorCellType", "kTqCellMonitorCellTypeServing"),
                   neighbourWithout("kTqCellMonitorCellRadioAccessTechnology"),
                   neighbourWithout("kTqCellMonitorCellType"), "no cell", Value::integer(1)});
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSSet")));
}

TEST_F(UMTSSetTest, IsEmptiedByAListThatDoesNotParse) {
  decode(ranking());
  takeLines();
  decode(packet(0xFF0001).length(20, 'x'));
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSSet"),
                                       errorLine("Cell Info Array data could not be constructed"),
                                       errorLine("Failed to get Cell Array\n")));
}

TEST_F(UMTSSetTest, IsEmptiedByAListThatIsNoArray) {
  decode(ranking());
  takeLines();
  decodeList(0xFF0001, neighbour());
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("UMTSSet"), errorLine("Failed to get Cell Array\n")));
}

TEST_F(UMTSSetTest, IsEmptiedByAnEmptyList) {
  decode(ranking());
  takeLines();
  decodeList(0xFF0001, Array());
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSSet")));
}

}  // namespace
}  // namespace kestro::testing
