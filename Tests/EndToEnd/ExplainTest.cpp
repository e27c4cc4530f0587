// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <nlohmann/json.hpp>

#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/PacketMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {
namespace {

using namespace std::chrono_literals;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;
using ::testing::SizeIs;
using ::testing::StartsWith;
using Json = nlohmann::ordered_json;

/// What the decoders leave on what would be their standard output.
constexpr const char* kDecodersLines = "Deallocing LTEClassIndex\nDeallocing ClassIndex\n";

class ExplainTest : public ::testing::Test {
 protected:
  Outcome explain(const std::vector<std::string>& options = {}) {
    std::vector<std::string> arguments{"kestro-cli", "explain", capture.path()};
    arguments.insert(arguments.end(), options.begin(), options.end());
    return run(arguments);
  }

  void write(const std::vector<PacketBytes>& packets, std::string_view technology = "LTE") {
    std::vector<std::string> messages;
    std::ranges::transform(packets, std::back_inserter(messages), messageOf);
    writeCapture(capture.path(), messages, 800ms, technology);
  }

  /// The values of the first message.
  Json valuesOf(const PacketBytes& packet, std::string_view technology) {
    write({packet}, technology);
    const Outcome outcome = explain({"--format=json"});
    EXPECT_EQ(outcome.status, 0) << outcome.errors;
    return Json::parse(outcome.output)["messages"][0]["values"];
  }

