// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <set>

#include "Tests/EndToEnd/LiveFixture.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::IsSupersetOf;
using ::testing::MatchesRegex;
using ::testing::Not;
using ::testing::SizeIs;

/// The displays of lines of ndjson, each as compact JSON.
std::vector<std::string> displaysIn(const std::vector<std::string>& lines) {
  std::vector<std::string> result;
  result.reserve(lines.size());
  for (const std::string& line : lines) {
    result.push_back(nlohmann::ordered_json::parse(line)["display"].dump());
  }
  return result;
}

/// The children of a process.
std::vector<pid_t> childrenOf(pid_t process) {
  const std::string id = std::to_string(process);
  std::ifstream stream("/proc/" + id + "/task/" + id + "/children");
  std::vector<pid_t> result;
  for (pid_t child = 0; stream >> child;) result.push_back(child);
  return result;
}

bool isRunning(pid_t process) {
  std::ifstream stream("/proc/" + std::to_string(process) + "/stat");
  std::string word;
  for (int i = 0; i < 3; ++i) stream >> word;
  return stream && word != "Z";
}

TEST_F(LiveTest, WatchWritesEventsAsTheyHappen) {
  startServer("simulation:LTE");
  const auto watch = start({"kestro-cli", "watch", "--format=events", "--count=1",
                            "--rule=Serving Cell Measurements/Measured RSRP < 0 dBm"});
  EXPECT_EQ(watch->wait(), 0);
  ASSERT_THAT(watch->outputLines(), SizeIs(1));
  const auto event = nlohmann::json::parse(watch->outputLines()[0]);
  EXPECT_EQ(event["event"], "alarm");
  EXPECT_EQ(event["to"], "Serving Cell Measurements/Measured RSRP < 0 dBm");
  EXPECT_LT(event["value"], 0);
  EXPECT_EQ(event["told_by"], "0xB17F");
}

TEST_F(LiveTest, RulesAreForEvents) {
  const auto watch = start({"kestro-cli", "watch", "--rule=RSRP < 0"});
  EXPECT_EQ(watch->wait(), 2);
  EXPECT_EQ(watch->errors(), "kestro-cli: rules are for --format=events\n");
}

TEST_F(LiveTest, WatchWritesTheSourcesDisplays) {
  startServer();
  const auto watch = start({"kestro-cli", "watch", "--format=ndjson", "--count=2"});
  EXPECT_EQ(watch->wait(), 0);
  const auto displays = displaysIn(watch->outputLines());
  ASSERT_THAT(displays, SizeIs(2));
  const int first = std::stoi(std::string(nlohmann::json::parse(displays[0])["Count"]));
  const int second = std::stoi(std::string(nlohmann::json::parse(displays[1])["Count"]));
  EXPECT_EQ(displays[0], ifxDisplay(std::to_string(first)));
  EXPECT_EQ(displays[1], ifxDisplay(std::to_string(second)));
  EXPECT_GT(second, first);
}

TEST_F(LiveTest, ARecordingDecodesToTheDisplaysThatWereWatched) {
  startServer();
  const std::string recording = source.directory() + "/recording.pcap";
  const auto record = start({"kestro-cli", "record", "-o", recording});
  ASSERT_TRUE(record->waitUntil(
      [&] { return record->errors().find("recording IFX") != std::string::npos; }));
  const auto watch = start({"kestro-cli", "watch", "--format=ndjson", "--count=2"});
  EXPECT_EQ(watch->wait(), 0);
  record->signal(SIGINT);
  EXPECT_EQ(record->wait(), 0);
  EXPECT_THAT(record->errors(), HasSubstr(" 0 dropped, in " + recording));

  const Outcome decoded =
      run({"kestro-cli", "decode", recording, "--format=ndjson", "--refresh-every=0"});
  EXPECT_EQ(decoded.status, 0);
  std::istringstream stream(decoded.output);
  std::vector<std::string> lines;
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  EXPECT_THAT(displaysIn(lines), IsSupersetOf(displaysIn(watch->outputLines())));
}

TEST_F(LiveTest, RecordEndsAfterItsDuration) {
  startServer();
  const std::string recording = source.directory() + "/recording.pcap";
  const auto record = start({"kestro-cli", "record", "-o", recording, "--duration=0.5"});
  EXPECT_EQ(record->wait(), 0);
  EXPECT_THAT(record->errors(), HasSubstr("kestro-cli: recorded "));
}

