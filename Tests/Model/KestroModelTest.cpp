// SPDX-License-Identifier: MIT
#include "Model/KestroModel.h"
#include "Platform/Clock.h"
#include "Tests/Support/ModelFixture.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::MatchesRegex;
using ::testing::SizeIs;

using KestroModelTest = ModelFixture;

constexpr const char* kCreatedPorts =
    " \\*\\*\\*\\*\\* Created ports \\(send=0x[0-9a-f]+, recv=0x[0-9a-f]+\\)";
constexpr const char* kGotGenerator = "Got log generated: 0x[0-9a-f]+";
constexpr const char* kInvalidated = " \\*\\*\\*\\*\\* INVALIDATED 0x[0-9a-f]+ \\*\\*\\*\\*\\*";

TEST_F(KestroModelTest, StartsUnconnectedWithoutAnyPort) {
  EXPECT_FALSE(model->isConnected());
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
  EXPECT_FALSE(model->topLevelNodes());
  EXPECT_FALSE(model->nodeAtPath("/"));
  EXPECT_TRUE(model->getSaveContents().isNull());
}

TEST_F(KestroModelTest, ConnectsAndLogsEachStep) {
  model->restartMonitor();

  EXPECT_TRUE(model->isConnected());
  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts), MatchesRegex(kGotGenerator),
                                    "Starting the display update timer"));
}

TEST_F(KestroModelTest, AsksForTheChannelOfItsLocalPort) {
  model->restartMonitor();
  EXPECT_THAT(channelRequests, ElementsAre("KestroApp.00000000-0000-0000-0000-000000000001"));
}

TEST_F(KestroModelTest, SendsGetTechnologyThenTheStartCommandAsXml) {
  model->restartMonitor();
  queue().runReady();

  EXPECT_THAT(commandIds, ElementsAre(0, 0));
  ASSERT_THAT(commands, SizeIs(2));
  EXPECT_EQ(commands[0][0], '<');
  EXPECT_EQ(*coding->parse(commands[0]), Value(Dictionary{{"GetTechnology", "GetTechnology"}}));
  EXPECT_EQ(*coding->parse(commands[1]), Value(Dictionary{{"SetState", "Streaming"}}));
}

TEST_F(KestroModelTest, RetriesExactlyFiveSecondsAfterEachFailure) {
  platform.telephonyService().setReachable(false);
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre("Could not create TqServerConnection",
                                    "Could not create the ports necessary"));

  queue().advance(4999ms);
  EXPECT_THAT(errors(), IsEmpty());
  queue().advance(1ms);
  EXPECT_THAT(errors(), SizeIs(2));

  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  EXPECT_TRUE(model->isConnected());
}

TEST_F(KestroModelTest, KeepsRetryingWithoutBackOff) {
  platform.telephonyService().setReachable(false);
  model->restartMonitor();
  errors();
  queue().advance(500s);
  EXPECT_THAT(errors(), SizeIs(200));
}

TEST_F(KestroModelTest, GivesUpAnAttemptWithoutAUuidSilently) {
  platform.uuids().setExhausted(true);
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre("Could not create the ports necessary"));
}

TEST_F(KestroModelTest, ReportsTheChannelRequestsError) {
  channelReply = {-17, "Channel"};
  model->restartMonitor();
  EXPECT_THAT(errors(),
              ElementsAre("_TqServerConnectionNetworkMonitorCreateLogChannel returns error: -17!",
                          "Could not create the ports necessary"));
}

TEST_F(KestroModelTest, ReportsAMissingOrEmptyPortName) {
  for (const auto& name : {std::optional<std::string>(), std::optional<std::string>("")}) {
    channelReply = {0, name};
    model->restartMonitor();
    EXPECT_THAT(errors(), ElementsAre("Could not create a log channel (Tq returned null port)!",
                                      "Could not create the ports necessary"));
  }
}

TEST_F(KestroModelTest, ReportsARemotePortThatCannotBeCreated) {
  channelReply = {0, "Nobody"};
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre("Could not create the remote port!",
                                    "Could not create the ports necessary"));
}

TEST_F(KestroModelTest, IsNotConnectedWithoutALocalPort) {
  platform.messagePorts().failures().localPort = true;
  EXPECT_FALSE(model->createPorts());
  EXPECT_FALSE(model->isConnected());
  EXPECT_THAT(channelRequests, SizeIs(1));
}

TEST_F(KestroModelTest, TearsDownTheLocalPortOfAFailedAttempt) {
  channelReply = {1, {}};
  model->restartMonitor();
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
}

