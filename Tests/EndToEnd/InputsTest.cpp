// SPDX-License-Identifier: MIT
// Commands that read INPUTs, as their users start them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "Tests/EndToEnd/IFXMessages.h"
#include "Tests/EndToEnd/PacketMessages.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/EndToEnd/RecordingFixture.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::SizeIs;
using ::testing::StartsWith;
using OrderedJson = nlohmann::ordered_json;

constexpr const char* kProgram = KESTRO_PROGRAM_DIRECTORY "/kestro-cli";

/// Rows of GSM and LTE in turn, 10 s each.
constexpr std::string_view kMixedLog =
    "Timestamp,NetworkMode,RSRP,RSRQ,RSSI,CELLHEX,LACHEX,RAWCELLID,Latitude,Longitude\n"
    "2019.11.21_15.38.30,LTE,-90,-7,-70,1,9CBA,258,51.5,-8.5\n"
    "2019.11.21_15.38.40,EDGE,-71,-,-,2B,1A,43,51.6,-8.6\n"
    "2019.11.21_15.38.50,LTE,-91,-8,-71,2,9CBA,259,51.7,-8.7\n";

std::vector<std::string> linesOf(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}

class InputsEndToEndTest : public RecordingFixture {};

TEST_F(InputsEndToEndTest, AMissingInputIsStatusOneAndWrongOnesAreWrongUsage) {
  const auto ifx = capture("a.pcap", {ifxMessage("1")});
  for (const std::string command : {"decode", "explain"}) {
    EXPECT_EQ(cli({command, ifx, "/none"}).errors,
              "kestro-cli: /none: No such file or directory\n");
    EXPECT_EQ(cli({command, ifx, "/none"}).status, 1) << command;
    EXPECT_EQ(cli({command}).status, 2) << command;
    EXPECT_EQ(cli({command, "simulation:5G", "--to=#1"}).status, 2) << command;
    EXPECT_EQ(cli({command, ifx, "--from=yesterday"}).status, 2) << command;
    EXPECT_EQ(cli({command, ifx, "--technology=5G"}).status, 2) << command;
    EXPECT_EQ(cli({command, "simulation:LTE"}).status, 2) << command;
  }
  EXPECT_THAT(cli({"decode", "simulation:LTE"}).errors, HasSubstr("--to must say where to stop"));
}

TEST_F(InputsEndToEndTest, AFileNamedLikeAKindIsReachedByItsPath) {
  capture("capture:x", {ifxMessage("7")});
  const auto outcome = cli({"decode", directory.pathOf("capture:x")});
  EXPECT_THAT(outcome.output, HasSubstr("Count  7"));
}

TEST_F(InputsEndToEndTest, DecodeFollowsAChangeOfTechnology) {
  const auto log = directory.write("log.csv", kMixedLog);
  const auto outcome = cli({"decode", log, "--format=ndjson"});
  EXPECT_EQ(outcome.status, 0) << outcome.errors;
  std::vector<std::string> technologies;
  std::vector<std::string> groups;
  for (const auto& line : linesOf(outcome.output)) {
    const auto refresh = OrderedJson::parse(line);
    technologies.push_back(refresh["technology"]);
    groups.push_back(refresh["display"].begin().key());
  }
  EXPECT_THAT(technologies, ElementsAre("LTE", "Ondrel_GSM", "LTE"));
  EXPECT_EQ(groups[0], "Serving Cell");
  EXPECT_NE(groups[1], "Serving Cell");
  EXPECT_EQ(groups[2], "Serving Cell");

  const auto last = OrderedJson::parse(cli({"decode", log, "--format=json"}).output);
  EXPECT_EQ(last["technology"], "LTE");
  EXPECT_EQ(last["display"]["Serving Cell"]["Serving Cell Measurements"]["Measured RSRP"],
            "-91.00 dBm");

  const auto csv = linesOf(cli({"decode", log, "--format=csv"}).output);
  EXPECT_EQ(csv.front(), "time,message,technology,path,value");
  EXPECT_THAT(csv[1], StartsWith("2019-11-21T15:38:32.000000Z,"));
  EXPECT_THAT(csv[1], HasSubstr(",LTE,/Serving Cell/"));
}

TEST_F(InputsEndToEndTest, OneTechnologyNeedsNoField) {
  const auto log = directory.write("log.csv", kMixedLog);
  EXPECT_EQ(linesOf(cli({"decode", log, "--technology=LTE", "--format=csv"}).output).front(),
            "time,message,path,value");
  const auto line = linesOf(cli({"decode", log, "--technology=LTE", "--format=ndjson"}).output);
  EXPECT_FALSE(OrderedJson::parse(line.front()).contains("technology"));
}

