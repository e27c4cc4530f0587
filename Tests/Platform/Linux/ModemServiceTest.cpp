// SPDX-License-Identifier: MIT
// ModemManager as the Linux platform sees it, on a bus of the test's own.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QDBusVariant>
#include <QDBusVirtualObject>
#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/MainQueue.h"
#include "Platform/ModemService.h"
#include "Tests/Platform/Linux/PrivateBus.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using testing::PrivateBus;
using testing::ScopedEnvironment;
using testing::TemporaryDirectory;
using State = ModemServiceState;

constexpr const char* kName = "org.freedesktop.ModemManager1";
constexpr const char* kProperties = "org.freedesktop.DBus.Properties";

/// Answers the methods that the tests call.
class StandIn final : public QDBusVirtualObject {
 public:
  [[nodiscard]] QString introspect(const QString&) const override { return {}; }
  bool handleMessage(const QDBusMessage& message, const QDBusConnection& connection) override {
    if (message.member() == "Silent") {
      message.setDelayedReply(true);
    } else if (message.member() == "Refuse") {
      connection.send(message.createErrorReply("org.example.Refused", "no"));
    } else if (message.member() == "Many") {
      connection.send(message.createReply(QVariant(QByteArray(ModemService::kMaximumValues, 'x'))));
    } else if (message.member() == "Types") {
      connection.send(message.createReply(types()));
    } else {
      connection.send(message.createReply(message.arguments()));
    }
    return true;
  }

 private:
  static QList<QVariant> types() {
    const QVariantMap map{{"rate", QVariant(7U)}, {"list", QVariant(QStringList{"a", "b"})}};
    return {QVariant(-2),  QVariant(2U),   QVariant(qulonglong{1} << 63),   QVariant(1.5),
            QVariant("x"), QVariant(true), QVariant(QByteArray("\xff", 1)), QVariant(map)};
  }
};

/// The name's owner, on a connection of its own.
class Service {
 public:
  explicit Service(const std::string& address)
      : _connection(QDBusConnection::connectToBus(QString::fromStdString(address), "stand-in")) {
    _connection.registerVirtualObject("/", &_object, QDBusConnection::SubPath);
    _connection.registerService(kName);
  }
  ~Service() { QDBusConnection::disconnectFromBus("stand-in"); }
  Service(const Service&) = delete;
  Service& operator=(const Service&) = delete;

  void change(const QString& name, const QVariant& value) {
    auto signal = QDBusMessage::createSignal("/modem", kProperties, "PropertiesChanged");
    signal << QString("interface") << QVariantMap{{name, value}} << QStringList();
    _connection.send(signal);
  }

 private:
  QDBusConnection _connection;
  StandIn _object;
};

class ModemServiceTest : public ::testing::Test {
 protected:
  void SetUp() override { ASSERT_TRUE(bus.isRunning()); }

  void connect() {
    connection = platform->modemService().connect(
        {.stateChanged =
             [this](State state, std::string_view why) {
               states.push_back(state);
               reason = why;
             },
         .signalled = [this](const BusSignal& signal) { received.push_back(signal); }});
  }

  /// Serves the queue until that holds; false when it takes too long.
  bool runUntil(const std::function<bool()>& condition) {
    for (int i = 0; i < 1000 && !condition(); ++i) runFor(milliseconds(10));
    return condition();
  }
  void runFor(milliseconds time) {
    platform->mainQueue().postAfter(time, [this] { platform->quit(0); });
    platform->run();
  }
  [[nodiscard]] bool isIn(State state) const { return !states.empty() && states.back() == state; }

  /// What a method answers.
  BusReply ask(const std::string& method, std::vector<BusValue> arguments = {},
               milliseconds deadline = milliseconds(5'000)) {
    std::optional<BusReply> answer;
    connection->call({"/", "some.interface", method, std::move(arguments)}, deadline,
                     [&](const BusReply& reply) { answer = reply; });
    EXPECT_FALSE(answer) << "not within the call";
    EXPECT_TRUE(runUntil([&] { return answer.has_value(); }));
    return answer.value_or(tl::unexpected(BusError{"", "the test waited in vain"}));
  }

  TemporaryDirectory directory;
  std::unique_ptr<LinuxPlatform> platform = createLinuxPlatform(
      {.logThreshold = std::nullopt, .portDirectory = directory.path().string()});
  PrivateBus bus;
  std::vector<State> states;
  std::string reason;
  std::vector<BusSignal> received;
  std::unique_ptr<ModemServiceConnection> connection;
};

TEST_F(ModemServiceTest, IsAbsentUntilSomebodyOwnsItsName) {
  connect();
  EXPECT_TRUE(runUntil([&] { return isIn(State::Absent); }));
  const Service service(bus.address());
  EXPECT_TRUE(runUntil([&] { return isIn(State::Present); }));
}

TEST_F(ModemServiceTest, AnotherOwnerIsTold) {
  auto service = std::make_unique<Service>(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  service.reset();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Absent); }));
  service = std::make_unique<Service>(bus.address());
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  EXPECT_THAT(states, ElementsAre(State::Present, State::Absent, State::Present));
  EXPECT_TRUE(ask("Echo"));
}