TEST_F(KestroModelTest, ReportsAGetTechnologyCommandThatCannotBeMade) {
  platform.propertyListCoding().failFor(
      [](const Value& value) { return value.dictionary().contains("GetTechnology"); });
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts),
                                    " Could not generate GetTechnology command; cannot configure",
                                    "No log generator technology works"));
}

TEST_F(KestroModelTest, ReportsTheErrorOfTheTechnologyRequest) {
  platform.messagePorts().failures().request = {SendError::ReceiveTimeout, technologyAnswer("IFX")};
  model->restartMonitor();
  EXPECT_THAT(errors(),
              ElementsAre(MatchesRegex(kCreatedPorts),
                          " ***** Could not send the GetTechnology command (got error=-2)",
                          "No log generator technology works"));
}

TEST_F(KestroModelTest, WaitsOneSecondForTheTechnologyAndNoLonger) {
  platform.messagePorts().failures().replyDelay = 1s;
  model->restartMonitor();
  EXPECT_TRUE(model->isConnected());
  EXPECT_EQ(queue().elapsed(), 1s);

  platform.messagePorts().failures().replyDelay = 1s + 1ns;
  model->restartMonitor();
  EXPECT_THAT(errors(), Contains(" ***** Could not send the GetTechnology command (got error=-2)"));
  EXPECT_EQ(queue().elapsed(), 2s);
}

TEST_F(KestroModelTest, WaitsOneSecondForItsCommandsToBeSent) {
  platform.messagePorts().failures().request = {SendError::SendTimeout, {}};
  model->restartMonitor();
  EXPECT_EQ(queue().elapsed(), 1s);

  platform.messagePorts().failures().send = SendError::SendTimeout;
  model->restartMonitor();
  EXPECT_THAT(errors(), Contains(" ***** Could not send the START command (got error=-1)"));
  EXPECT_EQ(queue().elapsed(), 2s);
}

TEST_F(KestroModelTest, ReportsAReplyWithoutData) {
  technologyReply = std::nullopt;
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts),
                                    " ***** No response to GetTechnology; cannot configure",
                                    "No log generator technology works"));
}

TEST_F(KestroModelTest, ReportsAReplyThatIsNoPropertyList) {
  technologyReply = bytesOf("technology: IFX");
  model->restartMonitor();
  EXPECT_THAT(errors(),
              ElementsAre(MatchesRegex(kCreatedPorts),
                          " ***** Could not parse reply to GetTechnology; cannot configure",
                          "No log generator technology works"));
}

TEST_F(KestroModelTest, ReportsAReplyWithoutAnAnswer) {
  for (const Value& reply : {Value(Dictionary{{"Technology", "IFX"}}), Value("IFX")}) {
    technologyReply = *coding->xml(reply);
    model->restartMonitor();
    EXPECT_THAT(errors(),
                ElementsAre(MatchesRegex(kCreatedPorts),
                            " ***** Reply to GetTechnology had no answer; cannot configure",
                            "No log generator technology works"));
  }
}

TEST_F(KestroModelTest, AcceptsABinaryReply) {
  technologyReply = *coding->binary(Dictionary{{"GetTechnology", "IFX"}});
  model->restartMonitor();
  EXPECT_TRUE(model->isConnected());
}

TEST_F(KestroModelTest, RunsTheWholeCycleAgainForAnUnknownTechnology) {
  answerTechnology("Semaphore");
  model->restartMonitor();
  for (int attempt = 0; attempt < 3; ++attempt) {
    EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts), "Got log generated: (nil)",
                                      "No log generator technology works"));
    EXPECT_FALSE(model->isConnected());
    queue().advance(5s);
  }
}

TEST_F(KestroModelTest, KeepsTheEarlierGeneratorWhenAReplyHasNoAnswer) {
  model->restartMonitor();
  technologyReply = std::nullopt;
  errors();
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts),
                                    " ***** No response to GetTechnology; cannot configure",
                                    "Starting the display update timer"));
}

TEST_F(KestroModelTest, ReportsAStartCommandThatCannotBeMade) {
  platform.propertyListCoding().failFor(
      [](const Value& value) { return value.dictionary().contains("SetState"); });
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts), MatchesRegex(kGotGenerator),
                                    " Could not generate PLIST"));
  EXPECT_FALSE(model->isConnected());
}

TEST_F(KestroModelTest, TearsDownAfterAFailedStartCommandAndRetries) {
  platform.messagePorts().failures().send = SendError::SendTimeout;
  model->restartMonitor();
  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts), MatchesRegex(kGotGenerator),
                                    " ***** Could not send the START command (got error=-1)"));
  EXPECT_FALSE(model->isConnected());
  EXPECT_EQ(queue().pending(), 1U);  // the retry, no timer

  queue().advance(5s);
  EXPECT_TRUE(model->isConnected());
}

