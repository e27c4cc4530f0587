// SPDX-License-Identifier: MIT
// The server and its clients, on in-memory ports.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "TelephonyServer/Server.h"

namespace kestro {
namespace {

using std::chrono::seconds;
using ::testing::AllOf;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::StartsWith;

constexpr const char* kFirstChannel = "LogChannel.00000000-0000-0000-0000-000000000001";

/// A server under its usual name, and clients that speak to it with bytes of their own.
class ServerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    auto server = Server::open(_platform, "TelephonyServer", "IFX", [this] { _portLost = true; });
    ASSERT_TRUE(server.has_value()) << server.error().message;
    _server = std::move(*server);
  }

  static Bytes bytesOf(std::string_view text) { return {text.begin(), text.end()}; }
  Bytes xml(const Dictionary& dictionary) const { return *_coding->xml(dictionary); }
  Dictionary parsed(const std::optional<Bytes>& bytes) const {
    if (!bytes) return Dictionary::null();
    const auto value = _coding->parse(*bytes);
    return value ? value->dictionary() : Dictionary::null();
  }
  std::shared_ptr<RemotePort> connect(std::string_view name) {
    return _platform.messagePorts().createRemotePort(name);
  }

  /// Opens a client's local port, whose messages are collected under its name.
  void openClientPort(const std::string& name) {
    _clientPorts[name] = _platform.messagePorts().createLocalPort(
        name, [this, name](std::int32_t id, ByteView message) -> std::optional<Bytes> {
          _received[name].push_back(std::to_string(id) + ":" +
                                    std::string(message.begin(), message.end()));
          return std::nullopt;
        });
  }
  Dictionary request(MessagePorts& ports, const Bytes& body) {
    const auto server = ports.createRemotePort("TelephonyServer");
    const auto reply = server->request(2, body, seconds(1), seconds(1));
    EXPECT_EQ(reply.error, SendError::None);
    return parsed(reply.data);
  }
  Dictionary request(const Bytes& body) { return request(_platform.messagePorts(), body); }
  Dictionary requestChannel(MessagePorts& ports, const std::string& localPort) {
    return request(ports, xml({{"LocalPort", localPort}}));
  }
  Dictionary requestChannel(const std::string& localPort) {
    return requestChannel(_platform.messagePorts(), localPort);
  }
  /// Opens a client with a channel; returns the connection on which commands go.
  std::shared_ptr<RemotePort> openChannel(const std::string& client) {
    openClientPort(client);
    const auto reply = requestChannel(client);
    EXPECT_EQ(reply["Error"], Value::integer(0));
    return connect(reply["Port"].text());
  }
  std::shared_ptr<RemotePort> openStream(const std::string& client) {
    auto channel = openChannel(client);
    command(channel, {{"SetState", "Streaming"}});
    return channel;
  }
  void command(const std::shared_ptr<RemotePort>& channel, const Dictionary& body) {
    EXPECT_EQ(channel->send(0, xml(body), seconds(1)), SendError::None);
    run();
  }
  /// A client whose channel is lost, since it does not read: of seven messages, of 1 MiB each, it
  /// misses the last three. The channel's port.
  std::string loseChannel(const std::string& client, const Dictionary& start) {
    openClientPort(client);
    const std::string port(requestChannel(client)["Port"].text());
    command(connect(port), start);
    _platform.messagePorts().setStalled(client, true);
    for (int i = 0; i < 7; ++i) stream(std::string(1024 * 1024, 'x'));
    EXPECT_EQ(_server->channelCount(), 0U);
    _platform.messagePorts().setStalled(client, false);
    run();
    EXPECT_EQ(_received[client].size(), 4U);
    _received[client].clear();
    return port;
  }
  Dictionary requestChannelAfter(const std::string& client, const std::string& previous) {
    return request(xml({{"LocalPort", client}, {"Previous", previous}}));
  }
  void registerPort(const std::string& name) {
    EXPECT_EQ(connect("TelephonyServer")->send(1, xml({{"NotificationPort", name}}), seconds(1)),
              SendError::None);
    run();
  }
  void stream(std::string_view message, Moment time = {}) {
    _server->messageDue(bytesOf(message), time);
    run();
  }
  void run() { _platform.mainQueue().runReady(); }
  std::vector<std::string> logLines() {
    std::vector<std::string> lines;
    for (const auto& line : _platform.systemLog().take()) lines.push_back(line.text);
    return lines;
  }

  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  VirtualPlatform _platform{*_coding};
  std::map<std::string, std::shared_ptr<LocalPort>> _clientPorts;
  std::map<std::string, std::vector<std::string>> _received;
  std::unique_ptr<Server> _server;
  bool _portLost = false;
};

