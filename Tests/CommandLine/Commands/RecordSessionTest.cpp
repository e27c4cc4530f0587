// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CommandLine/Commands/RecordSession.h"
#include "Recordings/OpenRecording.h"
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

constexpr const char* kNoServer =
    "no telephony server \"TelephonyServer\" is running: start kestro-telephonyd, or use --demo";

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

  /// "technology: message [comment]..." for every message of a drive, and the closing notes.
  [[nodiscard]] std::vector<std::string> driveIn(const std::string& path) const {
    const auto reader = openRecording(path, {.coding = *coding}).value();
    std::vector<std::string> result;
    while (const auto next = *reader->next()) {
      result.push_back(std::string(next->technology) + ": " +
                       std::string(next->bytes.begin(), next->bytes.end()));
      for (const std::string& comment : next->comments) result.back() += " [" + comment + "]";
    }
    for (const std::string& note : reader->closingNotes()) result.push_back("[" + note + "]");
    return result;
  }

  testing::TemporaryFile file{"drive.pcap"};
  const std::string drive = file.directory() + "/drive.pcapng";
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
  EXPECT_THAT(remarks, ElementsAre("recording IFX to " + file.path(), "connecting...", kNoServer,
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
  EXPECT_THAT(remarks, ElementsAre(kNoServer, "connecting..."));
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

// --- Drives

TEST_F(RecordSessionTest, ADriveThroughTwoTechnologiesIsOneFile) {
  start(drive);
  send(testing::bytesOf("a"));
  channelReply.lost = 0;
  changeTechnology("LTE");
  send(testing::bytesOf("b"));
  session->stop();
  EXPECT_THAT(driveIn(drive), ElementsAre("IFX: a", "LTE: b"));
  EXPECT_THAT(remarks, ElementsAre("recording IFX to " + drive, "recording LTE to " + drive));
  EXPECT_EQ(session->summary(), "2 messages, 2 bytes, 0 dropped, in " + drive);
}

TEST_F(RecordSessionTest, NotesAreCommentsOfTheNextMessageOrCloseTheFile) {
  start(drive);
  send(testing::bytesOf("a"));
  session->addNote("tunnel \xFF\x1B[1m");
  session->addNote("");
  session->addNote("bridge");
  send(testing::bytesOf("b"));
  session->addNote("parked");
  session->stop();
  session->addNote("too late");
  EXPECT_THAT(driveIn(drive),
              ElementsAre("IFX: a", "IFX: b [tunnel \uFFFD\uFFFD[1m] [bridge]", "[parked]"));
}

TEST_F(RecordSessionTest, ANoteThatCannotBeKeptIsTold) {
  platform.telephonyService().setReachable(false);
  start(file.path());
  session->addNote("early");
  EXPECT_EQ(remarks.back(), "the recording has not begun: the note is dropped");
  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  session->addNote("no room");
  EXPECT_EQ(remarks.back(), "the note is dropped: the recording has no room for it");
}

TEST_F(RecordSessionTest, ALostConnectionAndItsReturnAreComments) {
  start(drive);
  send(testing::bytesOf("a"));
  loseServer();
  queue().advance(3s);
  bringServerBack();
  channelReply.lost = 7;
  queue().advance(5s);
  send(testing::bytesOf("b"));
  channelReply.lost = std::nullopt;
  changeTechnology("IFX");
  send(testing::bytesOf("c"));
  EXPECT_THAT(
      driveIn(drive),
      ElementsAre("IFX: a",
                  "IFX: b [connection lost] "
                  "[connection back after at most 7.0 s; 7 messages were missed]",
                  "IFX: c [connection lost] [connection back after at most 2.0 s; an unknown "
                  "number of messages were missed]"));
}

TEST_F(RecordSessionTest, AConnectionThatIsLostAtTheEndIsAClosingNote) {
  start(drive);
  send(testing::bytesOf("a"));
  loseServer();
  queue().advance(5s);
  session->stop();
  EXPECT_THAT(driveIn(drive), ElementsAre("IFX: a", "[connection lost]"));
}

TEST_F(RecordSessionTest, TheFileTellsThatItsSourceIsSimulated) {
  const auto madeUp = [&] {
    return std::string(openRecording(drive, {.coding = *coding}).value()->madeUp());
  };
  start(drive);
  EXPECT_EQ(madeUp(), "");
  session->stop();
  channelReply.source = {.kind = "simulation", .isSimulated = true};
  start(drive);
  EXPECT_EQ(madeUp(), "simulation");
  session->stop();
  channelReply.source = {.kind = "drive-test", .isSimulated = true};
  start(drive);
  EXPECT_EQ(madeUp(), "drive-test");
  session->stop();
  channelReply.source = {.kind = "stream", .isSimulated = false};
  start(drive);
  EXPECT_EQ(madeUp(), "");
  platform.telephonyService().notifySource({.kind = "simulation", .isSimulated = true});
  EXPECT_EQ(madeUp(), "simulation") << "when the source changes";
}

TEST_F(RecordSessionTest, SourceTimesAreAskedForAndKept) {
  session.emplace(
      platform, file.path(), inputs, [](const std::string& /*text*/) {},
      [](const std::string& /*reason*/) {});
  session->useSourceTimes();
  session->start();
  queue().runReady();
  ASSERT_EQ(commands.size(), 2U);
  EXPECT_EQ(coding->parse(commands[1]).value(),
            Value(Dictionary{{"SetState", "Streaming"}, {"Times", Value::boolean(true)}}));
  // 1,330,866,042 s: 42 s after the virtual clock's start, in µs, the lowest byte first.
  send(Bytes{0x80, 0x52, 0xAD, 0x65, 0x6A, 0xBA, 0x04, 0x00}, 4);
  send(testing::bytesOf("a"));
  queue().advance(3s);
  send(testing::bytesOf("b"));
  EXPECT_THAT(messagesIn(file.path()), ElementsAre("IFX: 42, a", "IFX: 3, b"));
}

TEST_F(RecordSessionTest, ClosingNotesThatCannotBeWrittenAreAFailure) {
  start(drive);
  session->addNote("n");
  const FileSizeLimit limit(30);
  session->stop();
  ASSERT_EQ(failures.size(), 1U);
  EXPECT_THAT(failures[0], ::testing::StartsWith(drive + ": "));
}

}  // namespace
}  // namespace kestro
