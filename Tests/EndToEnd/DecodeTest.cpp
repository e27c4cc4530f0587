// SPDX-License-Identifier: MIT
#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <regex>
#include <sstream>

#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/PacketMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {
namespace {

using namespace std::chrono_literals;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::StartsWith;

class DecodeTest : public ::testing::Test {
 protected:
  Outcome decode(const std::vector<std::string>& options = {}) {
    std::vector<std::string> arguments{"kestro-cli", "decode", capture.path()};
    arguments.insert(arguments.end(), options.begin(), options.end());
    return run(arguments);
  }

  void write(const std::vector<std::string>& messages) {
    writeCapture(capture.path(), messages, 800ms);
  }
  void writeBytes(std::string_view bytes) {
    std::ofstream(capture.path(), std::ios::binary) << bytes;
  }

  TemporaryFile capture{"a.pcap"};
};

TEST_F(DecodeTest, TreeIsTheDefault) {
  write({ifxMessage("1"), ifxMessage("2")});
  const Outcome outcome = decode();
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(outcome.output,
            "Count  2\n"
            "\n"
            "Cells\n"
            "  #  ARFCN  RxLev\n"
            "  0     62      2\n");
  EXPECT_EQ(outcome.errors, "");
}

TEST_F(DecodeTest, JsonIsOneObject) {
  write({ifxMessage("1"), ifxMessage("2")});
  const Outcome outcome = decode({"--format=json"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(nlohmann::ordered_json::parse(outcome.output).dump(),
            R"({"technology":"IFX","messages":2,"display":)" + ifxDisplay("2") + "}");
}

TEST_F(DecodeTest, NdjsonHasALineForEachTickOfTheCapture) {
  write({ifxMessage("1"), ifxMessage("2"), ifxMessage("3"), ifxMessage("4"), ifxMessage("5")});
  EXPECT_EQ(decode({"--format=ndjson"}).output,
            R"({"time":"2012-03-04T12:05:11.000000Z","message":3,"display":)" + ifxDisplay("3") +
                "}\n" + R"({"time":"2012-03-04T12:05:12.200000Z","message":5,"display":)" +
                ifxDisplay("5") + "}\n");
}

TEST_F(DecodeTest, CsvHasALineForEachLeafOfEachMessage) {
  write({ifxMessage("1"), ifxMessage("2")});
  EXPECT_EQ(decode({"--format=csv", "--refresh-every=0"}).output,
            "time,message,path,value\n"
            "2012-03-04T12:05:09.000000Z,1,/Count,1\n"
            "2012-03-04T12:05:09.000000Z,1,/Cells/0/ARFCN,62\n"
            "2012-03-04T12:05:09.000000Z,1,/Cells/0/RxLev,1\n"
            "2012-03-04T12:05:09.800000Z,2,/Count,2\n"
            "2012-03-04T12:05:09.800000Z,2,/Cells/0/ARFCN,62\n"
            "2012-03-04T12:05:09.800000Z,2,/Cells/0/RxLev,2\n");
}

TEST_F(DecodeTest, MessagesThatEndTheApplicationAreNamedAndSkipped) {
  write(
      {ifxMessage("1"), "garbage", "<plist><dict><key>k</key><integer>1</integer></dict></plist>"});
  const Outcome outcome = decode({"--format=json"});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_EQ(outcome.errors, "kestro-cli: " + capture.path() +
                                ": message 2: Could not deserialize the object "
                                "(LogGenerator/GSM/GSMLogGenerator, line 90)\n"
                                "kestro-cli: " +
                                capture.path() +
                                ": message 3: Unknown object of type number encountered "
                                "(LogGenerator/GSM/GSMLogGenerator, line 78)\n");
  EXPECT_EQ(nlohmann::ordered_json::parse(outcome.output).dump(),
            R"({"technology":"IFX","messages":3,"display":)" + ifxDisplay("1") + "}");
}

TEST_F(DecodeTest, ACutCaptureIsDecodedUpToTheCut) {
  write({ifxMessage("1"), ifxMessage("2")});
  std::filesystem::resize_file(capture.path(), std::filesystem::file_size(capture.path()) - 5);
  const Outcome outcome = decode({"--format=json"});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_THAT(outcome.errors,
              MatchesRegex("kestro-cli: " + capture.path() + ": record 2: [^\n]+\n"));
  EXPECT_EQ(nlohmann::json::parse(outcome.output)["messages"], 1);
}

TEST_F(DecodeTest, ACaptureWithoutMessagesHasNoDisplay) {
  write({});
  const Outcome outcome = decode({"--format=json"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(nlohmann::ordered_json::parse(outcome.output).dump(),
            R"x({"technology":"IFX","messages":0,"display":"(unknown)"})x");
}

TEST_F(DecodeTest, WhatIsNoCaptureIsRefusedWithOneLine) {
  for (const std::string_view bytes : {"", "no capture", "\xD4\xC3\xB2\xA1"}) {
    writeBytes(bytes);
    const Outcome outcome = decode();
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "");
    EXPECT_THAT(outcome.errors, MatchesRegex("kestro-cli: " + capture.path() + ": [^\n]+\n"));
  }
}

TEST_F(DecodeTest, AMissingCaptureIsRefused) {
  const Outcome outcome = run({"kestro-cli", "decode", "/nowhere.pcap"});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_THAT(outcome.errors, StartsWith("kestro-cli: /nowhere.pcap: "));
}

TEST_F(DecodeTest, ACaptureOfAnotherLinkTypeIsRefused) {
  // The header of a capture of Ethernet packets: version 2.4, snapshot length 65535, link type 1.
  writeBytes(
      std::string_view("\xD4\xC3\xB2\xA1\x02\x00\x04\x00\x00\x00\x00\x00\x00\x00\x00\x00"
                       "\xFF\xFF\x00\x00\x01\x00\x00\x00",
                       24));
  const Outcome outcome = decode();
  EXPECT_EQ(outcome.status, 1);
  EXPECT_THAT(outcome.errors, HasSubstr("link type 1"));
}

TEST_F(DecodeTest, LogJsonHasTheSystemLogLines) {
  write({ifxMessage("1")});
  const TemporaryFile log;
  EXPECT_EQ(decode({"--log-json=" + log.path()}).status, 0);
  EXPECT_THAT(log.contents(),
              MatchesRegex(R"(\{"priority":4,"message":"Creating Log object: 0x[0-9a-f]+"\})"
                           "\n"));
}

/// A line of the log with the addresses taken out.
std::string withoutAddresses(const std::string& line) {
  static const std::regex kAddress("0x[0-9a-f]+");
  return std::regex_replace(line, kAddress, "0x");
}

std::string logLine(int priority, const std::string& message) {
  return fmt::format(R"({{"priority":{},"message":"{}"}})", priority, message);
}

/// 0xB180 with one record, all 0; then 0xB0C2, which is too short; then a type that is dropped.
TEST_F(DecodeTest, LogJsonHasEveryLineInOrderWithItsPriority) {
  writeCapture(capture.path(),
               {messageOf(packet(0xB180).length(41)), messageOf(packet(0xB0C2).length(14)),
                messageOf(packet(0xB17F).u8(0, 2))},
               800ms, "LTE");
  const TemporaryFile log;
  EXPECT_EQ(decode({"--log-json=" + log.path()}).status, 0);
  std::istringstream stream(log.contents());
  std::vector<std::string> lines;
  for (std::string line; std::getline(stream, line);) lines.push_back(withoutAddresses(line));
  std::vector<std::string> expected = {logLine(3, "Creating LTELogGenerator object")};
  // One line a decoder: how many codes it subscribes to.
  for (const int count : {3, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1}) {
    expected.push_back(logLine(4, fmt::format("Array Count: {}", count)));
  }
  expected.push_back(logLine(3, "Creating OndrelLogGenerator2 object with 0x"));
  expected.push_back(logLine(4, "Creating Log object: 0x"));
  expected.push_back(logLine(3, "Class Index: 1"));
  // The first message builds the display.
  expected.push_back(logLine(4, "Initialized class index: 0x, Self: 0x"));
  expected.push_back(logLine(4, "Dictionary = 1"));
  expected.push_back(logLine(4, "String = 0"));
  for (const char* section :
       {"Serving Cell Info", "Serving Cell Measurements",
        "Connected mode LTE Intra-frequency Measurement", "Measured Neighbor Cells",
        "Detected Cells", "Neighbor Measurements", "Neighbor Cells List", "Reselection Candidates",
        "Reselection Candidates List", "SIM Info", "PDP Context Info"}) {
    expected.push_back(logLine(4, section));
  }
  expected.push_back(logLine(4, "Neighbor Measurements"));
  expected.push_back(logLine(4, "Neighbor Cells List"));
  expected.push_back(logLine(4, "Number of neighboring cells being reported: 1\\n"));
  expected.push_back(logLine(4, "Physical Cell ID: 0\\n"));
  for (const char* level : {"-140", "-140", "-140", "-30", "-30"}) {
    expected.push_back(logLine(4, fmt::format("Measured RSSI: {}.000000\\n", level)));
  }
  expected.push_back(logLine(4, "LTE Serving Cell Info"));
  expected.push_back(logLine(3, "Invalid log type: 2. Dropping."));
  expected.push_back(logLine(4, "LTELogGenerator is destructed 0x"));
  expected.push_back(logLine(4, "Ondrel_GSMLogGenerator is destructed 0x"));
  EXPECT_EQ(lines, expected);
}

TEST_F(DecodeTest, OutputThatCannotBeWrittenIsAFailure) {
  write({ifxMessage("1")});
  const Outcome outcome = decode({"--log-json=/dev/full"});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.errors, "kestro-cli: /dev/full: No space left on device\n");
}

TEST(Usage, WrongUsageIsTwo) {
  const std::vector<std::vector<std::string>> wrong = {
      {"kestro-cli"},
      {"kestro-cli", "nonsense"},
      {"kestro-cli", "decode"},
      {"kestro-cli", "decode", "x.pcap", "--format=xml"},
      {"kestro-cli", "decode", "x.pcap", "--refresh-every=-1"},
      {"kestro-cli", "decode", "x.pcap", "--refresh-every=nan"},
      {"kestro-cli", "watch", "--count=0"},
      {"kestro-cli", "watch", "--server=a/b"},
      {"kestro-cli", "watch", "--log-priority=2"},
      {"kestro-cli", "watch", "--server=A", "--demo"},
      {"kestro-cli", "watch", "--server=", "--format=ndjson"},
      {"kestro-cli", "watch", "--demo=simulation:x"},
      {"kestro-cli", "record"},
      {"kestro-cli", "record", "-o", "--duration=1"},
      {"kestro-cli", "explain"},
      {"kestro-cli", "explain", "x.pcap", "--message=0"},
      {"kestro-cli", "explain", "x.pcap", "--code=here"},
      {"kestro-cli", "explain", "x.pcap", "--code=0x1000000"},
      {"kestro-cli", "explain", "x.pcap", "--format=csv"},
      {"kestro-cli", "codes", "--technology=CDMA"},
      {"kestro-cli", "codes", "--format=html"},
  };
  for (const auto& arguments : wrong) {
    const Outcome outcome = run(arguments);
    EXPECT_EQ(outcome.status, 2) << arguments.back();
    EXPECT_EQ(outcome.output, "");
    EXPECT_NE(outcome.errors, "");
  }
}

TEST(Usage, HelpIsAnAnswer) {
  for (const char* command : {"watch", "decode", "record", "explain", "codes"}) {
    const Outcome outcome = run({"kestro-cli", command, "--help"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, HasSubstr("Examples:"));
  }
}

TEST(Usage, TheVersionNamesTheProgram) {
  const Outcome outcome = run({"kestro-cli", "--version"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_THAT(outcome.output, MatchesRegex("kestro-cli [0-9]+\\.[0-9]+\\.[0-9]+\n"));
}

}  // namespace
}  // namespace kestro::testing
