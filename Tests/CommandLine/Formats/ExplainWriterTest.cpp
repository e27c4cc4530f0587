// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "CommandLine/Formats/ExplainJson.h"
#include "CommandLine/Formats/ExplainTable.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {
namespace {

/// Bytes 13 to 17 are 1F, past the end, 02, 00, 04; all others are 0.
constexpr std::size_t kSampleSize = 18;
constexpr Moment kTime{std::chrono::microseconds(1'330'862'709'000'250)};

class ExplainWriterTest : public ::testing::Test {
 protected:
  ExplainWriterTest() {
    packet[13] = 0x1F;
    packet[15] = 0x02;
    packet[17] = 0x04;
  }

  /// The packet, cut after byte 13 for places that lie past its end.
  [[nodiscard]] PacketHead head(std::size_t size) const {
    return {.message = 12,
            .time = kTime,
            .packet = ByteView(packet).first(size),
            .code = 0xB17F,
            .name = "level"};
  }

  template <class Writer>
  std::string write(const std::function<void(ExplainWriter&)>& use) {
    const TemporaryFile file;
    {
      Output output = *Output::create(file.path());
      Writer writer(output, ExplainStyle());
      writer.begin("LTE");
      use(writer);
      writer.finish();
    }
    return file.contents();
  }

  Bytes packet = Bytes(kSampleSize, 0);
};

const ExplainedSource kCutPlace = {
    .offset = 13, .width = 2, .firstBit = 4, .bitCount = 8, .isPastEnd = true, .raw = 1};
const ExplainedSource kBytePlace = {.offset = 15, .width = 1, .bitCount = 8, .raw = 2};
const ExplainedSource kBitPlace = {
    .offset = 16, .width = 2, .bitCount = 1, .isBigEndian = true, .raw = 4};
const ExplainedSource kListPlace = {.listKey = "kName", .isNumber = false};

// --- Table ---------------------------------------------------------------------------------------

TEST_F(ExplainWriterTest, ATableHasALineForEachPlace) {
  const std::string text = write<ExplainTable>([&](ExplainWriter& writer) {
    writer.beginPacket(head(kSampleSize));
    writer.value({.section = "Cells",
                  .list = "cell",
                  .row = 3,
                  .key = "Sum",
                  .sources = {kBytePlace, kBitPlace},
                  .text = "6"});
    writer.value({.section = "Cells",
                  .list = "cell",
                  .row = 4,
                  .key = "Name",
                  .sources = {kListPlace},
                  .text = Dictionary{{"a", "b"}}});
    writer.value({.section = "Other", .list = "cell", .row = 4, .key = "Gone"});
    writer.endPacket("");
  });
  EXPECT_EQ(text,
            "Message 12  2012-03-04T12:05:09.000250Z  0xB17F level, 18 bytes\n"
            "  Section  Row     Key   At  Bytes  Bits  Raw  Text\n"
            "  Cells    cell 3  Sum   15  02             2  6\n"
            "                         16  00 04  BE 0    4\n"
            "           cell 4  Name      kName             { a = b; }\n"
            "  Other    cell 4  Gone\n");
}

TEST_F(ExplainWriterTest, ATableMarksWhatLiesPastTheEnd) {
  const std::string text = write<ExplainTable>([&](ExplainWriter& writer) {
    writer.beginPacket(head(14));
    writer.value({.section = "Cells", .key = "Level", .sources = {kCutPlace}, .text = "-5 dBm"});
    writer.value({.section = "Cells", .key = "Count", .sources = {kCutPlace}});
    writer.endPacket("");
  });
  EXPECT_EQ(text,
            "Message 12  2012-03-04T12:05:09.000250Z  0xB17F level, 14 bytes\n"
            "  Section  Key    At  Bytes  Bits  Raw  Text\n"
            "  Cells    Level  13  1f --  4-11    1  -5 dBm (past the end)\n"
            "           Count  13  1f --  4-11    1  (past the end)\n");
}

TEST_F(ExplainWriterTest, ATableSaysWhyThereAreNoValues) {
  const std::string text = write<ExplainTable>([&](ExplainWriter& writer) {
    writer.beginPacket({.message = 1, .time = kTime, .packet = ByteView(packet).first(1)});
    writer.endPacket("too short");
    writer.beginPacket(
        {.message = 2, .time = kTime, .packet = packet, .prefixLength = 2, .code = 0xFF0001});
    writer.endPacket("nobody takes it");
  });
  EXPECT_EQ(text,
            "Message 1  2012-03-04T12:05:09.000250Z  1 byte\n"
            "  too short\n"
            "\n"
            "Message 2  2012-03-04T12:05:09.000250Z  0xFF0001  18 bytes after a prefix of 2\n"
            "  nobody takes it\n");
}

TEST_F(ExplainWriterTest, ATableIsSafeForATerminal) {
  const std::string text = write<ExplainTable>([&](ExplainWriter& writer) {
    writer.beginPacket(head(kSampleSize));
    writer.value({.section = "SIM", .key = "\x1B[2J", .text = "a\nb"});
    writer.endPacket("");
  });
  EXPECT_EQ(text.find('\x1B'), std::string::npos);
  EXPECT_NE(text.find("␛[2J"), std::string::npos);
  EXPECT_NE(text.find("a␊b"), std::string::npos);
}

// --- JSON ----------------------------------------------------------------------------------------

TEST_F(ExplainWriterTest, JsonHasOnePacketALine) {
  const std::string text = write<ExplainJson>([&](ExplainWriter& writer) {
    writer.beginPacket(head(14));
    writer.value({.section = "Cells",
                  .list = "cell",
                  .row = 3,
                  .key = "Level",
                  .sources = {kCutPlace},
                  .text = "-5 dBm"});
    writer.endPacket("");
    writer.beginPacket({.message = 13, .time = kTime, .packet = {}});
    writer.endPacket("too short");
  });
  EXPECT_EQ(text,
            R"({"technology":"LTE","messages":[)"
            "\n"
            R"({"message":12,"time":"2012-03-04T12:05:09.000250Z","code":"0xB17F",)"
            R"("name":"level","length":14,"values":[{"section":"Cells","list":"cell","row":3,)"
            R"("key":"Level","sources":[{"offset":13,"bytes":"1f","bits":[4,11],)"
            R"("byteOrder":"little","pastEnd":true,"raw":1}],"text":"-5 dBm"}]},)"
            "\n"
            R"({"message":13,"time":"2012-03-04T12:05:09.000250Z","length":0,"values":[],)"
            R"("remark":"too short"})"
            "\n]}\n");
}

TEST_F(ExplainWriterTest, JsonHasValuesOfPropertyLists) {
  const std::string text = write<ExplainJson>([&](ExplainWriter& writer) {
    PacketHead prefixed = head(kSampleSize);
    prefixed.prefixLength = 2;
    writer.beginPacket(prefixed);
    writer.value({.section = "SIM",
                  .key = "Names",
                  .sources = {kListPlace},
                  .text = Array{"a", Value::integer(-7), Dictionary{{"k", "v"}}}});
    writer.value({.section = "Cells",
                  .key = "RSSI",
                  .sources = {{.raw = -40, .listKey = "kRSSI"}},
                  .text = "-80 dBm"});
    writer.value({.section = "Cells", .key = "Gone"});
    writer.endPacket("");
  });
  const auto message = nlohmann::json::parse(text)["messages"][0];
  EXPECT_EQ(message["prefixLength"], 2);
  EXPECT_EQ(message["values"][0].dump(),
            R"({"key":"Names","section":"SIM","sources":[{"listKey":"kName"}],)"
            R"("text":["a","-7","{ k = v; }"]})");
  EXPECT_EQ(message["values"][1]["sources"].dump(), R"([{"listKey":"kRSSI","raw":-40}])");
  EXPECT_EQ(message["values"][2].dump(), R"({"key":"Gone","section":"Cells","sources":[]})");
}

TEST_F(ExplainWriterTest, JsonWithoutPacketsIsWhole) {
  const std::string text = write<ExplainJson>([](ExplainWriter&) {});
  EXPECT_EQ(nlohmann::json::parse(text).dump(), R"({"messages":[],"technology":"LTE"})");
}

}  // namespace
}  // namespace kestro::testing