TEST_F(ServerTest, ANameThatIsTakenIsAnError) {
  const auto second = Server::open(_platform, "TelephonyServer", "IFX", [] {});
  ASSERT_FALSE(second.has_value());
  EXPECT_EQ(second.error().message,
            "another server is running: the port name \"TelephonyServer\" is taken");
}

TEST_F(ServerTest, ANameThatIsNoneIsAnError) {
  EXPECT_FALSE(Server::open(_platform, "a/b", "IFX", [] {}).has_value());
}

TEST_F(ServerTest, LosingItsNameIsReported) {
  _platform.messagePorts().lose("TelephonyServer");
  EXPECT_TRUE(_portLost);
}

TEST_F(ServerTest, EveryChannelHasAPortOfItsOwn) {
  openClientPort("A");
  const auto first = requestChannel("A");
  const auto second = requestChannel("A");
  EXPECT_EQ(first["Error"], Value::integer(0));
  EXPECT_EQ(first["Port"].text(), "LogChannel.00000000-0000-0000-0000-000000000001");
  EXPECT_EQ(second["Port"].text(), "LogChannel.00000000-0000-0000-0000-000000000002");
  EXPECT_EQ(_server->channelCount(), 2U);
}

TEST_F(ServerTest, TheFirstChannelAndTheEndOfTheLastAreTold) {
  std::vector<bool> told;
  _server->setWatchHandler([&told](bool isWatched) { told.push_back(isWatched); });
  auto first = openChannel("First");
  auto second = openChannel("Second");
  EXPECT_EQ(told, std::vector<bool>{true});
  _clientPorts.erase("First");
  _platform.mainQueue().advance(seconds(2));
  EXPECT_EQ(told, std::vector<bool>{true});
  _clientPorts.erase("Second");
  _platform.mainQueue().advance(seconds(2));
  EXPECT_EQ(told, (std::vector<bool>{true, false}));
}

TEST_F(ServerTest, BadChannelRequestsAreAnsweredWithOne) {
  openClientPort("A");
  EXPECT_EQ(request(bytesOf("garbage"))["Error"], Value::integer(1));
  EXPECT_EQ(request({})["Error"], Value::integer(1));
  EXPECT_EQ(request(xml({{"Port", "A"}}))["Error"], Value::integer(1));
  EXPECT_EQ(request(xml({{"LocalPort", "a/b"}}))["Error"], Value::integer(1));
  EXPECT_EQ(request(xml({{"LocalPort", Value::integer(1)}}))["Error"], Value::integer(1));
  EXPECT_EQ(request(*_coding->xml(Array{"LocalPort", "A"}))["Error"], Value::integer(1));
  EXPECT_EQ(_server->channelCount(), 0U);
}

TEST_F(ServerTest, ALocalPortThatNobodyOwnsIsAnsweredWithTwo) {
  const auto reply = requestChannel("Nobody");
  EXPECT_EQ(reply["Error"], Value::integer(2));
  EXPECT_TRUE(reply["Port"].isNull());
}

