// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CommandLine/Commands/RecordSession.h"
#include "Recordings/PcapReader.h"
#include "Tests/Support/FileSizeLimit.h"
#include "Tests/Support/LogChannelFixture.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::EndsWith;
using testing::FileSizeLimit;
using ::testing::IsEmpty;

class RecordSessionTest : public testing::LogChannelFixture {
 protected:
  RecordSessionTest() { platform.clock().setNow(Moment(1'330'866'000s)); }

  void start(const std::string& path) {
    session.emplace(
        platform, path, inputs, [this](const std::string& text) { remarks.push_back(text); },
        [this](const std::string& reason) { failures.push_back(reason); });
    session->start();
  }

  /// The channel goes, and comes back with another technology.
  void changeTechnology(std::string_view technology) {
    channel.reset();
    answerTechnology(technology);
    openChannel();
    queue().advance(2s);
  }

  /// "technology: seconds after the start, message" for every message of a capture.
  static std::vector<std::string> messagesIn(const std::string& path) {
    auto reader = PcapReader::open(path);
    if (!reader) return {reader.error().message};
    std::vector<std::string> result;
    while (const auto next = *reader->next()) {
      const auto time = next->time - Moment(1'330'866'000s);
      result.push_back(std::string(reader->technology()) + ": " +
                       std::to_string(std::chrono::floor<std::chrono::seconds>(time).count()) +
                       ", " + std::string(next->bytes.begin(), next->bytes.end()));
    }
    return result;
  }

  testing::TemporaryFile file{"drive.pcap"};
  std::vector<std::string> inputs;
  std::vector<std::string> remarks;
  std::vector<std::string> failures;
  std::optional<RecordSession> session;
};

TEST_F(RecordSessionTest, WritesMessagesAsTheyAreWithTheirTime) {
  start(file.path());
  send(testing::bytesOf("no property list"));
  queue().advance(3s);
  send(testing::bytesOf("b"));
  EXPECT_THAT(messagesIn(file.path()), ElementsAre("IFX: 0, no property list", "IFX: 3, b"));
  EXPECT_EQ(session->summary(), "2 messages, 17 bytes, 0 dropped, in " + file.path());
}

TEST_F(RecordSessionTest, AsksForEverything) {
  start(file.path());
  queue().runReady();
  ASSERT_EQ(commands.size(), 2U);
  const auto command = coding->parse(commands[1]);
  ASSERT_TRUE(command);
  EXPECT_EQ(*command, Value(Dictionary{{"SetState", "Streaming"}}));
}

TEST_F(RecordSessionTest, RecordsATechnologyThatNothingDecodes) {
  answerTechnology("Ondrel_CDMA");
  start(file.path());
  send(testing::bytesOf("x"));
  EXPECT_THAT(messagesIn(file.path()), ElementsAre("Ondrel_CDMA: 0, x"));
}

TEST_F(RecordSessionTest, AChangeOfTechnologyGoesOnInTheNextFile) {
  start(file.path());
  send(testing::bytesOf("a"));
  changeTechnology("LTE");
  send(testing::bytesOf("b"));
  EXPECT_THAT(messagesIn(file.path()), ElementsAre("IFX: 0, a"));
  const std::string second = file.directory() + "/drive-2.pcap";
  EXPECT_THAT(messagesIn(second), ElementsAre("LTE: 2, b"));
  EXPECT_EQ(session->summary(),
            "2 messages, 2 bytes, 0 dropped, in " + file.path() + ", " + second +
                "; lost the connection 1 time, for at most 2.0 s, and an unknown number of "
                "messages");
  EXPECT_THAT(remarks,
              ElementsAre("recording IFX to " + file.path(), "recording LTE to " + second));
}

TEST_F(RecordSessionTest, NoLaterFileIsAnInput) {
  const std::string second = file.directory() + "/drive-2.pcap";
  std::ofstream(second) << "an input";
  inputs = {second};
  start(file.path());
  changeTechnology("LTE");
  EXPECT_THAT(failures, ElementsAre(second + ": the output would replace the input"));
  EXPECT_EQ(std::filesystem::file_size(second), 8U);
}

TEST_F(RecordSessionTest, GoesOnAfterALostConnection) {
  start(file.path());
  send(testing::bytesOf("a"));
  loseServer();
  queue().advance(3s);
  bringServerBack();
  queue().advance(5s);
  send(testing::bytesOf("b"));
  EXPECT_THAT(messagesIn(file.path()), ElementsAre("IFX: 0, a", "IFX: 8, b"));
  EXPECT_THAT(remarks, ElementsAre("recording IFX to " + file.path(), "connecting...",
                                   "recording IFX to " + file.path()));
}

TEST_F(RecordSessionTest, TellsWhatLostConnectionsHaveCost) {
  start(file.path());
  EXPECT_FALSE(session->isIncomplete());
  channelReply.lost = 823'387;
  changeTechnology("IFX");
  EXPECT_THAT(platform.telephonyService().previousPorts(), ElementsAre("Channel"));
  EXPECT_EQ(session->summary(),
            "0 messages, 0 bytes, 0 dropped, in " + file.path() +
                "; lost the connection 1 time, for at most 2.0 s, and 823387 messages");
  EXPECT_TRUE(session->isIncomplete());
  channelReply.lost = 3;
  changeTechnology("IFX");
  EXPECT_THAT(*session->summary(),
              EndsWith("; lost the connection 2 times, for at most 4.0 s, and 823390 messages"));
  channelReply.lost = std::nullopt;
  changeTechnology("IFX");
  EXPECT_THAT(*session->summary(), EndsWith("; lost the connection 3 times, for at most 6.0 s, and "
                                            "at least 823390 messages"));
}

TEST_F(RecordSessionTest, ALostConnectionThatCostNothingIsNoLoss) {
  start(file.path());
  channelReply.lost = 0;
  changeTechnology("IFX");
  EXPECT_EQ(session->summary(), "0 messages, 0 bytes, 0 dropped, in " + file.path());
  EXPECT_FALSE(session->isIncomplete());
}

TEST_F(RecordSessionTest, AConnectionThatIsLostAtTheEndIsALoss) {
  start(file.path());
  queue().advance(10s);
  loseServer();
  queue().advance(5s);
  session->stop();
  EXPECT_THAT(*session->summary(), EndsWith("; lost the connection 1 time, for at most 5.0 s, and "
                                            "an unknown number of messages"));
  EXPECT_TRUE(session->isIncomplete());
}

TEST_F(RecordSessionTest, WhatComesAfterItsEndIsInNeitherTheFileNorTheSummary) {
  start(file.path());
  send(testing::bytesOf("a"));
  session->stop();
  send(testing::bytesOf("b"));
  changeTechnology("LTE");
  EXPECT_THAT(messagesIn(file.path()), ElementsAre("IFX: 0, a"));
  EXPECT_EQ(session->summary(), "1 messages, 1 bytes, 0 dropped, in " + file.path());
  EXPECT_FALSE(std::filesystem::exists(file.directory() + "/drive-2.pcap"));
}

TEST_F(RecordSessionTest, MessagesThatAreTooLongAreDroppedAndCounted) {
  start(file.path());
  send(Bytes(262'144, 'x'));
  send(Bytes(262'145, 'y'));
  send(Bytes(300'000, 'z'));
  EXPECT_EQ(session->summary(), "1 messages, 262144 bytes, 2 dropped, in " + file.path());
  EXPECT_THAT(remarks, ElementsAre("recording IFX to " + file.path(),
                                   "dropped a message of 262145 bytes, too long for a capture; "
                                   "more are counted"));
  EXPECT_THAT(failures, IsEmpty());
}

TEST_F(RecordSessionTest, TellsEveryMinuteHowMuchHasCome) {
  start(file.path());
  session->tellEveryMinute();
  remarks.clear();
  send(testing::bytesOf("abc"));
  queue().advance(59s);
  EXPECT_THAT(remarks, IsEmpty());
  queue().advance(1s);
  EXPECT_THAT(remarks, ElementsAre("so far 1 messages, 3 bytes"));
  queue().advance(60s);
  EXPECT_EQ(remarks.back(), "so far 1 messages, 3 bytes; none in the last minute");
  send(testing::bytesOf("de"));
  queue().advance(60s);
  EXPECT_EQ(remarks.back(), "so far 2 messages, 5 bytes");
  session->stop();
  queue().advance(60s);
  EXPECT_THAT(remarks, ::testing::SizeIs(3));
}

TEST_F(RecordSessionTest, WithoutAServerThereIsNoFile) {
  platform.telephonyService().setReachable(false);
  start(file.path());
  queue().advance(60s);
  EXPECT_THAT(remarks, ElementsAre("connecting..."));
  EXPECT_EQ(session->summary(), std::nullopt);
  EXPECT_FALSE(std::filesystem::exists(file.path()));
}

TEST_F(RecordSessionTest, AFileThatCannotBeCreatedIsReportedOnce) {
  start("/nowhere/drive.pcap");
  queue().advance(60s);
  ASSERT_EQ(failures.size(), 1U);
  EXPECT_THAT(failures[0], ::testing::HasSubstr("/nowhere/drive.pcap"));
}

TEST_F(RecordSessionTest, AFileThatMayNotGrowIsReportedOnce) {
  start(file.path());
  const FileSizeLimit limit(100);
  for (int i = 0; i < 5; ++i) send(Bytes(30, 'x'));
  ASSERT_EQ(failures.size(), 1U);
  EXPECT_THAT(failures[0], ::testing::StartsWith(file.path() + ": "));
}

}  // namespace
}  // namespace kestro