TEST_F(ModemServiceTest, ABusThatCannotBeReachedIsNamed) {
  const ScopedEnvironment elsewhere("DBUS_SYSTEM_BUS_ADDRESS", "unix:path=/nowhere/bus");
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::NoBus); }));
  EXPECT_THAT(reason, ::testing::HasSubstr("/nowhere/bus"));
}

TEST_F(ModemServiceTest, ABusThatEndsIsNoticedAndTheNextOneFound) {
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Absent); }));
  bus.stop();
  EXPECT_TRUE(runUntil([&] { return isIn(State::NoBus); }));
  const PrivateBus next;
  EXPECT_TRUE(runUntil([&] { return isIn(State::Absent); }));
}

TEST_F(ModemServiceTest, ValuesKeepTheirTypes) {
  const Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  const auto reply = ask("Types");
  ASSERT_TRUE(reply);
  EXPECT_THAT(
      *reply,
      ElementsAre(
          busInteger(-2), busUnsigned(2), busLong(std::uint64_t{1} << 63), busReal(1.5),
          busText("x"), busFlag(true), busList("ay", {{"y", std::uint64_t{255}}}),
          busEntries("a{sv}", {{busText("list"), busList("as", {busText("a"), busText("b")})},
                               {busText("rate"), busUnsigned(7)}})));
}

TEST_F(ModemServiceTest, ArgumentsKeepTheirTypes) {
  const Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  const std::vector<BusValue> arguments = {busUnsigned(1), busText("s"),  busFlag(false),
                                           busPath("/a"),  busReal(-0.5), busInteger(-1)};
  EXPECT_EQ(ask("Echo", arguments), BusReply(arguments));
}

TEST_F(ModemServiceTest, ARefusalHasItsName) {
  const Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  const auto reply = ask("Refuse");
  ASSERT_FALSE(reply);
  EXPECT_EQ(reply.error().name, "org.example.Refused");
  EXPECT_EQ(reply.error().message, "no");
}

TEST_F(ModemServiceTest, WithoutAnAnswerACallEndsAtItsDeadline) {
  const Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  const auto reply = ask("Silent", {}, milliseconds(100));
  ASSERT_FALSE(reply);
  EXPECT_EQ(reply.error().name, kBusErrorNoReply);
}

TEST_F(ModemServiceTest, AnAnswerOfTooManyValuesIsAnError) {
  const Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  const auto reply = ask("Many");
  ASSERT_FALSE(reply);
  EXPECT_EQ(reply.error().name, kBusErrorLimits);
}

TEST_F(ModemServiceTest, WithoutAServiceACallFails) {
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Absent); }));
  const auto reply = ask("Echo");
  ASSERT_FALSE(reply);
  EXPECT_EQ(reply.error().name, kBusErrorDisconnected);
}

TEST_F(ModemServiceTest, ChangesComeInTheirOrder) {
  Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  ASSERT_TRUE(ask("Echo"));  // the bus has the wish for signals by now
  service.change("State", 8);
  service.change("State", 9);
  ASSERT_TRUE(runUntil([&] { return received.size() == 2; }));
  EXPECT_EQ(received[0].path, "/modem");
  EXPECT_EQ(received[0].interface, kProperties);
  EXPECT_EQ(received[0].member, "PropertiesChanged");
  EXPECT_EQ(received[1].arguments[1], busEntries("a{sv}", {{busText("State"), busInteger(9)}}));
}

TEST_F(ModemServiceTest, SignalsOfOthersAreNotItsOwn) {
  const Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  ASSERT_TRUE(ask("Echo"));
  auto other = QDBusConnection::connectToBus(QString::fromStdString(bus.address()), "other");
  auto signal = QDBusMessage::createSignal("/modem", kProperties, "PropertiesChanged");
  signal << QString("interface") << QVariantMap{{"State", 1}} << QStringList();
  other.send(signal);
  auto owner = QDBusMessage::createSignal("/org/freedesktop/DBus", "org.freedesktop.DBus",
                                          "NameOwnerChanged");
  owner << QString(kName) << QString(":1.1") << QString();
  other.send(owner);
  runFor(milliseconds(200));
  QDBusConnection::disconnectFromBus("other");
  EXPECT_THAT(received, IsEmpty());
  EXPECT_THAT(states, ElementsAre(State::Present));
}

TEST_F(ModemServiceTest, NothingRunsAfterTheConnectionsEnd) {
  const Service service(bus.address());
  connect();
  ASSERT_TRUE(runUntil([&] { return isIn(State::Present); }));
  bool isAnswered = false;
  connection->call({"/", "some.interface", "Echo"}, milliseconds(1'000),
                   [&](const BusReply&) { isAnswered = true; });
  connection.reset();
  runFor(milliseconds(200));
  EXPECT_FALSE(isAnswered);
}

}  // namespace
}  // namespace kestro