TEST_F(LiveTest, RecordWithoutAServerHasDoneNothing) {
  const auto record = start({"kestro-cli", "record", "-o", "/tmp/never", "--duration=0.2"});
  EXPECT_EQ(record->wait(), 1);
  EXPECT_EQ(record->errors(),
            "kestro-cli: no telephony server \"TelephonyServer\" is running: start "
            "kestro-telephonyd, or use --demo\n"
            "kestro-cli: connecting...\n"
            "kestro-cli: nothing was recorded: no telephony server could be connected to\n");
}

TEST_F(LiveTest, RecordLooksAtItsOutputBeforeItConnects) {
  const auto record = start({"kestro-cli", "record", "-o", "/nowhere/drive.pcap"});
  EXPECT_EQ(record->wait(), 1);
  EXPECT_EQ(record->errors(),
            "kestro-cli: /nowhere/drive.pcap: cannot create: No such file or directory\n");
}

TEST_F(LiveTest, RecordWritesToStandardOutput) {
  startServer();
  const auto record = start({"kestro-cli", "record", "-o", "-", "--duration=0.5"});
  EXPECT_EQ(record->wait(), 0);
  EXPECT_THAT(record->errors(), HasSubstr(" 0 dropped, in standard output"));
  const std::string recording = source.directory() + "/recording.pcap";
  std::ofstream(recording, std::ios::binary) << record->output();
  const Outcome decoded = run({"kestro-cli", "decode", recording});
  EXPECT_EQ(decoded.status, 0);
  EXPECT_THAT(decoded.output, HasSubstr("Count  "));
}

TEST_F(LiveTest, RecordWritesToNoTerminal) {
  const auto record = start({"kestro-cli", "record", "-o", "-"}, Process::Terminal::Own);
  EXPECT_EQ(record->wait(), 1);
  EXPECT_THAT(record->output(), HasSubstr("standard output is a terminal"));
}

TEST_F(LiveTest, AKilledServerIsReconnectedToAndTheDisplayGoesOn) {
  startServer();
  const auto watch = start({"kestro-cli", "watch"});
  ASSERT_TRUE(watch->waitForOutput("Updated "));
  server->signal(SIGKILL);
  server->wait();
  watch->forgetOutput();
  ASSERT_TRUE(watch->waitForOutput("Connecting...\n"));
  watch->forgetOutput();
  startServer();
  ASSERT_TRUE(watch->waitForOutput("\n\nCount  "));
  EXPECT_THAT(watch->output(), HasSubstr("Updated "));
  watch->signal(SIGINT);
  EXPECT_EQ(watch->wait(), 0);
}

TEST_F(LiveTest, AGarbageDisplayListEndsWatchWithItsName) {
  startGarbageServer();
  const auto watch = start({"kestro-cli", "watch"});
  EXPECT_EQ(watch->wait(), -SIGABRT);
  EXPECT_THAT(watch->errors(),
              HasSubstr("kestro-cli: ended by a failure: Could not deserialize the object "
                        "(LogGenerator/GSM/GSMLogGenerator, line 90)\n"));
}

TEST_F(LiveTest, WatchWithoutAServerSaysWhatHelps) {
  for (const char* format : {"--format=tree", "--format=ndjson"}) {
    const auto watch = start({"kestro-cli", "watch", format, "--server=Other"});
    ASSERT_TRUE(watch->waitUntil([&] { return watch->errors().ends_with("use --demo\n"); }));
    EXPECT_EQ(watch->errors(),
              "kestro-cli: no telephony server \"Other\" is running: start kestro-telephonyd "
              "--name=Other, or use --demo\n");
  }
}

