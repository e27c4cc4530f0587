// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/Measurements.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

// --- 0xD00A: UTRAN neighbours --------------------------------------------------------------------

class UTRANNeighborsTest : public DecoderFixture<UTRANNeighbhorMeasurements> {
 protected:
  /// Byte 16 as it stands, and one record:
  /// 0xB7 0x27: channel 10167, the two low bits of the cell identity are 0;
  /// 0x25: its upper bits are 5 (identity 20); 0x10 and the 3 bits above: RSCP 129; ASET.
  static PacketBytes oneNeighbor(unsigned byte16 = 1U << 1) {
    return packet(0xD00A).u8(16, byte16).u8(168, 0xB7).u8(169, 0x27).u8(170, 0x25).u8(171, 0x10);
  }
  /// One neighbour whose last byte is given.
  static PacketBytes withLastByte(unsigned byte) { return oneNeighbor().u8(171, byte); }
};

TEST_F(UTRANNeighborsTest, ShowsANeighbor) {
  decode(oneNeighbor());
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0), ElementsAre(Pair("UARFCN", "10167"), Pair("Cell ID", "20"),
                                  Pair("Filter RSCP", "0.503906"), Pair("Status", "ASET"),
                                  Pair("inJDCS", "FALSE")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("NeighbhorMeasurements List")));
}

TEST_F(UTRANNeighborsTest, ReadsTheWidestFields) {
  decode(packet(0xD00A).u8(16, 1U << 1).u32(168, 0xFFFFFFFF));
  EXPECT_THAT(row(0), ElementsAre(Pair("UARFCN", "16383"), Pair("Cell ID", "127"),
                                  Pair("Filter RSCP", "0.996094"), Pair("inJDCS", "TRUE")));
}

TEST_F(UTRANNeighborsTest, ReadsEachFieldFromItsOwnBits) {
  const auto only = [&](std::uint32_t bits) {
    decode(packet(0xD00A).u8(16, 1U << 1).u32(168, bits));
    return row(0);
  };
  EXPECT_THAT(only(1U << 13)[0], Pair("UARFCN", "8192"));
  EXPECT_THAT(only(1U << 14)[1], Pair("Cell ID", "1"));
  EXPECT_THAT(only(1U << 20)[1], Pair("Cell ID", "64"));
  EXPECT_THAT(only(1U << 21)[2], Pair("Filter RSCP", "0.003906"));
  EXPECT_THAT(only(1U << 28)[2], Pair("Filter RSCP", "0.500000"));
}

TEST_F(UTRANNeighborsTest, NamesEverySet) {
  const std::pair<unsigned, const char*> sets[] = {{0x00, "ASET"}, {0x20, "MSET"}, {0x40, "DSET"}};
  for (const auto& [byte, name] : sets) {
    decode(withLastByte(byte));
    EXPECT_EQ(row(0)[3], (std::pair<std::string, std::string>("Status", name)));
  }
}

TEST_F(UTRANNeighborsTest, LeavesTheStatusOutForAFourthSet) {
  decode(withLastByte(0x60));
  EXPECT_THAT(row(0), ElementsAre(Pair("UARFCN", "10167"), Pair("Cell ID", "20"),
                                  Pair("Filter RSCP", "0.003906"), Pair("inJDCS", "FALSE")));
}

TEST_F(UTRANNeighborsTest, ShowsTheHighestBitAsAFlag) {
  decode(withLastByte(0x80));
  EXPECT_THAT(row(0)[3], Pair("Status", "ASET"));
  EXPECT_THAT(row(0)[4], Pair("inJDCS", "TRUE"));
}

TEST_F(UTRANNeighborsTest, CountsInTheUpperSevenBits) {
  decode(oneNeighbor(0x05));
  EXPECT_THAT(list(), SizeIs(2));
  decode(oneNeighbor(0xFF));
  EXPECT_THAT(list(), SizeIs(127));
}

