// SPDX-License-Identifier: MIT
// The client side of the telephony server, against a server of a few lines on in-memory ports.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <utility>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/TelephonyService.h"
#include "Platform/TelephonyProtocol.h"
#include "Platform/Virtual/InMemoryPorts.h"
#include "Platform/Virtual/VirtualMainQueue.h"
#include "Platform/Virtual/VirtualServices.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::StartsWith;

constexpr const char* kFirstPort = "TelephonyClient.00000000-0000-0000-0000-000000000001";
constexpr const char* kSecondPort = "TelephonyClient.00000000-0000-0000-0000-000000000002";

Bytes bytesOf(std::string_view text) { return {text.begin(), text.end()}; }

/// Ports whose remote ones only note how long a request may take.
class NotingPorts : public MessagePorts {
 public:
  explicit NotingPorts(MessagePorts& real) : _real(real) {}
  [[nodiscard]] std::shared_ptr<LocalPort> createLocalPort(std::string_view name,
                                                           ReceiveHandler handler) override {
    return _real.createLocalPort(name, std::move(handler));
  }
  [[nodiscard]] std::shared_ptr<RemotePort> createRemotePort(std::string_view) override {
    return std::make_shared<Remote>(*this);
  }

  std::vector<std::chrono::nanoseconds> timeouts;

 private:
  class Remote : public RemotePort {
   public:
    explicit Remote(NotingPorts& ports) : _ports(ports) {}
    SendError post(std::int32_t, ByteView) override { return SendError::None; }
    SendError send(std::int32_t, ByteView, std::chrono::nanoseconds) override {
      return SendError::None;
    }
    [[nodiscard]] Reply request(std::int32_t, ByteView, std::chrono::nanoseconds sendTimeout,
                                std::chrono::nanoseconds receiveTimeout) override {
      _ports.timeouts = {sendTimeout, receiveTimeout};
      return {SendError::ReceiveTimeout, {}};
    }
    void invalidate() override {}
    [[nodiscard]] bool isValid() const override { return true; }
    [[nodiscard]] std::size_t unsentMessages(std::int32_t) const override { return 0; }
    [[nodiscard]] ProcessNumber owner() const override { return kUnknownProcess; }

   private:
    NotingPorts& _ports;
  };

  MessagePorts& _real;
};

class TelephonyServiceTest : public ::testing::Test {
 protected:
  struct Received {
    std::int32_t id;
    Value body;
  };

  void startServer() {
    server = ports.createLocalPort(
        "TelephonyServer", [this](std::int32_t id, ByteView message) -> std::optional<Bytes> {
          EXPECT_THAT(std::string(message.begin(), message.end()),
                      StartsWith("<?xml version=\"1.0\""));
          received.push_back({id, *coding->parse(message)});
          return reply;
        });
  }

  /// Connects, and lets the server see what the client has posted.
  std::unique_ptr<TqServerConnection> connect() {
    auto connection = service->_TqServerConnectionCreate([this] { ++notifications; });
    queue.runReady();
    return connection;
  }

  LogChannelReply requestChannel() {
    const auto connection = connect();
    return service->_TqServerConnectionNetworkMonitorCreateLogChannel(*connection, "KestroApp.1");
  }

  void sendTo(const char* port, std::int32_t id) {
    const auto remote = ports.createRemotePort(port);
    ASSERT_TRUE(remote);
    EXPECT_EQ(remote->post(id, bytesOf("whatever")), SendError::None);
    queue.runReady();
  }

  void notify(const Dictionary& body) {
    const auto remote = ports.createRemotePort(kFirstPort);
    ASSERT_TRUE(remote);
    EXPECT_EQ(remote->post(3, *coding->xml(body)), SendError::None);
    queue.runReady();
  }

  VirtualClock clock;
  VirtualMainQueue queue{clock};
  InMemoryPorts ports{queue};
  VirtualUuids uuids;
  RecordingSystemLog log;
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  std::unique_ptr<TelephonyService> service =
      createPortTelephonyService(ports, uuids, *coding, log, "TelephonyServer");
  std::shared_ptr<LocalPort> server;
  std::vector<Received> received;
  std::optional<Bytes> reply;
  int notifications = 0;
};

TEST_F(TelephonyServiceTest, ThereIsNoConnectionWithoutAServer) { EXPECT_FALSE(connect()); }

TEST_F(TelephonyServiceTest, RegistersItsNotificationPort) {
  startServer();
  const auto connection = connect();
  ASSERT_TRUE(connection);
  ASSERT_EQ(received.size(), 1U);
  EXPECT_EQ(received[0].id, 1);
  EXPECT_EQ(received[0].body, Value(Dictionary{{"NotificationPort", kFirstPort}}));
  EXPECT_TRUE(ports.exists(kFirstPort));
}

TEST_F(TelephonyServiceTest, EveryNotificationRunsTheHandler) {
  startServer();
  const auto connection = connect();
  sendTo(kFirstPort, 3);
  sendTo(kFirstPort, 3);
  EXPECT_EQ(notifications, 2);
}