TEST_F(LiveTest, ABadPortDirectoryIsNamedWhereOneLooks) {
  const std::string directory = source.directory() + "/ports";
  std::filesystem::create_directory(directory);
  std::filesystem::permissions(directory, std::filesystem::perms(0755));
  const std::string problem =
      "port directory " + directory + ": its mode is 0755, group and others must have no access\n";
  const std::string recording = source.directory() + "/recording.pcap";
  for (const std::vector<std::string>& command : std::vector<std::vector<std::string>>{
           {"kestro-cli", "watch"}, {"kestro-cli", "record", "-o", recording}}) {
    const auto live = start(command);
    EXPECT_TRUE(live->waitUntil([&] {
      return live->errors().find("kestro-cli: " + problem) != std::string::npos;
    })) << live->errors();
  }
  const auto telephonyd = start({"kestro-telephonyd"});
  EXPECT_EQ(telephonyd->wait(), 1);
  EXPECT_EQ(telephonyd->errors(), "kestro-telephonyd: " + problem);
}

TEST_F(LiveTest, TheServerSaysWhatItPlaysAndHowToWatchIt) {
  startServer();
  ASSERT_TRUE(server->waitUntil([&] { return !server->errors().empty(); }));
  EXPECT_EQ(server->errors(),
            "kestro-telephonyd: playing capture source.pcap as IFX, under the name "
            "TelephonyServer; watch it with `kestro` or `kestro-cli watch`\n");
}

TEST_F(LiveTest, WatchSaysWhereItsDisplaysComeFromAndWhenThatHasEnded) {
  // 200 s of messages, a hundred times as fast.
  const auto watch =
      start({"kestro-cli", "watch", "--demo=capture:" + source.path(), "--speed=100"});
  ASSERT_TRUE(watch->waitForOutput(" · IFX · capture source.pcap\n\n"));
  ASSERT_TRUE(watch->waitUntil([&] { return !watch->errors().empty(); }));
  EXPECT_EQ(watch->errors(), "kestro-cli: the recording has ended\n");
}

TEST_F(LiveTest, AReaderThatGoesAwayEndsWatchQuietly) {
  startServer();
  const auto watch = start({"kestro-cli", "watch", "--format=ndjson"});
  ASSERT_TRUE(watch->waitForLines(1));
  watch->closeOutput();
  EXPECT_EQ(watch->wait(), 0);
  EXPECT_THAT(watch->errors(), Not(HasSubstr("Broken pipe")));
}

TEST_F(LiveTest, EndingWhileConnectingIsClean) {
  const auto watch = start({"kestro-cli", "watch"});
  ASSERT_TRUE(watch->waitForOutput("Connecting...\n"));
  watch->signal(SIGTERM);
  EXPECT_EQ(watch->wait(), 0);
}

TEST_F(LiveTest, TheDemoNeedsNoServerAndLeavesNothing) {
  const auto watch = start({"kestro-cli", "watch", "--demo", "--format=ndjson", "--count=1"});
  EXPECT_EQ(watch->wait(), 0);
  ASSERT_THAT(watch->outputLines(), SizeIs(1));
  EXPECT_THAT(watch->outputLines()[0], HasSubstr("\"Serving Cell Measurements\""));
  EXPECT_THAT(filesBesideTheSource(), IsEmpty());
}

TEST_F(LiveTest, TheDemoIsConnectedToAtTheFirstAttempt) {
  const auto record = start({"kestro-cli", "record", "--demo=capture:" + source.path(), "-o",
                             source.directory() + "/demo.pcap", "--duration=0.3"});
  EXPECT_EQ(record->wait(), 0);
  EXPECT_THAT(record->errors(), Not(HasSubstr("connecting...")));
}

TEST_F(LiveTest, ADemoThatCannotStartSaysWhy) {
  const auto watch = start({"kestro-cli", "watch", "--demo=capture:/nowhere.pcap"});
  EXPECT_EQ(watch->wait(), 1);
  EXPECT_THAT(watch->errors(), MatchesRegex("kestro-cli: the demo's telephony server: .*"
                                            "/nowhere.pcap.*\n"));
}

TEST_F(LiveTest, TheDemosServerEndsWithAKilledWatch) {
  const auto watch = start({"kestro-cli", "watch", "--demo", "--format=ndjson"});
  ASSERT_TRUE(watch->waitForLines(1));
  const auto children = childrenOf(watch->id());
  ASSERT_THAT(children, SizeIs(1));
  watch->signal(SIGKILL);
  watch->wait();
  EXPECT_TRUE(eventually([&] { return !isRunning(children[0]); }));
  EXPECT_TRUE(eventually([&] { return filesBesideTheSource().empty(); }));
}

}  // namespace
}  // namespace kestro::testing