TEST_F(ServerTest, ItsOwnPortsAreNoLocalPorts) {
  const auto channel = openChannel("A");
  openClientPort("N");
  registerPort("N");
  logLines();
  for (const char* own : {"TelephonyServer", kFirstChannel, "N"}) {
    EXPECT_EQ(Value(requestChannel(own)), Value(Dictionary{{"Error", Value::integer(2)}})) << own;
  }
  EXPECT_EQ(_server->channelCount(), 1U);
  EXPECT_THAT(logLines(),
              ElementsAre("No log channel for TelephonyServer: the port TelephonyServer is the "
                          "server's own",
                          "No log channel for LogChannel.00000000-0000-0000-0000-000000000001: the "
                          "port LogChannel.00000000-0000-0000-0000-000000000001 is the server's "
                          "own",
                          "No log channel for N: notifications go to this port"));
}

TEST_F(ServerTest, AnotherProcessesPortIsNoLocalPort) {
  openClientPort("Mine");
  const auto other = _platform.messagePorts().portsOf(7);
  const auto port = other->createLocalPort("Others", {});
  EXPECT_EQ(requestChannel("Others")["Error"], Value::integer(2));
  EXPECT_EQ(requestChannel(*other, "Mine")["Error"], Value::integer(2));
  EXPECT_EQ(_server->channelCount(), 0U);
  EXPECT_EQ(requestChannel(*other, "Others")["Error"], Value::integer(0));
  EXPECT_EQ(requestChannel("Mine")["Error"], Value::integer(0));
}

TEST_F(ServerTest, APortOfAnUnknownProcessIsNoLocalPort) {
  const auto unknown = _platform.messagePorts().portsOf(kUnknownProcess);
  const auto port = unknown->createLocalPort("Unknown", {});
  EXPECT_EQ(requestChannel(*unknown, "Unknown")["Error"], Value::integer(2));
  EXPECT_EQ(_server->channelCount(), 0U);
}

TEST_F(ServerTest, AChannelWithoutAPortIsAnsweredWithThree) {
  openClientPort("A");
  _platform.messagePorts().failures().localPort = true;
  EXPECT_EQ(requestChannel("A")["Error"], Value::integer(3));
  _platform.uuids().setExhausted(true);
  EXPECT_EQ(requestChannel("A")["Error"], Value::integer(3));
  EXPECT_EQ(_server->channelCount(), 0U);
}

TEST_F(ServerTest, ThereAreNoMoreThan512Channels) {
  openClientPort("A");
  for (int i = 0; i < 512; ++i) {
    ASSERT_EQ(requestChannel("A")["Error"], Value::integer(0)) << i;
  }
  EXPECT_EQ(requestChannel("A")["Error"], Value::integer(3));
  _clientPorts["A"]->invalidate();
  openClientPort("B");
  EXPECT_EQ(requestChannel("B")["Error"], Value::integer(0));
}

TEST_F(ServerTest, AnswersGetTechnology) {
  const auto channel = openChannel("A");
  const auto body = xml({{"GetTechnology", "GetTechnology"}});
  const auto reply = channel->request(0, body, seconds(1), seconds(1));
  EXPECT_EQ(Value(parsed(reply.data)), Value(Dictionary{{"GetTechnology", "IFX"}}));
}

TEST_F(ServerTest, StreamsNothingBeforeTheStartCommand) {
  const auto channel = openChannel("A");
  stream("one");
  command(channel, {{"SetState", "Streaming"}});
  stream("two");
  EXPECT_THAT(_received["A"], ElementsAre("0:two"));
}

TEST_F(ServerTest, EveryStreamingClientGetsEveryMessage) {
  const auto a = openStream("A");
  const auto b = openStream("B");
  stream("one");
  stream("two");
  EXPECT_THAT(_received["A"], ElementsAre("0:one", "0:two"));
  EXPECT_THAT(_received["B"], ElementsAre("0:one", "0:two"));
}