TEST_F(TelephonyServiceTest, OtherMessagesAreNoNotifications) {
  startServer();
  const auto connection = connect();
  sendTo(kFirstPort, 0);
  EXPECT_EQ(notifications, 0);
}

TEST_F(TelephonyServiceTest, TheRegistrationOutlivesTheConnection) {
  startServer();
  auto connection = connect();
  connection.reset();
  sendTo(kFirstPort, 3);
  EXPECT_EQ(notifications, 1);
}

TEST_F(TelephonyServiceTest, TheNextConnectionReplacesTheRegistration) {
  startServer();
  const auto first = connect();
  const auto second = connect();
  EXPECT_FALSE(ports.exists(kFirstPort));
  EXPECT_TRUE(ports.exists(kSecondPort));
}

TEST_F(TelephonyServiceTest, CancellingEndsTheRegistration) {
  startServer();
  const auto connection = connect();
  service->cancelNotifications();
  service->cancelNotifications();
  EXPECT_THAT(ports.names(), ElementsAre("TelephonyServer"));
}

TEST_F(TelephonyServiceTest, TheRegistrationEndsWithTheService) {
  startServer();
  const auto connection = connect();
  service.reset();
  EXPECT_FALSE(ports.exists(kFirstPort));
}

TEST_F(TelephonyServiceTest, TheHandlerMayMakeTheNextConnection) {
  startServer();
  std::unique_ptr<TqServerConnection> next;
  const std::string kept(100, 'k');
  const auto connection = service->_TqServerConnectionCreate([&, kept] {
    next = connect();
    EXPECT_EQ(kept, std::string(100, 'k'));
  });
  sendTo(kFirstPort, 3);
  EXPECT_TRUE(next);
  sendTo(kSecondPort, 3);
  EXPECT_EQ(notifications, 1);
}

TEST_F(TelephonyServiceTest, WithoutAUuidThereIsNoConnection) {
  startServer();
  uuids.setExhausted(true);
  EXPECT_FALSE(connect());
}

TEST_F(TelephonyServiceTest, WithoutANotificationPortThereIsNoConnection) {
  startServer();
  ports.failures().localPort = true;
  EXPECT_FALSE(connect());
  EXPECT_THAT(received, IsEmpty());
}

TEST_F(TelephonyServiceTest, ARegistrationThatCannotBeSentLeavesALineAndNothingElse) {
  startServer();
  ports.failures().post = SendError::Transport;
  EXPECT_FALSE(connect());
  EXPECT_THAT(log.lines(),
              ElementsAre(RecordingSystemLog::Line{
                  LogPriority::Error, "Could not register for notifications (got error=-4)"}));
  EXPECT_THAT(ports.names(), ElementsAre("TelephonyServer"));
}

TEST_F(TelephonyServiceTest, AsksForAChannelToTheLocalPort) {
  startServer();
  reply = coding->xml(Dictionary{{"Error", Value::integer(0)}, {"Port", "TelephonyServer.1"}});
  const auto channel = requestChannel();
  EXPECT_EQ(channel.error, 0);
  EXPECT_EQ(channel.portName, "TelephonyServer.1");
  ASSERT_EQ(received.size(), 2U);
  EXPECT_EQ(received[1].id, 2);
  EXPECT_EQ(received[1].body, Value(Dictionary{{"LocalPort", "KestroApp.1"}}));
}

TEST_F(TelephonyServiceTest, AReplyInBinaryIsUnderstood) {
  startServer();
  reply = coding->binary(Dictionary{{"Error", Value::integer(0)}, {"Port", "B"}});
  EXPECT_EQ(requestChannel().portName, "B");
}

TEST_F(TelephonyServiceTest, TheServersErrorIsPassedOn) {
  startServer();
  reply = coding->xml(Dictionary{{"Error", Value::integer(2)}});
  const auto channel = requestChannel();
  EXPECT_EQ(channel.error, 2);
  EXPECT_EQ(channel.portName, std::nullopt);
}

TEST_F(TelephonyServiceTest, AChannelWithoutAPortNameIsPassedOn) {
  startServer();
  reply = coding->xml(Dictionary{{"Error", Value::integer(0)}});
  const auto channel = requestChannel();
  EXPECT_EQ(channel.error, 0);
  EXPECT_EQ(channel.portName, std::nullopt);
}

