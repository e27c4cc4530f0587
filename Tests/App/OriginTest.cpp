// SPDX-License-Identifier: MIT
// Where the display comes from, what is wrong with that, and what has just been done: the title of
// the window, and the lines above the panes.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QAccessible>
#include <QAccessibleActionInterface>
#include <QClipboard>

#include "App/Toolkit/BarButton.h"
#include "Tests/App/AppFixture.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::HasSubstr;
using ::testing::StartsWith;

class OriginTest : public testing::AppFixture {
 protected:
  static NoticeBar& bar() { return app().window()->noticeBar(); }
  static std::string origin() { return bar().origin().toStdString(); }
  static std::string notice() { return bar().notice().toStdString(); }
  static std::string message() { return bar().message().toStdString(); }
  static std::string windowTitle() { return app().window()->windowTitle().toStdString(); }
  static KestroCell& cell(int row) { return static_cast<KestroCell&>(*table().cellAtRow(row)); }

  const Dictionary section{{"k", "1"}, {"l", "2"}};

  /// Keys and focus are the active window's.
  static void activate() {
    app().window()->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(app().window()));
  }
  void launchWith(const LogSourceState& source) {
    channelReply.source = source;
    launchConnected();
  }
};

TEST_F(OriginTest, BeforeTheFirstConnectionNothingIsSaid) {
  launch();
  EXPECT_EQ(windowTitle(), "Kestro");
  EXPECT_EQ(origin(), "");
  EXPECT_EQ(notice(), "");
  EXPECT_EQ(stack().geometry(), app().window()->rect());
}

TEST_F(OriginTest, TitleAndLineSayWhereTheDisplayComesFrom) {
  launchWith({.kind = "simulation", .isSimulated = true});
  EXPECT_EQ(origin(), "IFX · simulation · TelephonyServer");
  EXPECT_EQ(windowTitle(), "IFX · simulation · TelephonyServer · Kestro");
  EXPECT_EQ(title(), "Kestro");  // the pane's
  EXPECT_EQ(stack().y(), bar().height());
  EXPECT_GT(bar().height(), 0);
}

TEST_F(OriginTest, ADemoIsCalledSo) {
  channelReply.source = {.kind = "capture", .name = "/a/b.pcap"};
  launch({.windowSize = QSize(390, 780), .isDemo = true});
  connectMonitor();
  EXPECT_EQ(origin(), "IFX · capture b.pcap · demo");
}

TEST_F(OriginTest, WithoutAServerItSaysWhatHelps) {
  platform.telephonyService().setReachable(false);
  launch({.windowSize = QSize(390, 780), .serverName = "Other"});
  EXPECT_EQ(notice(), "");
  connectMonitor();
  EXPECT_EQ(
      notice(),
      "No telephony server \"Other\" is running: start kestro-telephonyd --name=Other, or use "
      "--demo");
  EXPECT_EQ(status(), "Connecting");
  EXPECT_GT(bar().height(), 2 * QFontMetrics(bar().font()).height());  // wrapped
  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  EXPECT_EQ(notice(), "");
}

TEST_F(OriginTest, ABadPortDirectoryIsNamed) {
  platform.telephonyService().setReachable(false);
  platform.messagePorts().setProblem("port directory /x: its mode is 0755");
  launchConnected();
  EXPECT_EQ(notice(), "Port directory /x: its mode is 0755");
}

TEST_F(OriginTest, AfterTheSourcesEndValuesAreFaintAndTheStatusStays) {
  launchWith({.kind = "capture", .name = "a.pcap"});
  show(Dictionary{{"k", "1"}});
  EXPECT_TRUE(cell(0).isRenewed());
  const std::string before = status();
  LogSourceState ended = channelReply.source;
  ended.hasEnded = true;
  platform.telephonyService().notifySource(ended);
  EXPECT_EQ(notice(), "The recording has ended");
  EXPECT_FALSE(cell(0).isRenewed());
  EXPECT_EQ(status(), before);
}

TEST_F(OriginTest, ValuesOfALostConnectionAreFaintUntilItIsBack) {
  launchWith({});
  show(Dictionary{{"k", "1"}});
  loseServer();
  queue().advance(2s);
  EXPECT_FALSE(cell(0).isRenewed());
  EXPECT_THAT(notice(), StartsWith("No telephony server"));
  bringServerBack();
  queue().advance(5s);
  EXPECT_TRUE(cell(0).isRenewed());
}