TEST_F(InputsEndToEndTest, SeveralInputsAreMergedByTime) {
  const auto a = capture("a", {ifxMessage("1"), ifxMessage("2")});
  const auto b = capture("b", {ifxMessage("3"), ifxMessage("4")});
  std::vector<std::string> counts;
  for (const auto& line :
       linesOf(cli({"decode", a, b, "--refresh-every=0", "--format=ndjson"}).output)) {
    counts.push_back(OrderedJson::parse(line)["display"]["Count"]);
  }
  EXPECT_THAT(counts, ElementsAre("1", "3", "2", "4"));
}

TEST_F(InputsEndToEndTest, ToANumberEndsBehindItWithARefresh) {
  const auto a = capture("a", {ifxMessage("1"), ifxMessage("2"), ifxMessage("3")});
  const auto outcome = cli({"decode", a, "--to=#2", "--format=json"});
  EXPECT_EQ(OrderedJson::parse(outcome.output)["display"]["Count"], "2");
  EXPECT_EQ(OrderedJson::parse(outcome.output)["messages"], 2);
}

TEST_F(InputsEndToEndTest, NarrowedMessagesKeepTheirNumbers) {
  const auto a = capture("a", {ifxMessage("1"), ifxMessage("2"), ifxMessage("3")});
  const auto line =
      linesOf(cli({"decode", a, "--from=+1s", "--refresh-every=0", "--format=ndjson"}).output);
  ASSERT_THAT(line, SizeIs(1));
  EXPECT_EQ(OrderedJson::parse(line[0])["message"], 3);
}

TEST_F(InputsEndToEndTest, StandardInputIsReadByContent) {
  const auto a = capture("a", {ifxMessage("1")});
  const auto log = directory.write("log.csv", kMixedLog);
  const auto decoded = [](const std::string& path) {
    return run({"/bin/sh", "-c", "cat '" + path + "' | \"$0\" decode - --format=json", kProgram});
  };
  EXPECT_EQ(decoded(a).output, cli({"decode", a, "--format=json"}).output);
  EXPECT_EQ(decoded(log).output, cli({"decode", log, "--format=json"}).output);
}

TEST_F(InputsEndToEndTest, ACaptureThroughAPipeNeedsNoFieldEither) {
  const auto a = capture("a", {ifxMessage("1")});
  const auto piped =
      run({"/bin/sh", "-c", "cat '" + a + "' | \"$0\" decode - --format=csv", kProgram});
  EXPECT_EQ(piped.output, cli({"decode", a, "--format=csv"}).output);
}

TEST_F(InputsEndToEndTest, AnEndlessStreamEndsWhereItIsAsked) {
  // A stream that repeats one IFX message for ever.
  const std::string message = ifxMessage("5");
  std::string frame(4, '\0');
  for (std::size_t i = 0; i < 4; ++i) frame[i] = static_cast<char>(message.size() >> (8 * i));
  const auto piece = directory.write("piece", frame + message);
  const std::string endless = "while cat '" + piece + "'; do :; done | \"$0\" decode stream:- ";
  const auto outcome = run({"/bin/sh", "-c", endless + "--to=#3 --format=json 2>&1", kProgram});
  EXPECT_THAT(outcome.output, HasSubstr("\"messages\": 3"));
  const auto timed = run({"/bin/sh", "-c", endless + "--to=+0.2s --format=json 2>&1", kProgram});
  EXPECT_THAT(timed.output, HasSubstr("\"Count\": \"5\""));
}

TEST_F(InputsEndToEndTest, WhereOneInputIsDamagedTheOthersAreDecoded) {
  const auto a = capture("a", {ifxMessage("1"), ifxMessage("2")});
  const auto b = capture("b", {ifxMessage("3"), ifxMessage("4")});
  std::filesystem::resize_file(a, std::filesystem::file_size(a) - 1);
  const auto outcome = cli({"decode", a, b, "--format=json"});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_THAT(outcome.errors, StartsWith("kestro-cli: " + a + ": record 2: "));
  EXPECT_EQ(OrderedJson::parse(outcome.output)["messages"], 3);
}

TEST_F(InputsEndToEndTest, ALogFileThatIsAnInputIsRefused) {
  const auto a = capture("a", {ifxMessage("1")});
  const auto b = capture("b", {ifxMessage("2")});
  const auto outcome = cli({"decode", a, b, "--log-json=" + b});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_THAT(outcome.errors, HasSubstr("the output would replace the input"));
  EXPECT_THAT(cli({"decode", b}).output, HasSubstr("Count  2"));
}

