// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <QApplication>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusVirtualObject>
#include <QTest>

#include "App/Toolkit/SystemColours.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro {
namespace {

constexpr const char* kPath = "/org/freedesktop/portal/desktop";
constexpr const char* kInterface = "org.freedesktop.portal.Settings";
constexpr uint kDark = 1;
constexpr uint kLight = 2;

/// Answers what colours the desktop prefers.
class Portal : public QDBusVirtualObject {
 public:
  [[nodiscard]] QString introspect(const QString&) const override { return {}; }
  bool handleMessage(const QDBusMessage& message, const QDBusConnection& bus) override {
    if (message.member() != QLatin1String("Read")) return false;
    const QVariant inner = QVariant::fromValue(QDBusVariant(scheme));
    return bus.send(message.createReply(QVariant::fromValue(QDBusVariant(inner))));
  }

  uint scheme = kLight;
};

/// A session bus of the test's own, with a portal on it.
class SystemColoursTest : public ::testing::Test {
 public:
  ~SystemColoursTest() override {
    QDBusConnection::disconnectFromBus("portal");
    qunsetenv("DBUS_SESSION_BUS_ADDRESS");
    QApplication::setPalette(before);
  }

 protected:
  SystemColoursTest() {
    EXPECT_TRUE(testing::eventually([this] { return connect(); }));
    qputenv("DBUS_SESSION_BUS_ADDRESS", QByteArray::fromStdString(address));
    EXPECT_TRUE(bus.registerService("org.freedesktop.portal.Desktop"));
    EXPECT_TRUE(bus.registerVirtualObject(kPath, &portal));
  }

  /// The daemon takes its time, and its socket is there before it listens.
  bool connect() {
    QDBusConnection::disconnectFromBus("portal");
    bus = QDBusConnection::connectToBus(QString::fromStdString(address), "portal");
    return bus.isConnected();
  }
  void change(const char* group, const char* key, uint scheme) {
    QDBusMessage signal = QDBusMessage::createSignal(kPath, kInterface, "SettingChanged");
    signal << QString(group) << QString(key) << QVariant::fromValue(QDBusVariant(scheme));
    EXPECT_TRUE(bus.send(signal));
  }
  static bool isDark() {
    return QApplication::palette().color(QPalette::Base) == darkPalette().color(QPalette::Base);
  }

  testing::TemporaryFile socket{"bus"};
  std::string address = "unix:path=" + socket.path();
  testing::Process daemon{
      {"/usr/bin/dbus-daemon", "--session", "--nofork", "--address=" + address}};
  QDBusConnection bus{""};
  Portal portal;
  QPalette before = QApplication::palette();
};

TEST_F(SystemColoursTest, ADesktopThatPrefersDarkGetsIt) {
  portal.scheme = kDark;
  const SystemColours colours;
  EXPECT_TRUE(QTest::qWaitFor(isDark));
}

TEST_F(SystemColoursTest, ItFollowsTheDesktop) {
  portal.scheme = kDark;
  const SystemColours colours;
  ASSERT_TRUE(QTest::qWaitFor(isDark));
  change("org.freedesktop.appearance", "color-scheme", kLight);
  EXPECT_TRUE(QTest::qWaitFor([] { return !isDark(); }));
  EXPECT_EQ(QApplication::palette(), before);
  change("org.freedesktop.appearance", "color-scheme", kDark);
  EXPECT_TRUE(QTest::qWaitFor(isDark));
}

TEST_F(SystemColoursTest, OtherSettingsAreNotItsOwn) {
  portal.scheme = kDark;
  const SystemColours colours;
  ASSERT_TRUE(QTest::qWaitFor(isDark));
  change("org.freedesktop.appearance", "accent-color", kLight);
  change("org.example", "color-scheme", kLight);
  QTest::qWait(100);
  EXPECT_TRUE(isDark());
}

TEST_F(SystemColoursTest, WithoutABusNothingHappens) {
  qunsetenv("DBUS_SESSION_BUS_ADDRESS");
  qunsetenv("XDG_RUNTIME_DIR");
  portal.scheme = kDark;
  const SystemColours colours;
  QTest::qWait(100);
  EXPECT_FALSE(isDark());
}

}  // namespace
}  // namespace kestro
