// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/Measurements.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

// --- 0xB179: intra-frequency measurement ---------------------------------------------------------

/// A header with two measured neighbours and three detected cells.
PacketBytes intraFrequency() {
  return packet(0xB179)
      .u16(17, 1300)
      .u16(19, 301)
      .u16(21, 9876)
      .u16(23, 165)
      .u16(25, 83)
      .u8(27, 2)
      .u8(28, 3)
      .u16(29, 10)
      .u16(31, 160)
      .u16(33, 80)
      .u16(35, 503)
      .u16(37, 0)
      .u16(39, 0)
      .u16(41, 21)
      .u16(43, 22)
      .u16(45, 65535);
}

class ConnectedModeMeasurementMiscTest : public DecoderFixture<ConnectedModeMeasurementMisc> {};

TEST_F(ConnectedModeMeasurementMiscTest, ShowsTheServingCell) {
  decode(intraFrequency());
  // 165 / 4 - 140, 83 / 8 - 20 = -9.625, whose tie goes to the even digit.
  EXPECT_THAT(
      entries(),
      ElementsAre(Pair("E-ARFCN", "1300"), Pair("Serving Physical Cell ID", "301"),
                  Pair("Subframe Number", "9876"), Pair("Serving Filtered RSRP", "-98.75 dBm"),
                  Pair("Serving Filtered RSRQ", "-9.62 dB")));
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("Connected mode LTE Intra-frequency Measurement")));
}

TEST_F(ConnectedModeMeasurementMiscTest, ShowsTheLowestLevels) {
  decode(intraFrequency().u16(23, 0).u16(25, 0));
  EXPECT_EQ(text("Serving Filtered RSRP"), "-140.00 dBm");
  EXPECT_EQ(text("Serving Filtered RSRQ"), "-20.00 dB");
}

TEST_F(ConnectedModeMeasurementMiscTest, ReadsSixteenBitsOfEachLevel) {
  decode(intraFrequency().u16(23, 65535).u16(25, 65535));
  EXPECT_EQ(text("Serving Filtered RSRP"), "16243.75 dBm");
  EXPECT_EQ(text("Serving Filtered RSRQ"), "8171.88 dB");  // 8171.875
}

TEST_F(ConnectedModeMeasurementMiscTest, IsUpdatedWithoutAnyCell) {
  decode(intraFrequency().u8(27, 0).u8(28, 0).length(29));
  EXPECT_EQ(text("E-ARFCN"), "1300");
}

TEST_F(ConnectedModeMeasurementMiscTest, NeedsTwentyNineBytes) {
  decode(intraFrequency().length(28));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("Connected mode LTE Intra-frequency Measurement")));
}

class MeasuredNeighborCellsTest : public DecoderFixture<MeasuredNeighborCells> {};