TEST_F(KestroModelTest, DoesNothingWhenStartedWhileRunning) {
  model->startMonitor();
  errors();
  model->startMonitor();
  EXPECT_THAT(errors(), IsEmpty());
  EXPECT_THAT(channelRequests, SizeIs(1));
}

TEST_F(KestroModelTest, LetsAQueuedRetryPassWhenItRunsAlready) {
  platform.telephonyService().setReachable(false);
  model->restartMonitor();
  platform.telephonyService().setReachable(true);
  model->restartMonitor();
  queue().advance(20s);
  EXPECT_THAT(channelRequests, SizeIs(1));
}

TEST_F(KestroModelTest, IsKeptAliveByAQueuedRetry) {
  platform.telephonyService().setReachable(false);
  model->restartMonitor();
  const std::weak_ptr<KestroModel> weak = model;
  model.reset();
  EXPECT_FALSE(weak.expired());
  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  EXPECT_TRUE(weak.expired());
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
}

TEST_F(KestroModelTest, ClosesItsPortsAndItsRegistrationWhenItEnds) {
  model->restartMonitor();
  model.reset();
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
  EXPECT_FALSE(platform.telephonyService().hasRegistration());
  queue().advance(60s);
  EXPECT_EQ(redraws, 0);
}

TEST_F(KestroModelTest, ShowsNothingBetweenTicks) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  EXPECT_EQ(redraws, 0);
  queue().advance(1999ms);
  EXPECT_EQ(redraws, 0);
  queue().advance(1ms);
  EXPECT_EQ(redraws, 1);
}

TEST_F(KestroModelTest, PostsTheRedraw) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  model->refresh();
  EXPECT_EQ(redraws, 0);
  queue().runReady();
  EXPECT_EQ(redraws, 1);
}

TEST_F(KestroModelTest, RepliesToNoMessage) {
  model->restartMonitor();
  const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
  for (const std::int32_t id : {0, 1}) {
    const auto reply = port->request(id, *coding->xml(Dictionary{{"A", "1"}}), 1s, 1s);
    EXPECT_EQ(reply.error, SendError::None);
    EXPECT_FALSE(reply.data);
  }
}

TEST_F(KestroModelTest, AsksForOneRedrawHoweverManyMessagesArrived) {
  model->restartMonitor();
  for (int i = 0; i < 10; ++i) sendLog(Dictionary{{"A", "1"}});
  queue().advance(2s);
  EXPECT_EQ(redraws, 1);
}

TEST_F(KestroModelTest, KeepsTheTreeAndTheScreensWithoutNewData) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  queue().advance(2s);
  const NodePointer nodes = model->topLevelNodes();

  queue().advance(10s);

  EXPECT_EQ(redraws, 1);
  EXPECT_EQ(model->topLevelNodes(), nodes);
}

TEST_F(KestroModelTest, BuildsTheTreeOncePerRefresh) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  queue().advance(2s);
  const NodePointer before = model->topLevelNodes();
  sendLog(Dictionary{{"A", "2"}});
  EXPECT_EQ(model->topLevelNodes(), before);

  queue().advance(2s);

  EXPECT_EQ(*model->nodeAtPath("/A")->value(), "2");
}

TEST_F(KestroModelTest, RebuildsTheTreeForAPathRightAfterNewData) {
  model->restartMonitor();
  sendLog(Dictionary{{"Cell", Dictionary{{"ID", "7"}, {"Band", "3"}}}});
  queue().advance(2s);

  EXPECT_EQ(*model->nodeAtPath("/Cell/ID")->value(), "7");
  EXPECT_EQ(model->nodeAtPath("/"), model->topLevelNodes());
  EXPECT_FALSE(model->nodeAtPath("/Cell/Colour"));
}

TEST_F(KestroModelTest, RecordsAHistoryEntryForEachTreeBuilt) {
  model->restartMonitor();
  for (const char* value : {"1", "2"}) {
    sendLog(Dictionary{{"A", value}});
    queue().advance(2s);
    static_cast<void>(model->topLevelNodes());
  }
  const Array saved = model->getSaveContents().array();
  ASSERT_EQ(saved.size(), 2U);
  EXPECT_EQ(saved[0].dictionary()["Display"].dictionary()["A"], Value("1"));
  EXPECT_EQ(saved[1].dictionary()["Display"].dictionary()["A"], Value("2"));
}

