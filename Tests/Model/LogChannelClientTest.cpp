// SPDX-License-Identifier: MIT
#include <algorithm>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Model/LogChannelClient.h"
#include "Tests/Support/LogChannelFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

/// Keeps what the client asks and tells, in order.
class RecordingUser : public LogChannelUser {
 public:
  void technologyAnswered(std::string_view technology) override {
    events.push_back("technology " + std::string(technology));
  }
  [[nodiscard]] std::optional<Dictionary> startCommand() override {
    events.emplace_back("command?");
    return command;
  }
  void messageArrived(ByteView message) override {
    events.push_back("message " + std::string(message.begin(), message.end()));
    if (throwsAtMessages) throw std::runtime_error("unusable");
  }
  void channelStarted() override { events.emplace_back("started"); }
  void channelStops() override { events.emplace_back("stops"); }
  void connectionChanged(bool isConnected) override {
    events.emplace_back(isConnected ? "connected" : "disconnected");
  }
  void channelFollowed(std::chrono::microseconds gap,
                       std::optional<std::uint64_t> missed) override {
    gaps.push_back({gap, missed});
  }
  void sourceTold(const LogSourceState& source) override { sources.push_back(source); }
  void serverNotified() override { events.emplace_back("notified"); }
  [[nodiscard]] std::shared_ptr<const void> keptByRetry() override { return kept; }

  std::vector<std::string> take() { return std::exchange(events, {}); }

  using Gap = std::pair<std::chrono::microseconds, std::optional<std::uint64_t>>;
  std::vector<Gap> gaps;
  std::vector<LogSourceState> sources;
  std::vector<std::string> events;
  std::optional<Dictionary> command = Dictionary{{"SetState", "Streaming"}};
  bool throwsAtMessages = false;
  std::shared_ptr<const void> kept;
};

class LogChannelClientTest : public LogChannelFixture {
 protected:
  void makeClient(ChannelWatch watch = ChannelWatch::ByClient) {
    client.emplace(platform, user, watch);
  }
  void startClient(ChannelWatch watch = ChannelWatch::ByClient) {
    makeClient(watch);
    client->start();
    queue().runReady();
    user.take();
  }

