// SPDX-License-Identifier: MIT
// The window as its user sees it, with a server that can fail.
#include <gmock/gmock.h>

#include <algorithm>
#include <chrono>
#include <csignal>

#include "Tests/App/WindowFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;

/// Two sections; the second is a list of one cell.
std::string display(const std::string& level) {
  return "<key>Serving</key><dict><key>RSCP</key><string>" + level +
         "</string><key>Band</key><string>1</string></dict>"
         "<key>Cells</key><array><string>header</string><dict><key>ARFCN</key><string>62</string>"
         "<key>RxLev</key><string>" +
         level + "</string></dict></array>";
}

TEST_F(WindowTest, BrowsesThreeLevelsDownAndBackAgain) {
  launchConnected();
  send(display("-70"));
  ASSERT_TRUE(waitForRows({"Serving >", "Cells >"}));
  EXPECT_THAT(status(), HasSubstr("Updated "));
  tap(1);
  EXPECT_THAT(rows(), ElementsAre("0 >"));
  tap(0);
  EXPECT_THAT(rows(), ElementsAre("ARFCN = 62", "RxLev = -70"));
  send(display("-71"));
  ASSERT_TRUE(waitForRows({"ARFCN = 62", "RxLev = -71"}));
  key(Qt::Key_Backspace);
  ASSERT_TRUE(waitForRows({"0 >"}));
  click(&stack().navigationBar().backButton());
  ASSERT_TRUE(waitForRows({"Serving >", "Cells >"}));
}

TEST_F(WindowTest, ASectionThatVanishesPopsItsPanes) {
  launchConnected();
  send(display("-70"));
  ASSERT_TRUE(waitForRows({"Serving >", "Cells >"}));
  tap(1);
  tap(0);
  send(
      "<key>Serving</key><dict><key>RSCP</key><string>-72</string>"
      "<key>Band</key><string>1</string></dict>");
  ASSERT_TRUE(waitFor([] { return stack().viewControllers().size() == 1 && !stack().isMoving(); }));
  EXPECT_THAT(rows(), ElementsAre("Serving >"));
  EXPECT_EQ(title(), "Kestro");
}

TEST_F(WindowTest, AKilledServerShowsAndIsConnectedToAgain) {
  launchConnected();
  send(display("-70"));
  ASSERT_TRUE(waitForRows({"Serving >", "Cells >"}));
  tap(0);
  server->signal(SIGKILL);
  server->wait();
  ASSERT_TRUE(waitFor([] { return status() == "Connecting..."; }));
  EXPECT_THAT(rows(), ElementsAre("RSCP = -70", "Band = 1"));
  std::filesystem::remove(ports() + "/TelephonyServer");
  startServer();
  waitForConnection();
  send(display("-73"));
  ASSERT_TRUE(waitForRows({"RSCP = -73", "Band = 1"}));
}

TEST_F(WindowTest, WithoutAServerItGoesOnConnecting) {
  launch();
  ASSERT_TRUE(waitFor([] { return app().window()->isVisible(); }));
  QTest::qWait(200);
  EXPECT_EQ(status(), "Connecting");
  EXPECT_EQ(title(), "Kestro");
}

/// What a reader of property lists in another language finds in a file.
std::string readByPython(const std::string& path) {
  const std::string script =
      "import plistlib, sys\n"
      "snapshot = plistlib.load(open(sys.argv[1], 'rb'))\n"
      "print(list(snapshot))\n"
      "print(snapshot['Description'])\n"
      "print([list(entry) for entry in snapshot['Data']])\n"
      "print(snapshot['Data'][-1]['Display']['Serving']['RSCP'])\n";
  Process python({"/usr/bin/python3", "-c", script, path});
  python.wait();
  return python.output() + python.errors();
}

TEST_F(WindowTest, ASnapshotIsReadByAnotherReader) {
  launchConnected();
  send(display("-70"));
  ASSERT_TRUE(waitForRows({"Serving >", "Cells >"}));
  key(Qt::Key_S, Qt::ControlModifier);
  ASSERT_NE(app().saveViewController(), nullptr);
  QTest::keyClicks(&app().saveViewController()->saveDescription(), "in the tunnel");
  key(Qt::Key_S, Qt::ControlModifier);
  ASSERT_TRUE(waitFor([] { return app().saveViewController() == nullptr; }));
  ASSERT_THAT(snapshots(), SizeIs(1));
  EXPECT_EQ(readByPython(snapshots()[0]),
            "['Timestamp', 'Data', 'Description']\n"
            "in the tunnel\n"
            "[['DisplayState', 'Display', 'ExtraInfo', 'Date', 'Description']]\n"
            "-70\n");
}

TEST_F(WindowTest, CancellingSavesNothing) {
  launchConnected();
  click(stack().toolbar().widgetOfItem(3));
  ASSERT_NE(app().saveViewController(), nullptr);
  key(Qt::Key_Escape);
  ASSERT_TRUE(waitFor([] { return app().saveViewController() == nullptr; }));
  EXPECT_THAT(snapshots(), IsEmpty());
}

/// Saves, and waits for the alert that nothing but the failure is behind.
void saveAndExpectTheAlert(KestroApp& app) {
  app.showSaveView();
  app.saveViewController()->savePressed();
  ASSERT_TRUE(QTest::qWaitFor([&] { return app.saveViewController() == nullptr; }));
  ASSERT_NE(app.alert(), nullptr);
  EXPECT_EQ(app.alert()->title(), "File Error");
  QTest::mouseClick(&app.alert()->button(), Qt::LeftButton);
  EXPECT_TRUE(QTest::qWaitFor([&] { return app.alert() == nullptr; }));
}

TEST_F(WindowTest, AMissingDirectoryIsToldAndNotMade) {
  std::filesystem::remove(saveFolder());
  launchConnected();
  saveAndExpectTheAlert(app());
  EXPECT_FALSE(std::filesystem::exists(saveFolder()));
}

TEST_F(WindowTest, AFullDiskIsTold) {
  // Whatever second it is saved in, the file is a device that is always full.
  const auto now = std::chrono::system_clock::to_time_t(std::chrono::system_clock::now());
  for (std::time_t second = now; second < now + 60; ++second) {
    std::filesystem::create_symlink(
        "/dev/full", saveFolder() + "/KestroSnapshot-" + std::to_string(second) + ".kestro");
  }
  launchConnected();
  saveAndExpectTheAlert(app());
}

}  // namespace
}  // namespace kestro::testing