TEST_F(InputsEndToEndTest, ADirectoryIsNoInput) {
  const auto outcome = cli({"decode", directory.path().string()});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_THAT(outcome.errors, HasSubstr("directory"));
}

TEST_F(InputsEndToEndTest, ListTellsWhatMessagesAre) {
  const auto log = directory.write("log.csv", kMixedLog);
  const auto lines = linesOf(cli({"explain", "--list", log}).output);
  EXPECT_THAT(lines, Contains("Message 6  2019-11-21T15:38:30.000000Z  LTE  0xB17F LTE "
                              "serving-cell measurement, 33 bytes"));
  EXPECT_THAT(lines, Contains(HasSubstr("2019-11-21T15:38:40.000000Z  Ondrel_GSM  0x")));
  const auto narrowed = linesOf(cli({"explain", "--list", log, "--code=B17F"}).output);
  EXPECT_THAT(narrowed, ElementsAre("Message 6  2019-11-21T15:38:30.000000Z  0xB17F LTE "
                                    "serving-cell measurement, 33 bytes",
                                    HasSubstr("2019-11-21T15:38:50.000000Z  0xB17F LTE ")));
}

TEST_F(InputsEndToEndTest, ListOfOneTechnologyHasAllMessages) {
  const auto lte = capture("lte", {messageOf(packet(0xB0C2).u8(40, 0)), "short"}, "LTE");
  EXPECT_EQ(cli({"explain", "--list", lte}).output,
            "Message 1  2012-03-04T12:05:09.000000Z  0xB0C2 LTE serving-cell system information, "
            "41 bytes\n"
            "Message 2  2012-03-04T12:05:09.800000Z  5 bytes\n");
  const auto json = OrderedJson::parse(cli({"explain", "--list", lte, "--format=json"}).output);
  EXPECT_EQ(json["messages"][0].dump(),
            R"({"message":1,"time":"2012-03-04T12:05:09.000000Z","code":"0xB0C2",)"
            R"("name":"LTE serving-cell system information","length":41})");
  const auto ifx = capture("ifx", {"abc"});
  EXPECT_EQ(cli({"explain", "--list", ifx}).output,
            "Message 1  2012-03-04T12:05:09.000000Z  3 bytes\n");
}

TEST_F(InputsEndToEndTest, ExplainNamesTheTechnologyOfEachMessageWhereThereAreSeveral) {
  const auto log = directory.write("log.csv", kMixedLog);
  const auto json = OrderedJson::parse(cli({"explain", log, "--format=json"}).output);
  EXPECT_FALSE(json.contains("technology"));
  EXPECT_EQ(json["messages"].front()["technology"], "LTE");
  const auto one =
      OrderedJson::parse(cli({"explain", log, "--technology=LTE", "--format=json"}).output);
  EXPECT_EQ(one["technology"], "LTE");
  EXPECT_FALSE(one["messages"].front().contains("technology"));
}

TEST_F(InputsEndToEndTest, ExplainPassesOverPropertyListsAmongPackets) {
  const auto ifx = capture("ifx", {ifxMessage("1")});
  const auto lte = capture("lte", {messageOf(packet(0xB0C2).u8(40, 0))}, "LTE");
  const auto both = cli({"explain", ifx, lte});
  EXPECT_EQ(both.status, 0) << both.errors;
  EXPECT_THAT(both.output, StartsWith("Message 2 "));
  EXPECT_EQ(cli({"explain", ifx}).status, 1);
  EXPECT_THAT(cli({"explain", ifx, lte, "--message=1"}).errors,
              HasSubstr("property lists, not packets"));
}

TEST_F(InputsEndToEndTest, ASnapshotIsSavedOfSeveralInputs) {
  const auto a = capture("a", {ifxMessage("1")});
  const auto b = capture("b", {ifxMessage("2")});
  const auto file = directory.pathOf("s.kestro");
  ASSERT_EQ(cli({"snapshot", "save", a, b, "-o", file, "--description=x"}).status, 0);
  EXPECT_THAT(cli({"snapshot", "show", file}).output, HasSubstr("2"));
  const auto refused = cli({"snapshot", "save", a, b, "-o", b, "--description=x"});
  EXPECT_EQ(refused.status, 1);
  EXPECT_THAT(refused.errors, HasSubstr("the output would replace the input"));
}