TEST_F(MeasuredNeighborCellsTest, ShowsEveryNeighbor) {
  decode(intraFrequency());
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Physical Cell ID", "10"), Pair("Filtered RSRP", "-100.00 dBm"),
                          Pair("Filtered RSRQ", "-10.00 dB")));
  EXPECT_THAT(row(1),
              ElementsAre(Pair("Physical Cell ID", "503"), Pair("Filtered RSRP", "-140.00 dBm"),
                          Pair("Filtered RSRQ", "-20.00 dB")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Measured Neighbor Cells")));
}

TEST_F(MeasuredNeighborCellsTest, RoundsTiesToTheEvenDigit) {
  decode(intraFrequency().u16(33, 3).u16(39, 5));
  // 3 / 8 - 20 = -19.625 and 5 / 8 - 20 = -19.375
  EXPECT_THAT(column("Filtered RSRQ"), ElementsAre("-19.62 dB", "-19.38 dB"));
}

TEST_F(MeasuredNeighborCellsTest, IsReplacedAsAWhole) {
  decode(intraFrequency());
  decode(intraFrequency().u8(27, 1).u16(29, 77));
  EXPECT_THAT(column("Physical Cell ID"), ElementsAre("77"));
}

TEST_F(MeasuredNeighborCellsTest, IsEmptiedByACountOfZero) {
  decode(intraFrequency());
  decode(intraFrequency().u8(27, 0));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(MeasuredNeighborCellsTest, KeepsItsRowsAfterAShortPacket) {
  decode(intraFrequency());
  decode(intraFrequency().u8(27, 0).length(28));
  EXPECT_THAT(list(), SizeIs(2));
}

TEST_F(MeasuredNeighborCellsTest, RecordsPastTheEndReadAsZero) {
  decode(intraFrequency().u8(27, 255).length(36));
  ASSERT_THAT(list(), SizeIs(255));
  // The second record's first byte is the packet's last one: 503 & 0xFF.
  EXPECT_THAT(row(1),
              ElementsAre(Pair("Physical Cell ID", "247"), Pair("Filtered RSRP", "-140.00 dBm"),
                          Pair("Filtered RSRQ", "-20.00 dB")));
  EXPECT_THAT(row(254),
              ElementsAre(Pair("Physical Cell ID", "0"), Pair("Filtered RSRP", "-140.00 dBm"),
                          Pair("Filtered RSRQ", "-20.00 dB")));
}

class DetectedCellsTest : public DecoderFixture<DetectedCells> {};

TEST_F(DetectedCellsTest, ShowsTheCellsBehindTheMeasuredOnes) {
  decode(intraFrequency());
  ASSERT_THAT(list(), SizeIs(3));
  EXPECT_THAT(row(0), ElementsAre(Pair("Physical Cell ID", "21")));
  EXPECT_THAT(row(1), ElementsAre(Pair("Physical Cell ID", "22")));
  EXPECT_THAT(row(2), ElementsAre(Pair("Physical Cell ID", "65535")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Detected Cells")));
}

TEST_F(DetectedCellsTest, FollowsTheHeaderWithoutMeasuredCells) {
  decode(intraFrequency().u8(27, 0).u8(28, 2));
  EXPECT_THAT(column("Physical Cell ID"), ElementsAre("10", "160"));
}

TEST_F(DetectedCellsTest, IsEmptiedByACountOfZero) {
  decode(intraFrequency());
  decode(intraFrequency().u8(28, 0));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(DetectedCellsTest, CellsPastTheEndReadAsZero) {
  decode(intraFrequency().u8(27, 255).u8(28, 255));
  ASSERT_THAT(list(), SizeIs(255));
  EXPECT_THAT(row(0), ElementsAre(Pair("Physical Cell ID", "0")));
}

TEST_F(DetectedCellsTest, NeedsTwentyNineBytes) {
  decode(intraFrequency());
  decode(intraFrequency().u8(28, 0).length(28));
  EXPECT_THAT(list(), SizeIs(3));
}

// --- 0xB17F: serving-cell measurement ------------------------------------------------------------

class ServingCellMeasurementTest : public DecoderFixture<ServingCellMeasurement> {
 protected:
  static PacketBytes measurement() {
    return packet(0xB17F)
        .u8(13, 4)
        .u16(17, 1300)
        .u16(19, 301U | 5U << 9 | 7U << 13)
        .u32(21, 160U | 163U << 9 | 60U << 18 | 61U << 25)
        .u32(25, 120U | 8U << 9 | 53U << 15 | 54U << 22 | 15U << 28)
        .u32(29, 70U | 9U << 7 | 31U << 13 | 2U << 19 | 1U << 25 | 6U << 26 | 3U << 30);
  }

  std::string shown(const PacketBytes& bytes, std::string_view key) {
    decode(bytes);
    return text(key);
  }
};

TEST_F(ServingCellMeasurementTest, ShowsEveryFieldInOrder) {
  decode(measurement());
  EXPECT_THAT(
      entries(),
      ElementsAre(Pair("Version", "4"), Pair("E-ARFCN", "1300"), Pair("Physical Cell ID", "301"),
                  Pair("Serving Layer Priority", "5"), Pair("Measured RSRP", "-100.00 dBm"),
                  Pair("Average RSRP", "-99.25 dBm"), Pair("Measured RSRQ", "-15.00 dB"),
                  Pair("Average RSRQ", "-14.75 dB"), Pair("Measured RSSI", "-80.00 dBm"),
                  Pair("Qrxlevmin", "-124 dBm"), Pair("P_Max", "23 dBm"),
                  Pair("Max UE Tx Power", "24 dBm"), Pair("Srxlev", "40 dBm"),
                  Pair("Num of Consecutive DRX Cycles of S < 0", "9"),
                  Pair("S Intra Search", "62 dB"), Pair("S Non Intra Search", "4 dBm"),
                  Pair("Measurement Rules Updated", "True"), Pair("Measurement Rules", "6")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Measurements")));
}

TEST_F(ServingCellMeasurementTest, ShowsTheLowestValues) {
  decode(packet(0xB17F).length(33));
  EXPECT_THAT(
      entries(),
      ElementsAre(Pair("Version", "0"), Pair("E-ARFCN", "0"), Pair("Physical Cell ID", "0"),
                  Pair("Serving Layer Priority", "0"), Pair("Measured RSRP", "-140.00 dBm"),
                  Pair("Average RSRP", "-140.00 dBm"), Pair("Measured RSRQ", "-30.00 dB"),
                  Pair("Average RSRQ", "-30.00 dB"), Pair("Measured RSSI", "-140.00 dBm"),
                  Pair("Qrxlevmin", "-140 dBm"), Pair("P_Max", "-30 dBm"),
                  Pair("Max UE Tx Power", "-30 dBm"), Pair("Srxlev", "-30 dBm"),
                  Pair("Num of Consecutive DRX Cycles of S < 0", "0"),
                  Pair("S Intra Search", "0 dB"), Pair("S Non Intra Search", "0 dBm"),
                  Pair("Measurement Rules Updated", "False"), Pair("Measurement Rules", "0")));
}

TEST_F(ServingCellMeasurementTest, OneBitAloneSaysThatTheRulesWereUpdated) {
  // Bit 25 of the last word, whatever its neighbours are.
  EXPECT_EQ(shown(packet(0xB17F).u32(29, 1U << 25), "Measurement Rules Updated"), "True");
  EXPECT_EQ(shown(packet(0xB17F).u32(29, ~(1U << 25)), "Measurement Rules Updated"), "False");
}

TEST_F(ServingCellMeasurementTest, ShowsTheHighestValues) {
  decode(packet(0xB17F).length(13).length(33, 0xFF));
  EXPECT_THAT(
      entries(),
      ElementsAre(Pair("Version", "255"), Pair("E-ARFCN", "65535"), Pair("Physical Cell ID", "511"),
                  Pair("Serving Layer Priority", "15"), Pair("Measured RSRP", "-12.25 dBm"),
                  Pair("Average RSRP", "-12.25 dBm"), Pair("Measured RSRQ", "1.75 dB"),
                  Pair("Average RSRQ", "1.75 dB"), Pair("Measured RSSI", "115.50 dBm"),
                  Pair("Qrxlevmin", "-14 dBm"), Pair("P_Max", "97 dBm"),
                  Pair("Max UE Tx Power", "33 dBm"), Pair("Srxlev", "97 dBm"),
                  Pair("Num of Consecutive DRX Cycles of S < 0", "63"),
                  Pair("S Intra Search", "126 dB"), Pair("S Non Intra Search", "126 dBm"),
                  Pair("Measurement Rules Updated", "True"), Pair("Measurement Rules", "15")));
}

TEST_F(ServingCellMeasurementTest, PMaxIsNotPresentAtSixtyFour) {
  EXPECT_EQ(shown(packet(0xB17F).u32(25, 64U << 15).length(33), "P_Max"), "Not Present");
  EXPECT_EQ(shown(packet(0xB17F).u32(25, 63U << 15).length(33), "P_Max"), "33 dBm");
  EXPECT_EQ(shown(packet(0xB17F).u32(25, 65U << 15).length(33), "P_Max"), "35 dBm");
}

TEST_F(ServingCellMeasurementTest, MaximumPowerIsAlwaysPresent) {
  for (unsigned raw = 0; raw < 64; ++raw) {
    const std::string expected = std::to_string(static_cast<int>(raw) - 30) + " dBm";
    EXPECT_EQ(shown(packet(0xB17F).u32(25, raw << 22).length(33), "Max UE Tx Power"), expected);
  }
}

TEST_F(ServingCellMeasurementTest, SearchThresholdsAreNotPresentAtThirtyTwo) {
  EXPECT_EQ(shown(packet(0xB17F).u32(29, 32U << 13), "S Intra Search"), "Not Present");
  EXPECT_EQ(shown(packet(0xB17F).u32(29, 33U << 13), "S Intra Search"), "66 dB");
  EXPECT_EQ(shown(packet(0xB17F).u32(29, 32U << 19), "S Non Intra Search"), "Not Present");
  EXPECT_EQ(shown(packet(0xB17F).u32(29, 31U << 19), "S Non Intra Search"), "62 dBm");
}

TEST_F(ServingCellMeasurementTest, NeedsThirtyThreeBytes) {
  decode(measurement().length(32));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Serving Cell Measurements")));
}

TEST_F(ServingCellMeasurementTest, OverwritesItsKeysInPlace) {
  decode(measurement());
  const std::vector<std::string> keys = keysOf(section());
  decode(packet(0xB17F).length(33));
  EXPECT_EQ(keysOf(section()), keys);
  EXPECT_EQ(text("Measured RSRP"), "-140.00 dBm");
}

// --- 0xB180: neighbour measurements --------------------------------------------------------------

/// A header and two neighbours; the 16 bits at 19 hold Qrxlevmin and the count less one.
PacketBytes neighbors() {
  return packet(0xB180)
      .u8(13, 2)
      .u16(17, 6300)
      .u16(19, 12U | 1U << 6)
      .u32(21, 301U | 100U << 9 | 90U << 17)
      .u16(25, 91U | 70U << 9)
      .u16(27, 71U | 45U << 7)
      .u16(29, 1234)
      .u32(33, 1025U | 300000U << 11)
      .u32(41, 511U | 255U << 9 | 511U << 17)
      .u16(45, 511U | 127U << 9)
      .u16(47, 127U | 127U << 7)
      .u16(49, 65535)
      .u32(53, 2047U | 524287U << 11)
      .length(61);
}

class NeighborMeasurementMiscTest : public DecoderFixture<NeighborMeasurementMisc> {};

TEST_F(NeighborMeasurementMiscTest, ShowsTheHeader) {
  decode(neighbors());
  EXPECT_THAT(entries(), ElementsAre(Pair("Version", "2"), Pair("E-ARFCN", "6300"),
                                     Pair("Qrxlevmin", "-116 dBm")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Neighbor Measurements")));
}

TEST_F(NeighborMeasurementMiscTest, ReadsSixBitsOfTheMinimumLevel) {
  decode(neighbors().u8(19, 0xFF));
  EXPECT_EQ(text("Qrxlevmin"), "-14 dBm");
}

TEST_F(NeighborMeasurementMiscTest, NeedsTwentyOneBytes) {
  decode(neighbors().length(20));
  EXPECT_THAT(entries(), IsEmpty());
  decode(neighbors().length(21));
  EXPECT_EQ(text("Version"), "2");
}

class NeighborCellsListTest : public DecoderFixture<NeighborCellsList> {};

TEST_F(NeighborCellsListTest, ShowsEveryNeighbor) {
  decode(neighbors());
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(
      row(0),
      ElementsAre(Pair("Physical Cell ID", "301"), Pair("Measured RSSI", "-90.00 dBm"),
                  Pair("Measured RSRP", "-95.00 dBm"), Pair("Average RSRP", "-94.50 dBm"),
                  Pair("Measured RSRQ", "-12.50 dB"), Pair("Average RSRQ", "-12.25 dB"),
                  Pair("Srxlev", "15 dBm"), Pair("Frequency Offset", "1234"),
                  Pair("Ant 0 Frame Offset", "1025"), Pair("Ant 0 Sample Offset", "300000"),
                  Pair("Ant 1 Frame Offset", "1025"), Pair("Ant 1 Sample Offset", "300000")));
  EXPECT_THAT(
      row(1),
      ElementsAre(Pair("Physical Cell ID", "511"), Pair("Measured RSSI", "-12.50 dBm"),
                  Pair("Measured RSRP", "115.50 dBm"), Pair("Average RSRP", "115.50 dBm"),
                  Pair("Measured RSRQ", "1.75 dB"), Pair("Average RSRQ", "1.75 dB"),
                  Pair("Srxlev", "97 dBm"), Pair("Frequency Offset", "65535"),
                  Pair("Ant 0 Frame Offset", "2047"), Pair("Ant 0 Sample Offset", "524287"),
                  Pair("Ant 1 Frame Offset", "2047"), Pair("Ant 1 Sample Offset", "524287")));
}

TEST_F(NeighborCellsListTest, LogsEveryRecord) {
  decode(neighbors());
  EXPECT_THAT(
      takeLines(),
      ElementsAre(
          warningLine("Neighbor Cells List"),
          warningLine("Number of neighboring cells being reported: 2\n"),
          warningLine("Physical Cell ID: 301\n"), warningLine("Measured RSSI: -90.000000\n"),
          warningLine("Measured RSSI: -95.000000\n"), warningLine("Measured RSSI: -94.500000\n"),
          warningLine("Measured RSSI: -12.500000\n"), warningLine("Measured RSSI: -12.250000\n"),
          warningLine("Physical Cell ID: 511\n"), warningLine("Measured RSSI: -12.500000\n"),
          warningLine("Measured RSSI: 115.500000\n"), warningLine("Measured RSSI: 115.500000\n"),
          warningLine("Measured RSSI: 1.750000\n"), warningLine("Measured RSSI: 1.750000\n")));
}

TEST_F(NeighborCellsListTest, LogsNothingBelowTheLogsThreshold) {
  platform.systemLog().setThreshold(LogPriority::Error);
  decode(neighbors());
  EXPECT_THAT(list(), SizeIs(2));
  EXPECT_THAT(takeLines(), IsEmpty());
}

TEST_F(NeighborCellsListTest, CountBitsOfZeroMeanOneNeighbor) {
  decode(neighbors().u16(19, 12));
  EXPECT_THAT(column("Physical Cell ID"), ElementsAre("301"));
}

TEST_F(NeighborCellsListTest, ReportsUpToThirtyTwoNeighbors) {
  decode(neighbors().u16(19, 0xFFFF));
  EXPECT_THAT(list(), SizeIs(32));
  // Past the packet's end everything is 0.
  EXPECT_THAT(row(31),
              ElementsAre(Pair("Physical Cell ID", "0"), Pair("Measured RSSI", "-140.00 dBm"),
                          Pair("Measured RSRP", "-140.00 dBm"), Pair("Average RSRP", "-140.00 dBm"),
                          Pair("Measured RSRQ", "-30.00 dB"), Pair("Average RSRQ", "-30.00 dB"),
                          Pair("Srxlev", "-30 dBm"), Pair("Frequency Offset", "0"),
                          Pair("Ant 0 Frame Offset", "0"), Pair("Ant 0 Sample Offset", "0"),
                          Pair("Ant 1 Frame Offset", "0"), Pair("Ant 1 Sample Offset", "0")));
}

TEST_F(NeighborCellsListTest, TheCountReachesIntoTheSecondByte) {
  decode(neighbors().u16(19, 8U << 6));  // bits 6 to 10 are 8: the highest of them in byte 20
  EXPECT_THAT(list(), SizeIs(9));
}

TEST_F(NeighborCellsListTest, TheBoundHasAllBitsOfTheCount) {
  decode(neighbors().u16(19, 16U << 6));
  EXPECT_THAT(list(), SizeIs(17));
}

TEST_F(NeighborCellsListTest, OneLevelIsTwiceTheStepsOfTheServingCell) {
  decode(neighbors().u32(21, 1U << 17).u16(25, 1));
  EXPECT_EQ(column("Measured RSRP").front(), "-139.50 dBm");
  EXPECT_EQ(column("Average RSRP").front(), "-139.50 dBm");
}

TEST_F(NeighborCellsListTest, NeedsTwentyOneBytes) {
  decode(neighbors());
  takeLines();
  decode(neighbors().length(20));
  EXPECT_THAT(list(), SizeIs(2));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Neighbor Cells List")));
}

}  // namespace
}  // namespace kestro::testing