TEST_F(UTRANNeighborsTest, IsEmptiedByACountOfZero) {
  decode(oneNeighbor());
  decode(oneNeighbor(0x01));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(UTRANNeighborsTest, PlacesRecordsSixteenBytesApart) {
  decode(oneNeighbor(0x06).u16(184, 100).u16(200, 200));
  EXPECT_THAT(column("UARFCN"), ElementsAre("10167", "100", "200"));
}

TEST_F(UTRANNeighborsTest, RecordsPastTheEndReadAsZero) {
  decode(oneNeighbor(0x04).length(169));
  EXPECT_THAT(row(0), ElementsAre(Pair("UARFCN", "183"), Pair("Cell ID", "0"),
                                  Pair("Filter RSCP", "0.000000"), Pair("Status", "ASET"),
                                  Pair("inJDCS", "FALSE")));
  EXPECT_EQ(row(1)[0].second, "0");
}

TEST_F(UTRANNeighborsTest, NeedsTwentyOneBytes) {
  decode(oneNeighbor());
  decode(oneNeighbor(0x01).length(20));
  EXPECT_THAT(list(), SizeIs(1));
  decode(oneNeighbor(0x01).length(21));
  EXPECT_THAT(list(), IsEmpty());
}

// --- 0xD00E: GSM neighbours ----------------------------------------------------------------------

class GSMNeighborsTest : public DecoderFixture<GSMNeighbhorMeasurements> {
 protected:
  static PacketBytes twoNeighbors() {
    return packet(0xD00E)
        .u8(16, 2)
        .u16(17, 0x2ABC | 1U << 14)
        .u8(19, 5)
        .u8(20, 6)
        .u16(21, 975)
        .u16(23, 0xFFFF)
        .u16(25, 0x1234 | 1U << 15)
        .u8(27, 255)
        .u8(28, 254)
        .u16(29, 0xFFFF)
        .u16(31, 0x8000);
  }

  /// "row key=text" of every row.
  std::vector<std::string> explained(const PacketBytes& bytes) const {
    std::vector<std::string> result;
    decoder.explainPacket(bytes.bytes(), bytes.code(), [&](const ExplainedValue& value) {
      if (!value.row) return;
      result.push_back(std::to_string(*value.row) + " " + std::string(value.key) + "=" +
                       std::string(value.text.text()));
    });
    return result;
  }
};

TEST_F(GSMNeighborsTest, IsEmptiedByEveryPacket) {
  list().append("before");
  decode(twoNeighbors());
  EXPECT_THAT(list(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GSM Neighbor Cell List")));
}

TEST_F(GSMNeighborsTest, IsEmptiedByACountOfZeroToo) {
  list().append("before");
  decode(twoNeighbors().u8(16, 0).length(17));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(GSMNeighborsTest, ReadsTheNeighborsThatItDoesNotShow) {
  EXPECT_THAT(
      explained(twoNeighbors()),
      ElementsAre("0 Cell ID=10940", "0 Band Indicator=1", "0 BSIC Valid=0", "0 NCC=5", "0 BCC=6",
                  "0 ARFCN=975", "0 RSSI=-1", "1 Cell ID=4660", "1 Band Indicator=0",
                  "1 BSIC Valid=1", "1 NCC=255", "1 BCC=254", "1 ARFCN=65535", "1 RSSI=-32768"));
}

TEST_F(GSMNeighborsTest, TakesAFullCountFromAShortPacket) {
  list().append("before");
  decode(twoNeighbors().u8(16, 255).length(18));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(GSMNeighborsTest, NeedsSeventeenBytes) {
  list().append("before");
  decode(twoNeighbors().length(16));
  EXPECT_THAT(list(), SizeIs(1));
}

// --- 0xD00C: transport channels ------------------------------------------------------------------

class TRCHBLERTest : public DecoderFixture<TRCHBLERMeasurement> {
 protected:
  /// Two transport channels, no coded composite ones.
  static PacketBytes twoChannels() {
    return packet(0xD00C).u16(14, 2U << 6).u8(17, 1).u8(18, 30).u8(19, 255).u8(20, 254);
  }
};

TEST_F(TRCHBLERTest, ShowsEveryChannel) {
  decode(twoChannels());
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0), ElementsAre(Pair("TRCH ID", "1"), Pair("TRCH BLER Measurement", "30")));
  EXPECT_THAT(row(1), ElementsAre(Pair("TRCH ID", "255"), Pair("TRCH BLER Measurement", "254")));
}

TEST_F(TRCHBLERTest, LogsAtNoticePriority) {
  decode(twoChannels());
  EXPECT_THAT(takeLines(), ElementsAre(Line{LogPriority::Notice, "TRCH BLER Measurement"}));
}

TEST_F(TRCHBLERTest, CountsInSixBitsAcrossTwoBytes) {
  decode(twoChannels().u16(14, 0xF03F));  // every bit but the count's
  EXPECT_THAT(list(), IsEmpty());
  decode(twoChannels().u16(14, 0x0FC0));
  EXPECT_THAT(list(), SizeIs(63));
  decode(twoChannels().u16(14, 0x0040));
  EXPECT_THAT(list(), SizeIs(1));
  decode(twoChannels().u16(14, 0x0800));
  EXPECT_THAT(list(), SizeIs(32));
}

TEST_F(TRCHBLERTest, ChannelsPastTheEndReadAsZero) {
  decode(twoChannels().length(20));
  EXPECT_THAT(row(1), ElementsAre(Pair("TRCH ID", "255"), Pair("TRCH BLER Measurement", "0")));
}

TEST_F(TRCHBLERTest, NeedsSeventeenBytes) {
  decode(twoChannels());
  decode(twoChannels().u16(14, 0).length(16));
  EXPECT_THAT(list(), SizeIs(2));
  decode(twoChannels().u16(14, 0).length(17));
  EXPECT_THAT(list(), IsEmpty());
}

class CCTRCHSIRTest : public DecoderFixture<CCTRCHSIRMeasurement> {
 protected:
  /// One transport channel and one coded composite one: 289 + 34 = 323.
  static PacketBytes oneOfEach() {
    return packet(0xD00C)
        .u8(14, 0x40)
        .u8(15, 0x10)
        .u8(323, 9)
        .u8(324, 6)
        .u8(325, 1)
        .u8(326, 2)
        .u8(327, 3)
        .u8(328, 4)
        .u8(329, 5)
        .u8(330, 255);
  }

  /// The SIR texts of a row.
  [[nodiscard]] std::vector<std::string> sir(std::size_t index) const {
    std::vector<std::string> texts;
    const Array values = list()[index].dictionary()["SIR"].array();
    for (const Value& value : values) texts.emplace_back(value.text());
    return texts;
  }
};

TEST_F(CCTRCHSIRTest, ShowsAChannelWithItsSixRatios) {
  decode(oneOfEach());
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("CCTRCH ID", "9"), Pair("TSNUM", "6"), Pair("SIR", "(no text)")));
  EXPECT_THAT(sir(0), ElementsAre("1", "2", "3", "4", "5", "255"));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("CCTRCH SIR Measurement")));
}