TEST_F(ServerTest, EachClientGetsTheCodesThatItAskedFor) {
  const auto a = openChannel("A");
  const auto b = openChannel("B");
  command(a, {{"SetState", "Streaming"}, {"SetOndrelLogCodes", Array{Value::integer(0x4241)}}});
  command(b, {{"SetState", "Streaming"},
              {"SetOndrelLogCodes", Array{}},
              {"SetTqExtraCodes", Array{Value::integer(0x4241)}}});
  stream("\x01..AB");
  stream("\xFF..AB");
  stream("\x01..XY");
  EXPECT_THAT(_received["A"], ElementsAre("0:\x01..AB"));
  EXPECT_THAT(_received["B"], ElementsAre("0:\xFF..AB"));
}

TEST_F(ServerTest, ALaterStartCommandReplacesTheEarlier) {
  const auto channel = openChannel("A");
  command(channel, {{"SetState", "Streaming"}, {"SetOndrelLogCodes", Array{}}});
  stream("\x01..AB");
  command(channel, {{"SetState", "Streaming"}});
  stream("\x01..XY");
  EXPECT_THAT(_received["A"], ElementsAre("0:\x01..XY"));
}

TEST_F(ServerTest, MalformedCommandsAreDroppedWithALine) {
  const auto channel = openChannel("A");
  logLines();
  const std::vector<Bytes> bodies = {
      bytesOf("garbage"),
      {},
      *_coding->xml(Array{"SetState", "Streaming"}),
      xml({{"Other", "x"}}),
      xml({{"SetState", "Dancing"}}),
      xml({{"SetState", Value::integer(1)}}),
      xml({{"SetState", "Streaming"}, {"SetOndrelLogCodes", "17"}}),
      xml({{"SetState", "Streaming"}, {"SetOndrelLogCodes", Array{"17"}}}),
      xml({{"SetState", "Streaming"}, {"Times", Value::integer(1)}}),
      xml({{"SetState", "Streaming"}, {"SetTqExtraCodes", Array{Value::integer(-1)}}}),
      xml({{"SetState", "Streaming"}, {"SetTqExtraCodes", Array{Value::integer(65536)}}})};
  for (std::size_t i = 0; i < bodies.size(); ++i) {
    channel->send(0, bodies[i], seconds(1));
    run();
    EXPECT_THAT(logLines(),
                ElementsAre(AllOf(StartsWith("LogChannel."), HasSubstr(" received no command: "))))
        << i;
  }
  stream("one");
  EXPECT_THAT(_received["A"], IsEmpty());
  EXPECT_EQ(_server->channelCount(), 1U);
}

TEST_F(ServerTest, MessagesWithOtherIdsAreIgnored) {
  const auto channel = openChannel("A");
  channel->send(7, xml({{"SetState", "Streaming"}}), seconds(1));
  connect("TelephonyServer")->send(0, xml({{"LocalPort", "A"}}), seconds(1));
  run();
  stream("one");
  EXPECT_THAT(_received["A"], IsEmpty());
  EXPECT_EQ(_server->channelCount(), 1U);
}

TEST_F(ServerTest, AClientThatGoesAwayFreesItsChannel) {
  const auto a = openStream("A");
  const auto b = openStream("B");
  _clientPorts["A"]->invalidate();
  _platform.mainQueue().advance(seconds(1));
  EXPECT_EQ(_server->channelCount(), 1U);
  EXPECT_FALSE(a->isValid());
  EXPECT_TRUE(b->isValid());
}

TEST_F(ServerTest, AClientThatHasGoneIsNoticedByTheNextMessageToo) {
  const auto a = openStream("A");
  _clientPorts["A"]->invalidate();
  stream("one");
  EXPECT_EQ(_server->channelCount(), 0U);
}