TEST_F(KestroModelTest, IgnoresMessagesWithAnotherId) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}}, 1);
  queue().advance(2s);
  EXPECT_EQ(redraws, 0);
}

TEST_F(KestroModelTest, RestartsWhenItsLocalPortIsLost) {
  model->restartMonitor();
  errors();
  platform.messagePorts().lose(channelRequests[0]);

  EXPECT_THAT(errors(),
              ElementsAre(MatchesRegex(kInvalidated), MatchesRegex(kCreatedPorts),
                          MatchesRegex(kGotGenerator), "Starting the display update timer"));
  EXPECT_TRUE(model->isConnected());
  EXPECT_NE(channelRequests[0], channelRequests[1]);
}

TEST_F(KestroModelTest, FindsADeadServerAtTheNextTick) {
  model->restartMonitor();
  channel->invalidate();
  errors();
  queue().advance(1999ms);
  EXPECT_TRUE(model->isConnected());
  EXPECT_THAT(errors(), IsEmpty());

  queue().advance(1ms);

  EXPECT_FALSE(model->isConnected());
  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kInvalidated), "Could not create the remote port!",
                                    "Could not create the ports necessary"));
}

TEST_F(KestroModelTest, ReconnectsAtTheFirstRetryAfterTheServerIsBack) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  queue().advance(2s);
  static_cast<void>(model->topLevelNodes());
  channel->invalidate();
  queue().advance(6s);
  openChannel();

  queue().advance(5s);

  EXPECT_TRUE(model->isConnected());
  EXPECT_EQ(model->getSaveContents().array().size(), 1U);
  EXPECT_EQ(*model->nodeAtPath("/A")->value(), "1");
}

TEST_F(KestroModelTest, ContinuesTheRefreshOnTheNewStateAfterARestart) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  channel->invalidate();
  openChannel();

  model->refresh();

  EXPECT_TRUE(model->isConnected());
  queue().runReady();
  EXPECT_EQ(redraws, 1);
}

TEST_F(KestroModelTest, RefreshesOnANotification) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  platform.telephonyService().notify();
  queue().runReady();
  EXPECT_EQ(redraws, 1);
}

TEST_F(KestroModelTest, ReconnectsOnANotificationAfterItsChannelWasClosed) {
  model->restartMonitor();
  channel->invalidate();
  openChannel();
  platform.telephonyService().notify();
  EXPECT_THAT(channelRequests, SizeIs(2));
  EXPECT_TRUE(model->isConnected());
}

TEST_F(KestroModelTest, TellsThatTheConnectionCameAndWent) {
  std::vector<bool> told;
  model->setConnectionHandler([&](bool isConnected) { told.push_back(isConnected); });
  model->restartMonitor();
  EXPECT_THAT(told, ElementsAre(true));
  loseServer();
  queue().advance(2s);
  EXPECT_THAT(told, ElementsAre(true, false));
  bringServerBack();
  queue().advance(5s);
  EXPECT_THAT(told, ElementsAre(true, false, true));
}

TEST_F(KestroModelTest, DoesNotTellItsOwnEndAsALostConnection) {
  std::vector<bool> told;
  model->setConnectionHandler([&](bool isConnected) { told.push_back(isConnected); });
  model->restartMonitor();
  model.reset();
  EXPECT_THAT(told, ElementsAre(true));
}

TEST_F(KestroModelTest, RefreshesNothingWhileItWaitsToRetry) {
  model->restartMonitor();
  loseServer();
  queue().advance(2s);
  model->updateWithData(*coding->xml(Dictionary{{"A", "1"}}));
  queue().advance(4s);
  EXPECT_EQ(redraws, 0);
}

TEST_F(KestroModelTest, ClosesItsPortsWithoutRestarting) {
  model->restartMonitor();
  queue().runReady();
  errors();
  model->destroyPorts();
  EXPECT_FALSE(model->isConnected());
  EXPECT_THAT(errors(), IsEmpty());
  EXPECT_EQ(queue().pending(), 1U);  // the stopped timer's last tick, which does nothing
  queue().advance(60s);
  EXPECT_THAT(channelRequests, SizeIs(1));
}

TEST_F(KestroModelTest, ReplacesTheGeneratorAtEachConnectionAndKeepsTheState) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  queue().advance(2s);
  static_cast<void>(model->topLevelNodes());
  errors();

  model->restartMonitor();

  EXPECT_THAT(errors(), ElementsAre(MatchesRegex(kCreatedPorts), MatchesRegex(kGotGenerator),
                                    "Starting the display update timer"));
  EXPECT_EQ(model->getSaveContents().array().size(), 1U);
}