TEST_F(InputsEndToEndTest, EveryFormGoesIntoEveryCommand) {
  const auto path = [&](const std::string& name) { return directory.pathOf(name); };
  for (const std::string technology : {"LTE", "Ondrel_GSM", "Ondrel_CDMA", "UTRAN2"}) {
    // Few enough for a snapshot's history to hold all of it.
    ASSERT_EQ(
        cli({"convert", "simulation:" + technology, "--to=+9.5s", "-o", path("a.pcapng")}).status,
        0);
    ASSERT_EQ(cli({"convert", path("a.pcapng"), "-o", path("a.pcap")}).status, 0);
    ASSERT_EQ(cli({"convert", path("a.pcapng"), "-o", path("a.dlf")}).status, 0);
    ASSERT_EQ(cli({"snapshot", "save", path("a.pcapng"), "-o", path("a.kestro"), "--description="})
                  .status,
              0);
    const auto display = cli({"decode", path("a.pcap")}).output;
    const auto packets = linesOf(cli({"explain", path("a.pcap"), "--list"}).output).size();
    for (const std::string name : {"a.pcapng", "a.dlf", "a.kestro"}) {
      EXPECT_EQ(cli({"decode", path(name)}).output, display) << name << technology;
      EXPECT_THAT(linesOf(cli({"explain", path(name), "--list"}).output), SizeIs(packets))
          << name << technology;
      EXPECT_EQ(cli({"explain", path(name)}).status, 0);
      EXPECT_THAT(cli({"info", path(name)}).output, HasSubstr(technology));
      ASSERT_EQ(cli({"convert", path(name), "-o", path("b.pcap")}).status, 0) << name;
      EXPECT_EQ(cli({"decode", path("b.pcap")}).output, display) << name << technology;
      EXPECT_EQ(
          cli({"snapshot", "save", path(name), "-o", path("b.kestro"), "--description="}).status,
          0);
    }
  }
}

TEST_F(InputsEndToEndTest, ADlfLogAmongOthersKeepsItsTechnology) {
  const auto lte = directory.pathOf("lte.dlf");
  const auto gsm = directory.pathOf("gsm.dlf");
  ASSERT_EQ(cli({"convert", "simulation:LTE", "--to=+2s", "-o", lte}).status, 0);
  ASSERT_EQ(cli({"convert", "simulation:Ondrel_GSM", "--to=+2s", "-o", gsm}).status, 0);
  const auto technologies = [](const Outcome& outcome) {
    std::set<std::string> names;
    const auto messages = OrderedJson::parse(outcome.output)["messages"];
    for (const auto& message : messages) names.insert(message["technology"]);
    return names;
  };
  EXPECT_THAT(technologies(cli({"explain", "--list", "--format=json", lte, gsm})),
              ElementsAre("LTE", "Ondrel_GSM"));
}

TEST_F(InputsEndToEndTest, AServerAndADemoPlayAnyRecording) {
  // Half a minute of a row a second, so that there is something to see whenever the display is up.
  std::string log = "Timestamp,NetworkMode,RSRP,RSRQ,RSSI,CELLHEX,LACHEX,RAWCELLID\n";
  for (int second = 10; second < 40; ++second) {
    log += "2019.11.21_15.38." + std::to_string(second) + ",LTE,-90,-7,-70,1,9CBA,258\n";
  }
  const auto csv = directory.write("log.csv", log);
  const auto drive = directory.pathOf("drive.pcapng");
  ASSERT_EQ(cli({"convert", csv, "-o", drive}).status, 0);
  for (const auto& recording : {drive, csv}) {
    const auto outcome = cli({"watch", "--demo=" + recording, "--format=ndjson", "--count=1"});
    EXPECT_EQ(outcome.status, 0) << outcome.errors;
    EXPECT_THAT(outcome.output, HasSubstr(R"("Measured RSRP":"-90.00 dBm")"));
  }
}

TEST_F(InputsEndToEndTest, ARecordingThatADemoPlaysIsNotRecordedOver) {
  const auto a = capture("a.pcap", {ifxMessage("1")});
  for (const auto& demo : {"--demo=" + a, "--demo=capture:" + a}) {
    const auto outcome = cli({"record", demo, "-o", a, "--duration=0.1"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.errors, HasSubstr("the output would replace the input"));
  }
  EXPECT_THAT(cli({"decode", a}).output, HasSubstr("Count  1"));
}

TEST_F(InputsEndToEndTest, InAPipeNoProgressIsShown) {
  const auto outcome = cli({"decode", "simulation:LTE", "--to=+8h"});
  EXPECT_EQ(outcome.errors, "");
}

TEST_F(InputsEndToEndTest, OnATerminalProgressIsShownAfterASecond) {
  Process process({"kestro-cli", "decode", "simulation:LTE", "--to=+1000h"},
                  {.environment = {}, .terminal = Process::Terminal::Own});
  EXPECT_TRUE(process.waitForOutput(" left\r"));
  process.signal(SIGTERM);
}

}  // namespace
}  // namespace kestro::testing
