// SPDX-License-Identifier: MIT
// The window on the virtual platform, beside a log channel that answers as told.
#pragma once

#include <QTest>
#include <string>
#include <string_view>
#include <vector>

#include "App/KestroApp.h"
#include "Tests/App/Screen.h"
#include "Tests/Support/ModelFixture.h"

namespace kestro::testing {

class AppFixture : public ModelFixture {
 public:
  ~AppFixture() override { app().applicationWillTerminate(); }

 protected:
  AppFixture() {
    platform.clock().setNow(Moment(1'330'866'000s));  // 2012-03-04 13:00:00 UTC
  }

  static KestroApp& app() { return *static_cast<KestroApp*>(QCoreApplication::instance()); }

  void offerSaving() { platform.deviceRoot().files()[std::string(kSaveButtonPath)] = {}; }

  /// Launches in a window of a phone's size; nothing is connected yet.
  void launch(LaunchOptions options = {.windowSize = QSize(390, 780)}) {
    app().applicationDidFinishLaunching(platform, options);
  }
  /// Lets the first frame's time pass, after which the monitor is started.
  void connectMonitor() { queue().advance(kFirstFramePatience); }
  void launchConnected() {
    launch();
    connectMonitor();
  }

  /// Lets a message arrive and the display be refreshed.
  void show(const Dictionary& message) {
    sendLog(message);
    queue().advance(2s);
  }

  static NavigationController& stack() { return *app().navController(); }
  static KestroPaneController& top() {
    return static_cast<KestroPaneController&>(stack().topViewController());
  }
  static TableView& table() { return top().tableView(); }
  static std::size_t depth() { return stack().viewControllers().size(); }

  /// Opens a row of the top pane, and waits until it has slid in.
  static void open(int row) {
    table().setFocusedRow(row);
    QTest::keyClick(&table(), Qt::Key_Return);
    settle();
  }
  /// Waits until nothing slides.
  static void settle() {
    ASSERT_TRUE(QTest::qWaitFor([] { return !stack().isMoving(); }));
  }

  static std::vector<std::string> rows() { return kestro::testing::rowsOf(table()); }
  /// The rows of the pane with this place on the stack.
  static std::vector<std::string> rowsOf(std::size_t index) {
    const auto& pane = static_cast<KestroPaneController&>(*stack().viewControllers()[index]);
    return kestro::testing::rowsOf(pane.tableView());
  }
  static std::string status() { return statusOf(stack().toolbar()); }
  static bool isLoading() { return isLoadingShown(stack().toolbar()); }
  static std::string title() { return stack().navigationBar().title().toStdString(); }
};

}  // namespace kestro::testing