TEST_F(CCTRCHSIRTest, MovesByThirtyFourBytesForEachTransportChannel) {
  decode(packet(0xD00C).u16(14, 0x1000).u8(289, 7));
  EXPECT_THAT(column("CCTRCH ID"), ElementsAre("7"));
  decode(packet(0xD00C).u16(14, 63U << 6 | 0x1000).u8(289 + 34 * 63, 8));
  EXPECT_THAT(column("CCTRCH ID"), ElementsAre("8"));
}

TEST_F(CCTRCHSIRTest, PlacesRecordsEightBytesApart) {
  decode(oneOfEach().u8(15, 0x30).u8(331, 10).u8(339, 11));
  EXPECT_THAT(column("CCTRCH ID"), ElementsAre("9", "10", "11"));
}

TEST_F(CCTRCHSIRTest, CountsInTheUpperFourBits) {
  decode(oneOfEach().u8(15, 0xF0));
  EXPECT_THAT(list(), SizeIs(15));
  decode(oneOfEach().u8(15, 0x0F));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(CCTRCHSIRTest, RecordsPastTheEndReadAsZero) {
  decode(oneOfEach().length(17));
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_EQ(row(0)[0].second, "0");
  EXPECT_THAT(sir(0), SizeIs(6));
  EXPECT_THAT(sir(0), Each("0"));
}

TEST_F(CCTRCHSIRTest, NeedsSeventeenBytes) {
  decode(oneOfEach());
  decode(oneOfEach().u8(15, 0).length(16));
  EXPECT_THAT(list(), SizeIs(1));
  decode(oneOfEach().u8(15, 0).length(17));
  EXPECT_THAT(list(), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
