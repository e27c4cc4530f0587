// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/LinkQuality.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

/// The rows of the list under `key`.
std::vector<Entries> rowsUnder(const Dictionary& section, std::string_view key) {
  std::vector<Entries> rows;
  for (const Value& row : section[key].array()) rows.push_back(entriesOf(row.dictionary()));
  return rows;
}

// --- BLER ----------------------------------------------------------------------------------------

class BLERTest : public DecoderFixture<BLER> {
 protected:
  static PacketBytes channels(unsigned count, unsigned window) {
    return packet(0x4116).u8(13, count).u16(14, window);
  }
  std::vector<Entries> rows() { return rowsUnder(section(), "Transport Channels"); }
};

TEST_F(BLERTest, ShowsWindowAndChannels) {
  decode(channels(2, 500).u8(16, 24).u32(17, 100000).u32(21, 217).u8(25, 31).u32(26, 5).u32(30, 4));
  EXPECT_THAT(keysOf(section()), ElementsAre("Window Size", "Transport Channels"));
  EXPECT_EQ(text("Window Size"), "500");
  EXPECT_THAT(
      rows(),
      ElementsAre(ElementsAre(Pair("Transport Channel ID", "24"), Pair("CRC Received", "100000"),
                              Pair("CRC Received in Error", "217")),
                  ElementsAre(Pair("Transport Channel ID", "31"), Pair("CRC Received", "5"),
                              Pair("CRC Received in Error", "4"))));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("BLER")));
}

TEST_F(BLERTest, ShowsCountsSigned) {
  decode(channels(1, 65535).u8(16, 255).u32(17, 0x80000000).u32(21, 0xFFFFFFFF));
  EXPECT_EQ(text("Window Size"), "65535");
  EXPECT_THAT(rows(), ElementsAre(ElementsAre(Pair("Transport Channel ID", "255"),
                                              Pair("CRC Received", "-2147483648"),
                                              Pair("CRC Received in Error", "-1"))));
}

TEST_F(BLERTest, ShowsAnEmptyListForNoChannel) {
  decode(channels(1, 500).length(25));
  decode(channels(0, 501).length(16));
  EXPECT_EQ(text("Window Size"), "501");
  EXPECT_TRUE(section()["Transport Channels"].isArray());
  EXPECT_THAT(rows(), IsEmpty());
}

TEST_F(BLERTest, AWindowOfZeroIsNoBound) {
  decode(channels(1, 0).u8(16, 24).length(25));
  EXPECT_THAT(rows(), SizeIs(1));
}

TEST_F(BLERTest, NeedsSixteenBytes) {
  decode(channels(1, 500).length(15));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("BLER")));
}

// --- HSDPAInformation ----------------------------------------------------------------------------

class HSDPAInformationTest : public DecoderFixture<HSDPAInformation> {
 protected:
  static PacketBytes statistics(unsigned primary, unsigned secondary) {
    return packet(0x4221).u8(16, primary).u8(17, secondary).length(18);
  }
  std::vector<Entries> primary() { return rowsUnder(section(), "Primary HARQ Process"); }
  std::vector<Entries> secondary() { return rowsUnder(section(), "Secondary HARQ Process"); }
};

TEST_F(HSDPAInformationTest, ShowsTheHeader) {
  decode(statistics(0, 0).u8(13, 3).u8(14, 100).u8(15, 0x0B));
  EXPECT_THAT(entries(), ElementsAre(Pair("Version", "3"), Pair("Sub Frames", "868"),
                                     Pair("Carrier Info", "Dual Carrier")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("HSDPAInformation")));
}

TEST_F(HSDPAInformationTest, NamesEveryCarrierType) {
  constexpr const char* kNames[] = {"Single Carrier", "MIMO", "Dual Carrier", "Reserved"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(statistics(0, 0).u8(15, 0xF0 | value << 2));
    EXPECT_EQ(text("Carrier Info"), name) << value;
    EXPECT_EQ(text("Sub Frames"), "0");
    ++value;
  }
}

TEST_F(HSDPAInformationTest, ReadsTenBitsOfSubFrames) {
  decode(statistics(0, 0).u8(13, 255).u8(14, 0xFF).u8(15, 0xF3));
  EXPECT_EQ(text("Version"), "255");
  EXPECT_EQ(text("Sub Frames"), "1023");
  EXPECT_EQ(text("Carrier Info"), "Single Carrier");
}

TEST_F(HSDPAInformationTest, ShowsPrimaryProcesses) {
  decode(statistics(2, 0).u8(18, 5).u32(19, 1234567).u16(23, 88).u16(25, 9).u8(27, 6));
  EXPECT_THAT(keysOf(section()),
              ElementsAre("Version", "Sub Frames", "Carrier Info", "Primary HARQ Process"));
  EXPECT_THAT(primary(),
              ElementsAre(ElementsAre(Pair("Process ID", "5"), Pair("No Rx Bits", "1234567"),
                                      Pair("New Tx", "88"), Pair("Block Errors", "9")),
                          ElementsAre(Pair("Process ID", "6"), Pair("No Rx Bits", "0"),
                                      Pair("New Tx", "0"), Pair("Block Errors", "0"))));
}

TEST_F(HSDPAInformationTest, ShowsNumbersUnsigned) {
  decode(statistics(1, 0).length(27, 0xFF));
  EXPECT_THAT(primary(),
              ElementsAre(ElementsAre(Pair("Process ID", "255"), Pair("No Rx Bits", "4294967295"),
                                      Pair("New Tx", "65535"), Pair("Block Errors", "65535"))));
}

TEST_F(HSDPAInformationTest, FindsSecondaryProcessesBehindTheRoomForPrimaryOnes) {
  decode(statistics(1, 1).u8(18, 1).u8(27, 2).u8(180, 3).u32(181, 4).u16(185, 5).u16(187, 6));
  EXPECT_THAT(keysOf(section()), ElementsAre("Version", "Sub Frames", "Carrier Info",
                                             "Primary HARQ Process", "Secondary HARQ Process"));
  EXPECT_THAT(secondary(),
              ElementsAre(ElementsAre(Pair("Process ID", "3"), Pair("No Rx Bits", "4"),
                                      Pair("New Tx", "5"), Pair("Block Errors", "6"))));
}

TEST_F(HSDPAInformationTest, FindsSecondaryProcessesWithoutPrimaryOnes) {
  decode(statistics(0, 2).u8(18, 1).u8(27, 2));
  EXPECT_THAT(keysOf(section()),
              ElementsAre("Version", "Sub Frames", "Carrier Info", "Secondary HARQ Process"));
  ASSERT_EQ(secondary().size(), 2U);
  EXPECT_EQ(secondary()[0][0].second, "1");
  EXPECT_EQ(secondary()[1][0].second, "2");
}

TEST_F(HSDPAInformationTest, KeepsAListThatAPacketDoesNotCarry) {
  decode(statistics(1, 1).u8(18, 7).u8(180, 8));
  decode(statistics(0, 0).u8(13, 4));
  EXPECT_EQ(text("Version"), "4");
  ASSERT_EQ(primary().size(), 1U);
  EXPECT_EQ(primary()[0][0].second, "7");
  ASSERT_EQ(secondary().size(), 1U);
  EXPECT_EQ(secondary()[0][0].second, "8");
}

TEST_F(HSDPAInformationTest, NeedsEighteenBytes) {
  decode(statistics(0, 0).length(17));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("HSDPAInformation")));
}

}  // namespace
}  // namespace kestro::testing