TEST_F(ServerTest, ASlowClientLosesItsChannelAndStallsNobody) {
  const auto slow = openStream("Slow");
  const auto quick = openStream("Quick");
  logLines();
  _platform.messagePorts().setStalled("Slow", true);
  const std::string megabyte(1024 * 1024, 'x');
  for (int i = 0; i < 6; ++i) stream(megabyte);
  EXPECT_EQ(_received["Quick"].size(), 6U);
  EXPECT_EQ(_server->channelCount(), 1U);
  EXPECT_FALSE(slow->isValid());
  EXPECT_TRUE(quick->isValid());
  EXPECT_THAT(logLines(), Contains(HasSubstr("reads too slowly")));
}

TEST_F(ServerTest, AMessageThatNoQueueHoldsIsLeftOutForAll) {
  const auto channel = openStream("A");
  logLines();
  _server->messageDue(Bytes(Server::kMaximumStreamedMessage + 1), {});
  run();
  EXPECT_THAT(_received["A"], IsEmpty());
  EXPECT_TRUE(channel->isValid());
  EXPECT_THAT(logLines(), ElementsAre(HasSubstr("A message of 4194289 bytes is left out")));
}

TEST_F(ServerTest, AChangeOfTechnologyInvalidatesTheChannelsBeforeItNotifies) {
  const auto channel = openStream("A");
  bool wasValidWhenNotified = true;
  std::vector<std::string> notifications;
  const auto port = _platform.messagePorts().createLocalPort(
      "N", [&](std::int32_t id, ByteView message) -> std::optional<Bytes> {
        wasValidWhenNotified = channel->isValid();
        const auto body = parsed(Bytes(message.begin(), message.end()));
        notifications.push_back(std::to_string(id) + ":" +
                                std::string(body["Notification"].text()));
        return std::nullopt;
      });
  registerPort("N");
  _server->technologyChanged("LTE");
  EXPECT_FALSE(channel->isValid());
  EXPECT_EQ(_server->channelCount(), 0U);
  run();
  EXPECT_THAT(notifications, ElementsAre("3:TechnologyChanged"));
  EXPECT_FALSE(wasValidWhenNotified);
}

TEST_F(ServerTest, ANewChannelSpeaksTheNewTechnology) {
  _server->technologyChanged("LTE");
  const auto reply = openChannel("A")->request(0, xml({{"GetTechnology", "GetTechnology"}}),
                                               seconds(1), seconds(1));
  EXPECT_EQ(parsed(reply.data)["GetTechnology"], Value("LTE"));
}

TEST_F(ServerTest, ARegistrationTwiceCountsOnce) {
  openClientPort("N");
  registerPort("N");
  registerPort("N");
  EXPECT_EQ(_server->registrationCount(), 1U);
  _server->technologyChanged("LTE");
  run();
  EXPECT_EQ(_received["N"].size(), 1U);
}

TEST_F(ServerTest, ARegistrationEndsWithItsPort) {
  openClientPort("N");
  registerPort("N");
  _clientPorts["N"]->invalidate();
  _platform.mainQueue().advance(seconds(1));
  EXPECT_EQ(_server->registrationCount(), 0U);
}

TEST_F(ServerTest, APortThatCameBackCanRegisterAgainAtOnce) {
  openClientPort("N");
  registerPort("N");
  _clientPorts["N"]->invalidate();
  openClientPort("N");
  registerPort("N");
  _server->technologyChanged("LTE");
  run();
  EXPECT_EQ(_received["N"].size(), 1U);
}

TEST_F(ServerTest, UnusableRegistrationsAreDroppedWithALine) {
  connect("TelephonyServer")->send(1, bytesOf("garbage"), seconds(1));
  run();
  registerPort("a/b");
  registerPort("Nobody");
  EXPECT_EQ(_server->registrationCount(), 0U);
  EXPECT_THAT(logLines(), ElementsAre("A registration is dropped: it names no port",
                                      "A registration is dropped: it names no port",
                                      "A registration is dropped: nobody owns the port Nobody"));
}