  /// What becomes of an attempt that fails, and of the next one.
  void expectRetryAfterFiveSeconds() {
    makeClient();
    client->start();
    EXPECT_FALSE(client->isConnected());
    EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
    errors();
    queue().advance(4'999ms);
    EXPECT_THAT(errors(), IsEmpty());
    queue().advance(1ms);
    EXPECT_THAT(errors(), ::testing::Not(IsEmpty()));
  }

  RecordingUser user;
  std::optional<LogChannelClient> client;
};

// --- Connecting

TEST_F(LogChannelClientTest, DoesNothingUntilItIsStarted) {
  makeClient();
  queue().advance(60s);
  EXPECT_FALSE(client->isConnected());
  EXPECT_THAT(channelRequests, IsEmpty());
  EXPECT_THAT(user.take(), IsEmpty());
}

TEST_F(LogChannelClientTest, TellsTheTechnologyThenAsksForTheStartCommand) {
  makeClient();
  client->start();
  EXPECT_THAT(user.take(), ElementsAre("technology IFX", "command?", "started", "connected"));
  EXPECT_TRUE(client->isConnected());
}

TEST_F(LogChannelClientTest, AsksForAChannelToALocalPortThatExists) {
  bool existed = false;
  platform.telephonyService().setChannelHandler([&](std::string_view localPort) {
    existed = platform.messagePorts().exists(localPort);
    return channelReply;
  });
  startClient();
  EXPECT_TRUE(existed);
}

TEST_F(LogChannelClientTest, SendsTheRequestThenTheUsersCommandWithId0) {
  user.command = Dictionary{{"SetState", "Streaming"}, {"SetOndrelLogCodes", Array()}};
  startClient();
  EXPECT_THAT(commandIds, ElementsAre(0, 0));
  ASSERT_THAT(commands, SizeIs(2));
  EXPECT_EQ(*coding->parse(commands[0]), Value(Dictionary{{"GetTechnology", "GetTechnology"}}));
  EXPECT_EQ(*coding->parse(commands[1]), Value(*user.command));
}

TEST_F(LogChannelClientTest, StartingWhileItRunsDoesNothing) {
  startClient();
  client->start();
  EXPECT_THAT(user.take(), IsEmpty());
  EXPECT_THAT(channelRequests, SizeIs(1));
}

TEST_F(LogChannelClientTest, AskingForTheTechnologyAgainTellsIt) {
  startClient();
  answerTechnology("LTE");
  client->requestTechnology();
  EXPECT_THAT(user.take(), ElementsAre("technology LTE"));
}

// --- Retrying

TEST_F(LogChannelClientTest, TriesAgainInFiveSecondsWithoutAServer) {
  platform.telephonyService().setReachable(false);
  expectRetryAfterFiveSeconds();
}

TEST_F(LogChannelClientTest, TriesAgainInFiveSecondsWithoutAChannel) {
  channelReply = {7, {}};
  expectRetryAfterFiveSeconds();
}

TEST_F(LogChannelClientTest, TriesAgainInFiveSecondsWhenItsMessagesAreOfNoUse) {
  user.command.reset();
  expectRetryAfterFiveSeconds();
  EXPECT_THAT(commands, SizeIs(2));  // the technology, twice
}

TEST_F(LogChannelClientTest, TriesAgainInFiveSecondsWhenTheStartCommandIsNotSent) {
  platform.messagePorts().failures().send = SendError::SendTimeout;
  expectRetryAfterFiveSeconds();
  EXPECT_TRUE(client->isConnected());
}

TEST_F(LogChannelClientTest, TriesAgainForEverWithoutBackOff) {
  channelReply = {7, {}};
  makeClient();
  client->start();
  queue().advance(500s);
  EXPECT_THAT(channelRequests, SizeIs(101));
}

TEST_F(LogChannelClientTest, AQueuedRetryPassesWhenMessagesRunAlready) {
  platform.telephonyService().setReachable(false);
  makeClient();
  client->start();
  platform.telephonyService().setReachable(true);
  client->restart();
  queue().advance(5s);
  EXPECT_THAT(channelRequests, SizeIs(1));
}

TEST_F(LogChannelClientTest, AQueuedRetryKeepsWhatItsUserNames) {
  user.kept = std::make_shared<int>();
  const std::weak_ptr<const void> kept = user.kept;
  platform.telephonyService().setReachable(false);
  makeClient();
  client->start();
  platform.telephonyService().setReachable(true);
  user.kept.reset();
  EXPECT_FALSE(kept.expired());
  queue().advance(5s);
  EXPECT_TRUE(kept.expired());
}

// --- Coming and going

TEST_F(LogChannelClientTest, FailuresToConnectAreNotToldAsALostConnection) {
  platform.telephonyService().setReachable(false);
  makeClient();
  client->start();
  queue().advance(30s);
  EXPECT_THAT(user.take(), ::testing::Each("stops"));
}

TEST_F(LogChannelClientTest, FindsALostChannelWithinTwoSeconds) {
  startClient();
  loseServer();
  queue().advance(1'999ms);
  EXPECT_THAT(user.take(), IsEmpty());
  queue().advance(1ms);
  EXPECT_THAT(user.take(), ElementsAre("stops", "stops", "disconnected"));
  EXPECT_FALSE(client->isConnected());
}

TEST_F(LogChannelClientTest, TellsALostConnectionOnceAndThatItIsBack) {
  startClient();
  loseServer();
  queue().advance(20s);
  bringServerBack();
  queue().advance(5s);
  const auto events = user.take();
  EXPECT_EQ(std::ranges::count(events, "disconnected"), 1);
  EXPECT_EQ(std::ranges::count(events, "connected"), 1);
  EXPECT_EQ(events.back(), "connected");
}

TEST_F(LogChannelClientTest, AConnectionThatIsReplacedAtOnceHasNotGone) {
  startClient();
  channel->invalidate();
  openChannel();
  queue().advance(2s);
  EXPECT_THAT(user.take(), ElementsAre("stops", "technology IFX", "command?", "started"));
  client->restart();
  EXPECT_THAT(user.take(), ElementsAre("stops", "technology IFX", "command?", "started"));
}

TEST_F(LogChannelClientTest, RestartsAtOnceWhenItsLocalPortIsLost) {
  startClient();
  platform.messagePorts().lose(channelRequests[0]);
  EXPECT_THAT(user.take(), ElementsAre("stops", "technology IFX", "command?", "started"));
  EXPECT_NE(channelRequests[0], channelRequests[1]);
}

TEST_F(LogChannelClientTest, ANotificationHasItLookAtItsChannel) {
  startClient();
  platform.telephonyService().notify();
  EXPECT_THAT(user.take(), IsEmpty());
  loseServer();
  platform.telephonyService().notify();
  EXPECT_THAT(user.take(), ElementsAre("stops", "stops", "disconnected"));
}

TEST_F(LogChannelClientTest, AUserThatWatchesIsToldOfNotificationsAndLooksItself) {
  startClient(ChannelWatch::ByUser);
  loseServer();
  queue().advance(60s);
  platform.telephonyService().notify();
  EXPECT_THAT(user.take(), ElementsAre("notified"));
  client->check();
  EXPECT_THAT(user.take(), ElementsAre("stops", "stops", "disconnected"));
}

TEST_F(LogChannelClientTest, LookingWithoutAConnectionDoesNothing) {
  makeClient();
  client->check();
  EXPECT_THAT(user.take(), IsEmpty());
  EXPECT_THAT(channelRequests, IsEmpty());
}

// --- Technologies

TEST_F(LogChannelClientTest, TellsTheTechnologyOfEachChannel) {
  startClient();
  answerTechnology("LTE");
  channel->invalidate();
  openChannel();
  queue().advance(2s);
  EXPECT_THAT(user.take(), ElementsAre("stops", "technology LTE", "command?", "started"));
}

TEST_F(LogChannelClientTest, AsksForTheStartCommandThoughTheServerNamesNoTechnology) {
  technologyReply = std::nullopt;
  makeClient();
  client->start();
  EXPECT_THAT(user.take(), ElementsAre("command?", "started", "connected"));
}

// --- Messages

TEST_F(LogChannelClientTest, HandsMessagesOnInTheirOrder) {
  startClient();
  const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
  for (const char* message : {"a", "", "b", "c"}) port->post(0, bytesOf(message));
  queue().runReady();
  EXPECT_THAT(user.take(), ElementsAre("message a", "message ", "message b", "message c"));
}

TEST_F(LogChannelClientTest, LeavesOutMessagesWithAnotherId) {
  startClient();
  send(bytesOf("a"), 1);
  send(bytesOf("b"));
  EXPECT_THAT(user.take(), ElementsAre("message b"));
}

TEST_F(LogChannelClientTest, WhatAMessageThrowsPassesThrough) {
  startClient();
  user.throwsAtMessages = true;
  const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
  port->post(0, bytesOf("a"));
  EXPECT_THROW(queue().runReady(), std::runtime_error);
}

TEST_F(LogChannelClientTest, GoesOnWithMessagesAfterALostConnection) {
  startClient();
  loseServer();
  queue().advance(2s);
  bringServerBack();
  queue().advance(5s);
  user.take();
  send(bytesOf("b"));
  EXPECT_THAT(user.take(), ElementsAre("message b"));
}

// --- The end

TEST_F(LogChannelClientTest, ClosingTellsThatTheConnectionHasGoneAndEndsTheMessages) {
  startClient();
  const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
  port->post(0, bytesOf("late"));
  client->close();
  queue().advance(60s);
  EXPECT_THAT(user.take(), ElementsAre("stops", "disconnected"));
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
  EXPECT_EQ(queue().pending(), 0U);
  EXPECT_THAT(channelRequests, SizeIs(1));
}

TEST_F(LogChannelClientTest, TellsNothingAfterItsEnd) {
  startClient();
  const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
  port->post(0, bytesOf("late"));
  client.reset();
  platform.telephonyService().notify();
  queue().advance(60s);
  EXPECT_THAT(user.take(), IsEmpty());
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
  EXPECT_FALSE(platform.telephonyService().hasRegistration());
}

TEST_F(LogChannelClientTest, ARetryThatOutlivesItDoesNothing) {
  platform.telephonyService().setReachable(false);
  makeClient();
  client->start();
  client.reset();
  platform.telephonyService().setReachable(true);
  user.take();
  queue().advance(60s);
  EXPECT_THAT(user.take(), IsEmpty());
  EXPECT_THAT(channelRequests, IsEmpty());
}

// What is told of a channel that was lost.

TEST_F(LogChannelClientTest, TellsWhatALostChannelHasMissedAndHowLongItWasGone) {
  startClient();
  queue().advance(5s);  // the last look was after 4 s, the next is after 6
  channel.reset();
  openChannel();
  channelReply.lost = 7;
  queue().advance(1s);
  EXPECT_THAT(platform.telephonyService().previousPorts(), ElementsAre("Channel"));
  EXPECT_THAT(user.gaps, ElementsAre(RecordingUser::Gap(2s, 7)));
  EXPECT_EQ(client->gap(), std::nullopt);
}

TEST_F(LogChannelClientTest, TakesWhatHasArrivedBeforeItLetsGoOfALostChannel) {
  startClient();
  const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
  ASSERT_EQ(port->post(0, bytesOf("in time")), SendError::None);
  channel.reset();
  openChannel();
  client->check();
  EXPECT_THAT(user.take(),
              ElementsAre("message in time", "stops", "technology IFX", "command?", "started"));
}

TEST_F(LogChannelClientTest, TellsTheGapWhileThereIsNoChannel) {
  makeClient();
  EXPECT_EQ(client->gap(), std::nullopt);
  client->start();
  EXPECT_EQ(client->gap(), std::nullopt);
  platform.telephonyService().setReachable(false);
  channel.reset();
  queue().advance(3s);
  EXPECT_EQ(client->gap(), 3s);
}

TEST_F(LogChannelClientTest, WhoWatchesItsChannelItselfIsToldNothingOfLostOnes) {
  startClient(ChannelWatch::ByUser);
  channel.reset();
  openChannel();
  client->check();
  EXPECT_TRUE(client->isConnected());
  EXPECT_THAT(user.gaps, IsEmpty());
  EXPECT_THAT(platform.telephonyService().previousPorts(), IsEmpty());
}

TEST_F(LogChannelClientTest, TellsWhatTheServerSaysOfItsSource) {
  const LogSourceState simulation{.kind = "simulation", .isSimulated = true};
  const LogSourceState ended{.kind = "simulation", .isSimulated = true, .hasEnded = true};
  channelReply.source = simulation;
  startClient();
  EXPECT_THAT(user.sources, ElementsAre(simulation));
  platform.telephonyService().notifySource(ended);
  EXPECT_THAT(user.sources, ElementsAre(simulation, ended));
  client.reset();
  const auto others = platform.telephonyService()._TqServerConnectionCreate([] {});
  platform.telephonyService().notifySource(simulation);
  EXPECT_THAT(user.sources, SizeIs(2));
}

TEST_F(LogChannelClientTest, WhoWatchesItsChannelItselfIsToldOfTheSourceToo) {
  startClient(ChannelWatch::ByUser);
  user.sources.clear();
  platform.telephonyService().notifySource({.isSimulated = true});
  EXPECT_THAT(user.sources, ElementsAre(LogSourceState{.isSimulated = true}));
}

TEST_F(LogChannelClientTest, KnowsTheSourcesTimeOfAMessageThatCameWithOne) {
  startClient();
  send(Bytes{0x2A, 0, 0, 0, 0, 0, 0, 0}, 4);
  EXPECT_THAT(user.take(), IsEmpty());
  send(bytesOf("a"));
  EXPECT_THAT(user.take(), ElementsAre("message a"));
  EXPECT_EQ(client->sourceTime(), Moment(std::chrono::microseconds(42)));
  send(bytesOf("b"));
  EXPECT_EQ(client->sourceTime(), std::nullopt);
}

TEST_F(LogChannelClientTest, ATimeWithoutItsMessageIsForgottenWithTheChannel) {
  startClient();
  send(Bytes{0x2A, 0, 0, 0, 0, 0, 0, 0}, 4);
  client->restart();
  queue().runReady();
  send(bytesOf("a"));
  EXPECT_EQ(client->sourceTime(), std::nullopt);
}

}  // namespace
}  // namespace kestro::testing