  TemporaryFile capture{"a.pcap"};
};

/// One measured neighbour, whose level is cut in the middle, and no detected cell.
PacketBytes cutIntraFrequency() {
  return packet(0xB179)
      .u16(17, 1300)
      .u16(19, 14)
      .u16(21, 500)
      .u16(23, 204)
      .u16(25, 85)
      .u8(27, 1)
      .u8(28, 0)
      .u16(29, 59)
      .u8(31, 187);
}

TEST_F(ExplainTest, TableIsTheDefault) {
  write({cutIntraFrequency()});
  const Outcome outcome = explain();
  EXPECT_EQ(outcome.status, 0);
  // clang-format off
  EXPECT_EQ(
      outcome.output,
      "Message 1  2012-03-04T12:05:09.000000Z  0xB179 LTE intra-frequency measurement, 32 bytes\n"
      "  Section                                         Row                   Key                       At  Bytes   Raw  Text\n"
      "  Connected mode LTE Intra-frequency Measurement                        E-ARFCN                   17  14 05  1300  1300\n"
      "                                                                        Serving Physical Cell ID  19  0e 00    14  14\n"
      "                                                                        Subframe Number           21  f4 01   500  500\n"
      "                                                                        Serving Filtered RSRP     23  cc 00   204  -89.00 dBm\n"
      "                                                                        Serving Filtered RSRQ     25  55 00    85  -9.38 dB\n"
      "  Measured Neighbor Cells                         measured neighbour    count                     27  01        1\n"
      "                                                  measured neighbour 0  Physical Cell ID          29  3b 00    59  59\n"
      "                                                                        Filtered RSRP             31  bb --   187  -93.25 dBm (past the end)\n"
      "                                                                        Filtered RSRQ             33  -- --     0  -20.00 dB (past the end)\n"
      "  Detected Cells                                  detected cell         count                     28  00        0\n");
  // clang-format on
  EXPECT_EQ(outcome.errors, "");
}

TEST_F(ExplainTest, ShowsTheDecodersLinesWhenAskedTo) {
  write({packet(0xB0C1)});
  const Outcome outcome = explain({"--log-priority=3"});
  EXPECT_THAT(outcome.errors, StartsWith("Creating LTELogGenerator object\n"));
  EXPECT_THAT(outcome.errors, EndsWith(kDecodersLines));
}

TEST_F(ExplainTest, JsonIsOneObject) {
  write({cutIntraFrequency(), packet(0xB0C2).length(14)});
  const Outcome outcome = explain({"--format=json"});
  EXPECT_EQ(outcome.status, 0);
  const Json json = Json::parse(outcome.output);
  EXPECT_EQ(json["technology"], "LTE");
  ASSERT_THAT(json["messages"], SizeIs(2));
  const Json& message = json["messages"][0];
  EXPECT_EQ(message["message"], 1);
  EXPECT_EQ(message["time"], "2012-03-04T12:05:09.000000Z");
  EXPECT_EQ(message["code"], "0xB179");
  EXPECT_EQ(message["name"], "LTE intra-frequency measurement");
  EXPECT_EQ(message["length"], 32);
  EXPECT_EQ(message["values"][7].dump(),
            R"({"section":"Measured Neighbor Cells","list":"measured neighbour","row":0,)"
            R"("key":"Filtered RSRP","sources":[{"offset":31,"bytes":"bb","bits":[0,15],)"
            R"("byteOrder":"little","pastEnd":true,"raw":187}],"text":"-93.25 dBm"})");
  EXPECT_EQ(json["messages"][1].dump(),
            R"({"message":2,"time":"2012-03-04T12:05:09.800000Z","code":"0xB0C2",)"
            R"("name":"LTE serving-cell system information","length":14,"values":[],)"
            R"("remark":"too short: sections read this packet from 38 bytes on"})");
}

TEST_F(ExplainTest, ShowsTheBitsOfAnInteger) {
  // 0x0C0E: the cell 0x00E in bits 0 to 8, the priority 6 in bits 9 to 12.
  const Json values = valuesOf(packet(0xB17F).u16(19, 0x0C0E).length(33), "LTE");
  EXPECT_EQ(values[3]["key"], "Serving Layer Priority");
  EXPECT_EQ(values[3]["sources"].dump(),
            R"([{"offset":19,"bytes":"0e0c","bits":[9,12],"byteOrder":"little",)"
            R"("pastEnd":false,"raw":6}])");
  EXPECT_EQ(values[3]["text"], "6");
}

TEST_F(ExplainTest, ShowsAComputedValueWithEverySource) {
  // The country code's digits 4, 2 and 1 are the halves of byte 15 and the upper half of byte 16.
  const Json values =
      valuesOf(packet(0x7135).u8(15, 0x24).u8(16, 0x1F).u8(17, 0x10).length(32), "Ondrel_GSM");
  EXPECT_EQ(values[0]["section"], "Serving PLMN");
  EXPECT_EQ(values[0]["key"], "Mobile Country Code");
  EXPECT_THAT(values[0]["sources"], SizeIs(3));
}

TEST_F(ExplainTest, ShowsACellsListKeyInsteadOfBytes) {
  const std::string list =
      "<plist version=\"1.0\"><array><dict>"
      "<key>kTqCellMonitorCellRadioAccessTechnology</key>"
      "<string>kTqCellMonitorRadioAccessTechnologyLTE</string>"
      "<key>kTqCellMonitorCellType</key><string>kTqCellMonitorCellTypeServing</string>"
      "<key>kTqCellMonitorTAC</key><integer>4711</integer>"
      "</dict></array></plist>";
  const Json values = valuesOf(packet(0xFF0001).append(Bytes(list.begin(), list.end())), "LTE");
  EXPECT_EQ(values[0].dump(),
            R"({"section":"Serving Cell Info","key":"Tracking Area Code",)"
            R"("sources":[{"listKey":"kTqCellMonitorTAC","raw":4711}],"text":"4711"})");
  // The cell has no identity: the key is left alone.
  EXPECT_EQ(values[1].dump(), R"({"section":"Serving Cell Info","key":"Cell Identity",)"
                              R"("sources":[{"listKey":"kTqCellMonitorCellId"}]})");
}

TEST_F(ExplainTest, ExplainsTheOtherTechnologies) {
  // State 3 of the valid mode 1.
  const Json rrc = valuesOf(packet(0xD0E0).u8(13, 1).u8(14, 3), "UTRAN2");
  EXPECT_EQ(rrc[1]["section"], "RRC Info");
  EXPECT_EQ(rrc[1]["text"], "Cell DCH");
  // One pilot: PN offset 7 at byte 25, energy 512 of 512 at byte 27.
  const Json pilots =
      valuesOf(packet(0x12B6).u8(15, 1).u16(25, 7).u16(27, 512).length(37), "Ondrel_CDMA");
  EXPECT_EQ(pilots[1]["section"], "EV-DO");
  EXPECT_EQ(pilots[1]["list"], "Active Set");
  EXPECT_EQ(pilots[1]["row"], 0);
  EXPECT_EQ(pilots[1]["text"], "7");
  EXPECT_EQ(pilots[2]["text"], "+0.00 dB");
}

TEST_F(ExplainTest, APrefixIsNoPartOfThePacket) {
  Bytes message = {0x81, 0};
  const Bytes bytes = packet(0xB0C1).u8(20, 2).length(22).bytes();
  message.insert(message.end(), bytes.begin(), bytes.end());
  writeCapture(capture.path(), {{message.begin(), message.end()}}, 0s, "LTE");
  const std::string output = explain().output;
  EXPECT_THAT(output, HasSubstr("0xB0C1 LTE transmit antennas, 22 bytes after a prefix of 2\n"));
  EXPECT_THAT(output, HasSubstr("Num Tx Antennas  20  02       2  2\n"));
}

TEST_F(ExplainTest, SaysWhyNothingIsRead) {
  write({packet(0xB17F).length(12), packet(0xB17F).u8(0, 2), packet(0x1234)});
  EXPECT_EQ(
      explain().output,
      "Message 1  2012-03-04T12:05:09.000000Z  12 bytes\n"
      "  too short for a packet, which has at least 13 bytes\n"
      "\n"
      "Message 2  2012-03-04T12:05:09.800000Z  0xB17F LTE serving-cell measurement, 13 bytes\n"
      "  dropped: 0x02 is no log type\n"
      "\n"
      "Message 3  2012-03-04T12:05:10.600000Z  0x1234  13 bytes\n"
      "  no section takes this log code\n");
}

TEST_F(ExplainTest, ChoosesOneMessage) {
  write({packet(0xB0C1), packet(0xB0C2), packet(0xB0C1)});
  const Outcome outcome = explain({"--message=2"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_THAT(outcome.output, StartsWith("Message 2  "));
  EXPECT_THAT(outcome.output, Not(HasSubstr("Message 3")));
}

TEST_F(ExplainTest, ChoosesSeveralMessages) {
  write({packet(0xB0C1), packet(0xB0C2), packet(0xB0C1), packet(0xB0C2)});
  const Outcome outcome = explain({"--message=2-3"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_THAT(outcome.output, StartsWith("Message 2  "));
  EXPECT_THAT(outcome.output, HasSubstr("Message 3  "));
  EXPECT_THAT(outcome.output, Not(HasSubstr("Message 4")));
}

TEST_F(ExplainTest, ChoosesOneCode) {
  write({packet(0xB0C1), packet(0xB0C2), packet(0xB0C1)});
  for (const char* code : {"--code=0xB0C1", "--code=b0c1"}) {
    const Outcome outcome = explain({code, "--format=json"});
    EXPECT_EQ(outcome.status, 0);
    const Json messages = Json::parse(outcome.output)["messages"];
    ASSERT_THAT(messages, SizeIs(2)) << code;
    EXPECT_EQ(messages[1]["message"], 3);
  }
}

TEST_F(ExplainTest, WhatIsNotThereIsAnError) {
  write({packet(0xB0C1)});
  for (const auto& [option, what] :
       {std::pair("--message=2", "no message 2"), std::pair("--message=2-3", "no message 2 to 3"),
        std::pair("--code=7", "no message of log code 0x0007")}) {
    const Outcome outcome = explain({option, "--format=json"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.output, IsEmpty());
    EXPECT_THAT(outcome.errors,
                HasSubstr("kestro-cli: " + capture.path() + ": there is " + what + "\n"));
  }
}

TEST_F(ExplainTest, ACaptureWithoutMessagesExplainsNothing) {
  write({});
  EXPECT_EQ(explain().output, "");
  EXPECT_EQ(explain().status, 0);
  EXPECT_EQ(Json::parse(explain({"--format=json"}).output).dump(),
            R"({"technology":"LTE","messages":[]})");
}

TEST_F(ExplainTest, TheIFXChannelHasNoPackets) {
  writeCapture(capture.path(), {ifxMessage("1")}, 0s);
  const Outcome outcome = explain();
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.output, "");
  EXPECT_EQ(outcome.errors,
            "kestro-cli: " + capture.path() +
                ": the messages of IFX are property lists, not packets; there is nothing to "
                "explain\n");
}

TEST_F(ExplainTest, ACutCaptureIsExplainedUpToTheCut) {
  write({packet(0xB0C1), packet(0xB0C1)});
  std::filesystem::resize_file(capture.path(), std::filesystem::file_size(capture.path()) - 5);
  const Outcome outcome = explain({"--format=json"});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_THAT(outcome.errors, HasSubstr(": record 2: "));
  EXPECT_THAT(Json::parse(outcome.output)["messages"], SizeIs(1));
}

TEST_F(ExplainTest, AMissingCaptureIsRefused) {
  const Outcome outcome = run({"kestro-cli", "explain", "/nowhere.pcap"});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_THAT(outcome.errors, StartsWith("kestro-cli: /nowhere.pcap: "));
}

}  // namespace
}  // namespace kestro::testing