TEST_F(ServerTest, ItsOwnPortsAndOthersAreNotRegistered) {
  const auto channel = openChannel("A");
  const auto other = _platform.messagePorts().portsOf(7);
  const auto port = other->createLocalPort("Others", {});
  for (const char* name : {"TelephonyServer", kFirstChannel, "Others"}) registerPort(name);
  EXPECT_EQ(_server->registrationCount(), 0U);
  EXPECT_THAT(logLines(),
              ElementsAre("A registration is dropped: the port TelephonyServer is the server's own",
                          "A registration is dropped: the port LogChannel.00000000-0000-0000-0000-"
                          "000000000001 is the server's own",
                          "A registration is dropped: the port Others is not of the process that "
                          "asks"));
}

// What old clients do not ask for.

TEST_F(ServerTest, TellsItsSourceWithTheChannel) {
  openClientPort("A");
  EXPECT_EQ(Value(requestChannel("A")), Value(Dictionary{{"Error", Value::integer(0)},
                                                         {"Port", kFirstChannel},
                                                         {"Ended", Value::boolean(false)}}));
  _server->setSource({.kind = "capture", .name = "/a.pcap", .isSimulated = false});
  EXPECT_EQ(Value(requestChannel("A")),
            Value(Dictionary{{"Error", Value::integer(0)},
                             {"Port", "LogChannel.00000000-0000-0000-0000-000000000002"},
                             {"Source", Dictionary{{"Kind", "capture"}, {"Name", "/a.pcap"}}},
                             {"Simulated", Value::boolean(false)},
                             {"Ended", Value::boolean(false)}}));
}

TEST_F(ServerTest, NotifiesOfTheEndOfItsSourceAndTellsItLater) {
  openClientPort("N");
  registerPort("N");
  const auto channel = openChannel("A");
  _server->setSource({.kind = "simulation", .isSimulated = true});
  _server->sourceEnded();
  run();
  const Dictionary expected{{"Notification", "SourceChanged"},
                            {"Source", Dictionary{{"Kind", "simulation"}}},
                            {"Simulated", Value::boolean(true)},
                            {"Ended", Value::boolean(true)}};
  ASSERT_EQ(_received["N"].size(), 1U);
  ASSERT_TRUE(_received["N"][0].starts_with("3:"));
  EXPECT_EQ(Value(parsed(bytesOf(_received["N"][0].substr(2)))), Value(expected));
  EXPECT_TRUE(channel->isValid());
  EXPECT_EQ(requestChannel("A")["Ended"], Value::boolean(true));
}

TEST_F(ServerTest, SendsTheSourcesTimesBeforeTheMessagesToWhoAsks) {
  const auto a = openStream("A");
  const auto b = openChannel("B");
  command(b, {{"SetState", "Streaming"},
              {"Times", Value::boolean(true)},
              {"SetOndrelLogCodes", Array{Value::integer(0x4241)}}});
  stream("\x01..AB", Moment(std::chrono::microseconds(0x0807060504030201)));
  stream("\x01..XY", Moment(std::chrono::microseconds(1)));
  EXPECT_THAT(_received["A"], ElementsAre("0:\x01..AB", "0:\x01..XY"));
  EXPECT_THAT(_received["B"], ElementsAre("4:\x01\x02\x03\x04\x05\x06\x07\x08", "0:\x01..AB"));
  command(b, {{"SetState", "Streaming"}});
  _received["B"].clear();
  stream("\x01..AB");
  EXPECT_THAT(_received["B"], ElementsAre("0:\x01..AB"));
}

TEST_F(ServerTest, TellsWhatALostChannelHasMissedAndGoesOnWithoutAGap) {
  const auto previous = loseChannel("A", {{"SetState", "Streaming"}});
  stream("missed");
  const auto reply = requestChannelAfter("A", previous);
  EXPECT_EQ(reply["Error"], Value::integer(0));
  EXPECT_EQ(reply["Lost"], Value::integer(4));
  stream("next");  // before the client has asked for anything on its new channel
  const auto channel = connect(reply["Port"].text());
  command(channel, {{"SetState", "Streaming"}});
  stream("last");
  EXPECT_THAT(_received["A"], ElementsAre("0:next", "0:last"));
}