TEST_F(OriginTest, SavingSaysWhereTheFileIs) {
  offerSaving();
  launchWith({});
  show(Dictionary{{"k", "1"}});
  app().showSaveView();
  app().saveViewController()->savePressed();
  EXPECT_EQ(message(),
            "Saved as /device/var/mobile/Library/Logs/CrashReporter/KestroSnapshot-1330866003"
            ".kestro");
  EXPECT_EQ(bar().button().text().toStdString(), "Open Folder");
  EXPECT_TRUE(bar().button().isVisible());
}

TEST_F(OriginTest, AFailedSaveSaysNothingOfAFile) {
  offerSaving();
  launchWith({});
  platform.deviceRoot().setWriteFailure("full");
  app().showSaveView();
  app().saveViewController()->savePressed();
  EXPECT_EQ(message(), "");
}

TEST_F(OriginTest, AClickedRowIsSelectedAndCopyingSaysSo) {
  launchWith({});
  activate();
  show(Dictionary{{"k", "1"}, {"l", "2"}});
  QTest::mouseClick(table().viewport(), Qt::LeftButton, {}, cell(1).geometry().center());
  EXPECT_TRUE(cell(1).isFocusShown());
  EXPECT_FALSE(cell(0).isFocusShown());
  QTest::keyClick(&table(), Qt::Key_C, Qt::ControlModifier);
  EXPECT_EQ(QGuiApplication::clipboard()->text().toStdString(), "l\t2");
  EXPECT_EQ(message(), "Copied: l 2");
}

TEST_F(OriginTest, EnterOpensTheFirstRow) {
  launchWith({});
  show(Dictionary{{"A", section}, {"B", section}});
  QTest::keyClick(&table(), Qt::Key_Return);
  settle();
  EXPECT_EQ(title(), "A");
}

TEST_F(OriginTest, ScreenReadersAreToldThatRowsCanBeSelectedAndOpened) {
  launchWith({});
  show(Dictionary{{"A", section}, {"B", section}});
  QAccessibleInterface* row = QAccessible::queryAccessibleInterface(&cell(0));
  ASSERT_NE(row, nullptr);
  EXPECT_TRUE(row->state().selectable);
  EXPECT_TRUE(row->state().focusable);
  EXPECT_FALSE(row->state().selected);
  ASSERT_NE(row->actionInterface(), nullptr);
  EXPECT_EQ(row->actionInterface()->actionNames(),
            QStringList{QAccessibleActionInterface::pressAction()});
  row->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
  settle();
  EXPECT_EQ(title(), "A");
}

TEST_F(OriginTest, F11GivesTheWholeScreenAndTakesItBack) {
  launchWith({});
  activate();
  QTest::keyClick(app().window(), Qt::Key_F11);
  EXPECT_TRUE(app().window()->isFullScreen());
  QTest::keyClick(app().window(), Qt::Key_F11);
  EXPECT_FALSE(app().window()->isFullScreen());
}

class ClosingKeysTest : public OriginTest, public ::testing::WithParamInterface<Qt::Key> {};

TEST_P(ClosingKeysTest, CloseTheWindow) {
  launchWith({});
  activate();
  app().setQuitOnLastWindowClosed(false);
  QTest::keyClick(app().window(), GetParam(), Qt::ControlModifier);
  EXPECT_FALSE(app().window()->isVisible());
  app().setQuitOnLastWindowClosed(true);
}

INSTANTIATE_TEST_SUITE_P(Keys, ClosingKeysTest, ::testing::Values(Qt::Key_Q, Qt::Key_W));

TEST_F(OriginTest, AStyleThatIsChosenHoldsUntilTheEnd) {
  const QPalette usual = QApplication::palette();
  for (const auto& [style, palette] : {std::pair(ColourStyle::Dark, darkPalette()),
                                       std::pair(ColourStyle::Light, lightPalette())}) {
    launch({.windowSize = QSize(390, 780), .style = style});
    EXPECT_EQ(QApplication::palette().color(QPalette::Base), palette.color(QPalette::Base));
    app().applicationWillTerminate();
    EXPECT_EQ(QApplication::palette().color(QPalette::Base), usual.color(QPalette::Base));
  }
}

}  // namespace
}  // namespace kestro