/// A generator that shows which state it was given.
class StateKeysGenerator : public LogGenerator {
 public:
  explicit StateKeysGenerator(const GeneratorServices& services) : LogGenerator(services) {}
  void updateStateWithData(Dictionary& state, ByteView /*data*/) override {
    for (const char* key : {"DisplayState", "Display", "ExtraInfo", "History", "Running"}) {
      state.set(key, "old");
    }
  }
  Value generateLogUsingState(Dictionary& state) override { return state; }
  [[nodiscard]] Dictionary getStartCommand() const override { return {}; }
  [[nodiscard]] Array getSaveContentsFromState(const Dictionary& /*state*/) override { return {}; }
  [[nodiscard]] std::span<const std::string_view> stateKeys() const override {
    static constexpr std::string_view kKeys[] = {"Display", "ExtraInfo", "Running"};
    return kKeys;
  }
};

/// A generator that shows which one it is.
class NumberedGenerator : public StateKeysGenerator {
 public:
  NumberedGenerator(const GeneratorServices& services, int number)
      : StateKeysGenerator(services), _number(number) {}
  Value generateLogUsingState(Dictionary& /*state*/) override { return std::to_string(_number); }

 private:
  int _number;
};

class TechnologyChangeTest : public ModelFixture {
 protected:
  TechnologyChangeTest() {
    model = KestroModel::create(
        platform, [] {},
        [](const GeneratorServices& services,
           std::string_view technology) -> std::unique_ptr<LogGenerator> {
          if (technology == "none") return nullptr;
          return std::make_unique<StateKeysGenerator>(services);
        });
    connectTo("first");
    model->updateWithData({});
  }

  void connectTo(std::string_view technology) {
    answerTechnology(technology);
    model->restartMonitor();
  }

  std::vector<std::string> shown() {
    std::vector<std::string> names;
    for (const auto& node : *model->topLevelNodes()->childNodes()) {
      names.push_back(node->displayName());
    }
    return names;
  }
};

TEST_F(TechnologyChangeTest, KeepsTheStateForTheSameTechnology) {
  connectTo("first");
  EXPECT_THAT(shown(), ElementsAre("DisplayState", "Display", "ExtraInfo", "History", "Running"));
}

TEST_F(TechnologyChangeTest, TakesANewGeneratorThoughTheTechnologyIsTheSame) {
  int made = 0;
  model = KestroModel::create(
      platform, [] {},
      [&](const GeneratorServices& services, std::string_view) -> std::unique_ptr<LogGenerator> {
        return std::make_unique<NumberedGenerator>(services, ++made);
      });
  connectTo("first");
  model->updateWithData({});
  EXPECT_EQ(*model->topLevelNodes()->value(), "1");
  connectTo("first");
  model->updateWithData({});
  model->refresh();
  EXPECT_EQ(*model->topLevelNodes()->value(), "2");
}

TEST_F(TechnologyChangeTest, TakesTheOldGeneratorsKeysOutOfTheState) {
  connectTo("second");
  EXPECT_THAT(shown(), ElementsAre("DisplayState", "History"));
}

TEST_F(TechnologyChangeTest, RemembersTheTechnologyAcrossOneWithoutAGenerator) {
  connectTo("none");
  connectTo("first");
  EXPECT_THAT(shown(), ElementsAre("DisplayState", "Display", "ExtraInfo", "History", "Running"));
}

TEST_F(KestroModelTest, AsksForNoRedrawOfDataThatWentWithItsTechnology) {
  model->restartMonitor();
  sendLog(Dictionary{{"A", "1"}});
  answerTechnology("LTE");
  model->restartMonitor();
  queue().advance(2s);
  EXPECT_EQ(redraws, 0);
}

TEST_F(KestroModelTest, ShowsALeafWhileTheGeneratorHasNoDisplay) {
  model->restartMonitor();
  const NodePointer root = model->topLevelNodes();
  EXPECT_EQ(root->displayName(), "Kestro");
  EXPECT_EQ(*root->value(), "(unknown)");
}

TEST_F(KestroModelTest, PassesOnWhatTheGeneratorThrows) {
  model->restartMonitor();
  EXPECT_ANY_THROW(model->updateWithData(bytesOf("garbage")));
}

TEST_F(KestroModelTest, DropsDataWithoutAGenerator) {
  model->updateWithData(bytesOf("garbage"));
  model->refresh();
  queue().runReady();
  EXPECT_EQ(redraws, 1);
  EXPECT_FALSE(model->topLevelNodes());
}

}  // namespace
}  // namespace kestro::testing