TEST_F(ServerTest, ALostChannelMissesWhatItHadAskedFor) {
  const auto previous =
      loseChannel("A", {{"SetState", "Streaming"},
                        {"SetOndrelLogCodes", Array{Value::integer('x' << 8 | 'x')}},
                        {"SetTqExtraCodes", Array{}}});
  stream("\x01..xy");
  stream("\x01..xx");
  EXPECT_EQ(requestChannelAfter("A", previous)["Lost"], Value::integer(4));
  stream("\x01..xy");
  stream("\x01..xx");
  EXPECT_THAT(_received["A"], ElementsAre("0:\x01..xx"));
}

TEST_F(ServerTest, ALostChannelIsForgottenAfterAMinute) {
  const auto previous = loseChannel("A", {{"SetState", "Streaming"}});
  _platform.mainQueue().advance(seconds(61));
  const auto reply = requestChannelAfter("A", previous);
  EXPECT_EQ(reply["Error"], Value::integer(0));
  EXPECT_TRUE(reply["Lost"].isNull());
  stream("unasked");
  EXPECT_THAT(_received["A"], IsEmpty());
}

TEST_F(ServerTest, ALostChannelIsItsClientsOnly) {
  const auto previous = loseChannel("A", {{"SetState", "Streaming"}});
  const auto other = _platform.messagePorts().portsOf(7);
  const auto port = other->createLocalPort("Other", {});
  const auto body = xml({{"LocalPort", "Other"}, {"Previous", previous}});
  EXPECT_TRUE(request(*other, body)["Lost"].isNull());
  EXPECT_EQ(requestChannelAfter("A", previous)["Lost"], Value::integer(3));
}

TEST_F(ServerTest, AChannelThatItsClientHasGivenUpIsLostAndMissesNothingYet) {
  openClientPort("A");
  const std::string previous(requestChannel("A")["Port"].text());
  command(connect(previous), {{"SetState", "Streaming"}});
  EXPECT_EQ(requestChannelAfter("A", previous)["Lost"], Value::integer(0));
  EXPECT_EQ(_server->channelCount(), 1U);
  stream("once");
  EXPECT_THAT(_received["A"], ElementsAre("0:once"));
}

TEST_F(ServerTest, WhatAChannelThatNeverStreamedMissesIsNotKnown) {
  openClientPort("A");
  const std::string previous(requestChannel("A")["Port"].text());
  EXPECT_TRUE(requestChannelAfter("A", previous)["Lost"].isNull());
  EXPECT_TRUE(requestChannelAfter("A", "Unheard")["Lost"].isNull());
  EXPECT_TRUE(request(xml({{"LocalPort", "A"}, {"Previous", Value::integer(1)}}))["Lost"].isNull());
}

TEST_F(ServerTest, AChangeOfTechnologyCountsForWhoAskedForEverything) {
  openClientPort("A");
  const std::string all(requestChannel("A")["Port"].text());
  command(connect(all), {{"SetState", "Streaming"}});
  openClientPort("B");
  const std::string codes(requestChannel("B")["Port"].text());
  command(connect(codes), {{"SetState", "Streaming"}, {"SetOndrelLogCodes", Array{}}});
  _server->technologyChanged("LTE");
  stream("new");
  EXPECT_EQ(requestChannelAfter("A", all)["Lost"], Value::integer(1));
  EXPECT_TRUE(requestChannelAfter("B", codes)["Lost"].isNull());
}

TEST_F(ServerTest, ThereAreNoMoreThan512Registrations) {
  for (int i = 0; i < 513; ++i) {
    const auto name = "N" + std::to_string(i);
    openClientPort(name);
    registerPort(name);
  }
  EXPECT_EQ(_server->registrationCount(), 512U);
  EXPECT_THAT(logLines(), ElementsAre("A registration is dropped: there are too many"));
}

}  // namespace
}  // namespace kestro
