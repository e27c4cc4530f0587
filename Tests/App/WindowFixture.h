// SPDX-License-Identifier: MIT
// The real window of this process beside the real telephony server, which plays what it is fed.
#pragma once

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <QTest>
#include <chrono>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "App/KestroApp.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/MessagePort.h"
#include "Platform/TelephonyProtocol.h"
#include "Tests/App/Screen.h"
#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {

class WindowTest : public ::testing::Test {
 public:
  ~WindowTest() override {
    app().applicationWillTerminate();
    ::close(feed);
  }

 protected:
  WindowTest() {
    ::setenv("KESTRO_DEVICE_ROOT", deviceRoot().c_str(), 1);
    ::setenv("XDG_CONFIG_HOME", (pipe.directory() + "/config").c_str(), 1);
    ::unsetenv("DBUS_SESSION_BUS_ADDRESS");
    ::unsetenv("XDG_RUNTIME_DIR");
    std::filesystem::create_directories(saveFolder());
    std::filesystem::create_directories(
        deviceRoot() + "/NorrowInternal/Library/PreferenceBundles/Carrier Settings.bundle");
    EXPECT_EQ(::mkfifo(pipe.path().c_str(), 0600), 0);
    feed = ::open(pipe.path().c_str(), O_RDWR | O_CLOEXEC);
    EXPECT_GE(feed, 0);
  }

  static KestroApp& app() { return *static_cast<KestroApp*>(QCoreApplication::instance()); }

  [[nodiscard]] std::string deviceRoot() const { return pipe.directory() + "/device"; }
  [[nodiscard]] std::string saveFolder() const {
    return deviceRoot() + "/var/mobile/Library/Logs/CrashReporter";
  }
  [[nodiscard]] std::string ports() const { return pipe.directory() + "/ports"; }

  void startServer(const std::vector<std::string>& source) {
    std::vector<std::string> arguments{"kestro-telephonyd"};
    arguments.insert(arguments.end(), source.begin(), source.end());
    server = std::make_unique<Process>(
        arguments, Process::Options{.environment = {{"KESTRO_PORT_DIR", ports()}},
                                    .terminal = Process::Terminal::None});
    ASSERT_TRUE(kestro::testing::eventually(
        [&] { return std::filesystem::exists(ports() + "/TelephonyServer"); }));
  }
  /// Starts the server with what `send` feeds it.
  void startServer() { startServer({"--source=stream:" + pipe.path(), "--technology=IFX"}); }

  void launch() {
    LinuxPlatformOptions options;
    options.logThreshold = std::nullopt;
    options.portDirectory = ports();
    platform = createLinuxPlatform(options);
    app().applicationDidFinishLaunching(*platform, {.windowSize = QSize(390, 780)});
  }
  void launchConnected() {
    startServer();
    launch();
    waitForConnection();
  }
  /// Waits until the window is connected and the server has seen all that it sent, the start
  /// command with it.
  void waitForConnection() {
    ASSERT_TRUE(waitFor([] { return !isLoadingShown(stack().toolbar()); }));
    constexpr std::chrono::seconds kReplyTimeout{10};
    const auto port = platform->messagePorts().createRemotePort("TelephonyServer");
    ASSERT_TRUE(port);
    // The first answer may overtake the start command, when both wait to be read; the second not.
    for (int i = 0; i < 2; ++i) {
      const auto reply = port->request(messageId(TelephonyMessage::CreateLogChannel), {},
                                       kReplyTimeout, kReplyTimeout);
      ASSERT_EQ(reply.error, SendError::None);
    }
  }

  /// Feeds the server one message: a property list's entries as XML.
  void send(const std::string& entries) const {
    const std::string text = "<plist version=\"1.0\"><dict>" + entries + "</dict></plist>";
    std::string frame;
    for (int shift = 0; shift < 32; shift += 8) {
      frame += static_cast<char>((text.size() >> shift) & 0xFF);
    }
    frame += text;
    EXPECT_EQ(::write(feed, frame.data(), frame.size()), static_cast<ssize_t>(frame.size()));
  }

  /// Serves the window until the condition holds.
  static bool waitFor(const std::function<bool()>& condition) {
    return QTest::qWaitFor(condition, 30'000);
  }
  static bool waitForRows(const std::vector<std::string>& expected) {
    return waitFor([&] { return rows() == expected && !stack().isMoving(); });
  }

  static NavigationController& stack() { return *app().navController(); }
  static KestroPaneController& top() {
    return static_cast<KestroPaneController&>(stack().topViewController());
  }
  static std::vector<std::string> rows() { return rowsOf(top().tableView()); }
  static std::string status() { return statusOf(stack().toolbar()); }
  static std::string title() { return stack().navigationBar().title().toStdString(); }
  static void click(QWidget* widget) { QTest::mouseClick(widget, Qt::LeftButton); }
  static void key(Qt::Key key, Qt::KeyboardModifiers modifiers = {}) {
    QTest::keyClick(app().window()->focusWidget(), key, modifiers);
  }
  /// Taps a row of the top pane, and waits until its pane is there.
  static void tap(int row) {
    const std::size_t depth = stack().viewControllers().size();
    TableView& table = top().tableView();
    const QPoint place = table.cellAtRow(row)->geometry().center();
    QTest::mouseClick(table.viewport(), Qt::LeftButton, {}, place);
    ASSERT_TRUE(waitFor(
        [&] { return stack().viewControllers().size() == depth + 1 && !stack().isMoving(); }));
  }

  /// The snapshots in the folder that they are saved to.
  [[nodiscard]] std::vector<std::filesystem::path> snapshots() const {
    std::vector<std::filesystem::path> result;
    for (const auto& entry : std::filesystem::directory_iterator(saveFolder())) {
      if (entry.is_regular_file()) result.push_back(entry.path());
    }
    return result;
  }

  TemporaryFile pipe{"messages"};
  int feed = -1;
  std::unique_ptr<Process> server;
  std::unique_ptr<LinuxPlatform> platform;
};

}  // namespace kestro::testing