TEST_F(TelephonyServiceTest, AsksForAChannelAfterALostOne) {
  startServer();
  reply = coding->xml(
      Dictionary{{"Error", Value::integer(0)}, {"Port", "B"}, {"Lost", Value::integer(823'387)}});
  const auto connection = connect();
  const auto channel = service->createLogChannelAfter(*connection, "KestroApp.2", "LogChannel.1");
  EXPECT_EQ(channel.portName, "B");
  EXPECT_EQ(channel.lost, 823'387U);
  EXPECT_EQ(received.back().id, 2);
  EXPECT_EQ(received.back().body,
            Value(Dictionary{{"LocalPort", "KestroApp.2"}, {"Previous", "LogChannel.1"}}));
}

TEST_F(TelephonyServiceTest, TheReplyTellsTheSource) {
  startServer();
  reply = coding->xml(Dictionary{{"Error", Value::integer(0)},
                                 {"Port", "B"},
                                 {"Source", Dictionary{{"Kind", "capture"}, {"Name", "a.pcap"}}},
                                 {"Simulated", Value::boolean(false)},
                                 {"Ended", Value::boolean(true)}});
  EXPECT_EQ(requestChannel().source,
            (LogSourceState{
                .kind = "capture", .name = "a.pcap", .isSimulated = false, .hasEnded = true}));
}

TEST_F(TelephonyServiceTest, AServerThatTellsNothingMoreIsUnderstood) {
  startServer();
  reply = coding->xml(Dictionary{{"Error", Value::integer(0)}, {"Port", "B"}});
  const auto connection = connect();
  const auto channel = service->createLogChannelAfter(*connection, "KestroApp.2", "LogChannel.1");
  EXPECT_EQ(channel.error, 0);
  EXPECT_EQ(channel.source, LogSourceState());
  EXPECT_EQ(channel.lost, std::nullopt);
}

TEST_F(TelephonyServiceTest, WhatIsToldInAnotherFormIsNotTold) {
  startServer();
  reply = coding->xml(Dictionary{{"Error", Value::integer(0)},
                                 {"Port", "B"},
                                 {"Source", "capture"},
                                 {"Simulated", "true"},
                                 {"Ended", Value::integer(1)},
                                 {"Lost", Value::integer(-1)}});
  const auto channel = requestChannel();
  EXPECT_EQ(channel.portName, "B");
  EXPECT_EQ(channel.source, LogSourceState());
  EXPECT_EQ(channel.lost, std::nullopt);
}

TEST_F(TelephonyServiceTest, AChangeOfTheSourceIsToldBeforeTheNotification) {
  startServer();
  const auto connection = connect();
  std::vector<LogSourceState> states;
  service->setSourceHandler([&](const LogSourceState& state) {
    EXPECT_EQ(notifications, 0);
    states.push_back(state);
  });
  notify({{"Notification", "SourceChanged"}, {"Ended", Value::boolean(true)}});
  EXPECT_THAT(states, ElementsAre(LogSourceState{.hasEnded = true}));
  EXPECT_EQ(notifications, 1);
}

TEST_F(TelephonyServiceTest, OtherNotificationsTellNothingOfTheSource) {
  startServer();
  const auto connection = connect();
  service->setSourceHandler([](const LogSourceState&) { ADD_FAILURE(); });
  notify({{"Notification", "TechnologyChanged"}, {"Ended", Value::boolean(true)}});
  sendTo(kFirstPort, 3);  // no property list
  EXPECT_EQ(notifications, 2);
  service->setSourceHandler({});
  notify({{"Notification", "SourceChanged"}});
  EXPECT_EQ(notifications, 3);
}

TEST_F(TelephonyServiceTest, RunningOutOfTimeIsAnError) {
  startServer();
  const auto connection = connect();
  for (const auto error : {SendError::SendTimeout, SendError::ReceiveTimeout}) {
    ports.failures().request = RemotePort::Reply{error, {}};
    EXPECT_EQ(service->_TqServerConnectionNetworkMonitorCreateLogChannel(*connection, "KestroApp.1")
                  .error,
              static_cast<long>(error));
  }
}

TEST_F(TelephonyServiceTest, AChannelRequestHasOneSecondEachWay) {
  NotingPorts noting(ports);
  service = createPortTelephonyService(noting, uuids, *coding, log, "TelephonyServer");
  EXPECT_EQ(requestChannel().error, -2);
  EXPECT_THAT(noting.timeouts, ElementsAre(std::chrono::seconds(1), std::chrono::seconds(1)));
}

TEST_F(TelephonyServiceTest, AServerThatIsGoneIsAnError) {
  startServer();
  const auto connection = connect();
  server->invalidate();
  EXPECT_EQ(
      service->_TqServerConnectionNetworkMonitorCreateLogChannel(*connection, "KestroApp.1").error,
      -3);
}

TEST_F(TelephonyServiceTest, ARequestThatTheServerDoesNotAnswerIsAnError) {
  startServer();
  EXPECT_EQ(requestChannel().error, -5);
}

TEST_F(TelephonyServiceTest, AReplyOfAnotherShapeIsAnError) {
  startServer();
  for (const auto& unusable :
       {bytesOf("garbage"), *coding->xml("text"), *coding->xml(Dictionary()),
        *coding->xml(Dictionary{{"Error", "0"}, {"Port", "TelephonyServer.1"}})}) {
    reply = unusable;
    EXPECT_EQ(requestChannel().error, -5);
  }
}

}  // namespace
}  // namespace kestro
