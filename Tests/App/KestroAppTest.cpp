// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>

#include <QTimer>

#include "App/KestroApp.h"
#include "Tests/App/AppFixture.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// Two sections, so that neither collapses; rows of sections too.
Dictionary display(const char* rscp) {
  return {{"Serving", Dictionary{{"RSCP", rscp}, {"Band", "1"}}},
          {"Cells", Array{"header", Dictionary{{"ARFCN", "62"}, {"RxLev", rscp}}}}};
}

class KestroAppTest : public testing::AppFixture {};

// --- Launch --------------------------------------------------------------------------------------

TEST_F(KestroAppTest, TheRootPaneIsShownBeforeAnythingIsConnected) {
  launch();
  EXPECT_TRUE(app().window()->isVisible());
  EXPECT_EQ(title(), "Kestro");
  EXPECT_EQ(status(), "Connecting");
  EXPECT_TRUE(isLoading());
  EXPECT_THAT(rows(), IsEmpty());
  EXPECT_EQ(app().updateMessage(), "Connecting...");
  EXPECT_THAT(channelRequests, IsEmpty());
}

TEST_F(KestroAppTest, ConnectingBeginsOnceTheFirstFrameIsShown) {
  launch();
  ASSERT_TRUE(QTest::qWaitForWindowExposed(app().window()));
  app().window()->repaint();
  EXPECT_THAT(channelRequests, IsEmpty());
  queue().runReady();
  EXPECT_EQ(channelRequests.size(), 1);
  queue().advance(kFirstFramePatience);
  EXPECT_EQ(channelRequests.size(), 1);
}

TEST_F(KestroAppTest, ConnectingIsLeftToOthersWhenAskedFor) {
  launch({.windowSize = QSize(390, 780), .connectsAtLaunch = false});
  queue().advance(10s);
  EXPECT_THAT(channelRequests, IsEmpty());
  app().restartMonitor();
  queue().runReady();
  EXPECT_EQ(channelRequests.size(), 1);
}

TEST_F(KestroAppTest, TheWindowHasTheSizeThatIsAskedFor) {
  launch({.windowSize = QSize(500, 600)});
  EXPECT_EQ(app().window()->size(), QSize(500, 600));
}

TEST_F(KestroAppTest, TheWindowCoversTheMainScreenOtherwise) {
  launch(LaunchOptions());
  EXPECT_EQ(app().window()->size(), QGuiApplication::primaryScreen()->availableSize());
  EXPECT_TRUE(app().window()->isMaximized());
}

// --- Preferences ---------------------------------------------------------------------------------

TEST_F(KestroAppTest, TheShellShowsNumbersFromLaunchToExit) {
  launch();
  const auto& events = platform.preferences().events();
  EXPECT_THAT(events,
              ElementsAre("set org.lumo.Shell LumoShowGSMRSSI true", "synchronize org.lumo.Shell",
                          "notify org.lumo.Shell LumoShowGSMRSSI"));
  app().applicationWillTerminate();
  ASSERT_EQ(events.size(), 6);
  EXPECT_EQ(events[3], "set org.lumo.Shell LumoShowGSMRSSI false");
  EXPECT_EQ(events[4], "synchronize org.lumo.Shell");
  EXPECT_EQ(events[5], "notify org.lumo.Shell LumoShowGSMRSSI");
}

TEST_F(KestroAppTest, AShellThatShowsNumbersAnywayIsLeftAlone) {
  platform.preferences().setBoolean("org.kestro.Kestro", "LumoShowGSMRSSI", true);
  launch();
  app().applicationWillTerminate();
  EXPECT_THAT(platform.preferences().events(),
              ElementsAre("set org.kestro.Kestro LumoShowGSMRSSI true"));
}

TEST_F(KestroAppTest, TheShellsOwnPreferenceIsNotAsked) {
  platform.preferences().setBoolean("org.lumo.Shell", "LumoShowGSMRSSI", true);
  launch();
  EXPECT_EQ(platform.preferences().events().size(), 1 + 3);
}

TEST_F(KestroAppTest, SavingIsOfferedWhereTheDeviceHasThePath) {
  offerSaving();
  launch();
  EXPECT_TRUE(app().allowSaveButton());
  EXPECT_EQ(testing::kindsOf(top().toolbarItems()), "indicator label space button ");
}

TEST_F(KestroAppTest, SavingIsNotOfferedElsewhere) {
  launch();
  EXPECT_FALSE(app().allowSaveButton());
  EXPECT_EQ(testing::kindsOf(top().toolbarItems()), "indicator label space ");
}

// --- Display -------------------------------------------------------------------------------------

TEST_F(KestroAppTest, NewDataShowsWithTheTime) {
  launchConnected();  // at 13:00:01
  show(display("-70"));
  EXPECT_THAT(rows(), ElementsAre("Serving >", "Cells >"));
  EXPECT_EQ(status(), "Updated 2012-03-04 at 13:00:03");
  EXPECT_FALSE(isLoading());
}

TEST_F(KestroAppTest, PanesOnTheStackFollowTheirPaths) {
  launchConnected();
  show(display("-70"));
  open(0);
  EXPECT_EQ(title(), "Serving");
  EXPECT_EQ(top().path(), "/Serving");
  EXPECT_THAT(rows(), ElementsAre("RSCP = -70", "Band = 1"));
  EXPECT_EQ(status(), "Updated 2012-03-04 at 13:00:03");
  show(display("-71"));
  EXPECT_THAT(rows(), ElementsAre("RSCP = -71", "Band = 1"));
  EXPECT_EQ(status(), "Updated 2012-03-04 at 13:00:05");
}

TEST_F(KestroAppTest, ThreeLevelsDownTheBackButtonNamesTheWay) {
  launchConnected();
  show(display("-70"));
  open(1);
  open(0);
  EXPECT_EQ(top().path(), "/Cells/0");
  EXPECT_EQ(title(), "0");
  EXPECT_EQ(stack().navigationBar().backButton().text(), "Cells");
  EXPECT_THAT(rows(), ElementsAre("ARFCN = 62", "RxLev = -70"));
}

TEST_F(KestroAppTest, APaneWhoseSectionVanishesIsPoppedWithAllAboveIt) {
  launchConnected();
  show(display("-70"));
  open(1);
  open(0);
  show(Dictionary{{"Serving", Dictionary{{"RSCP", "-72"}, {"Band", "1"}}},
                  {"SIM", Dictionary{{"A", "1"}, {"B", "2"}}}});
  settle();
  EXPECT_EQ(depth(), 1);
  EXPECT_THAT(rows(), ElementsAre("Serving >", "SIM >"));
  EXPECT_EQ(status(), "Updated 2012-03-04 at 13:00:05");
}

TEST_F(KestroAppTest, AVanishedRowPopsOnlyItsOwnPane) {
  launchConnected();
  show(display("-70"));
  open(1);
  open(0);
  show(Dictionary{{"Cells", Array{"header"}}, {"Other", "x"}});
  settle();
  EXPECT_EQ(depth(), 2);
  EXPECT_EQ(title(), "Cells");
  EXPECT_THAT(rows(), IsEmpty());
}

TEST_F(KestroAppTest, ALostConnectionShowsWithoutNewDataAndKeepsTheDisplay) {
  launchConnected();
  show(display("-70"));
  loseServer();
  queue().advance(2s);
  EXPECT_EQ(status(), "Connecting...");
  EXPECT_TRUE(isLoading());
  EXPECT_EQ(app().updateMessage(), "Updated 2012-03-04 at 13:00:03");
  EXPECT_THAT(rows(), ElementsAre("Serving >", "Cells >"));
}

TEST_F(KestroAppTest, ARedrawWhileDisconnectedKeepsTheTimeOfTheLastUpdate) {
  launchConnected();
  show(display("-70"));
  loseServer();
  queue().advance(2s);
  app().updateViewControllerFromModel();
  EXPECT_EQ(app().updateMessage(), "Updated 2012-03-04 at 13:00:03");
  EXPECT_EQ(status(), "Connecting...");
}

TEST_F(KestroAppTest, AScreenChangeWhileDisconnectedShowsConnecting) {
  launchConnected();
  show(display("-70"));
  loseServer();
  queue().advance(2s);
  open(0);
  EXPECT_EQ(status(), "Connecting...");
  EXPECT_TRUE(isLoading());
}

TEST_F(KestroAppTest, APaneThatComesBackWhileDisconnectedShowsConnecting) {
  launchConnected();
  show(display("-70"));
  open(0);
  loseServer();
  queue().advance(2s);
  QTest::keyClick(&table(), Qt::Key_Backspace);
  EXPECT_EQ(depth(), 1);
  EXPECT_EQ(status(), "Connecting...");
  EXPECT_TRUE(isLoading());
}

TEST_F(KestroAppTest, AfterReconnectingTheOldUpdateShowsUntilNewData) {
  launchConnected();
  show(display("-70"));
  loseServer();
  queue().advance(3s);
  bringServerBack();
  queue().advance(6s);
  EXPECT_EQ(status(), "Updated 2012-03-04 at 13:00:03");
  EXPECT_FALSE(isLoading());
}

TEST_F(KestroAppTest, TheLastDisplayStaysWhileNoGeneratorFitsTheChannel) {
  launchConnected();
  show(display("-70"));
  open(0);
  sendLog(display("-71"));  // no tick has seen it when the channel changes
  answerTechnology("Semaphore");
  channel->invalidate();
  openChannel();
  queue().advance(2s);
  EXPECT_EQ(depth(), 2);
  EXPECT_THAT(rows(), ElementsAre("RSCP = -70", "Band = 1"));
  EXPECT_EQ(status(), "Connecting...");
  answerTechnology("IFX");
  queue().advance(5s);
  show(display("-72"));
  EXPECT_THAT(rows(), ElementsAre("RSCP = -72", "Band = 1"));
  EXPECT_THAT(rowsOf(0), ElementsAre("Serving >", "Cells >"));
}

TEST_F(KestroAppTest, AQueuedRedrawAfterTheExitTouchesNothing) {
  launchConnected();
  sendLog(display("-70"));
  platform.telephonyService().notify();
  app().applicationWillTerminate();
  queue().runReady();
  EXPECT_EQ(app().window(), nullptr);
}

TEST_F(KestroAppTest, ARetryAfterTheExitTouchesNothing) {
  platform.telephonyService().setReachable(false);
  launchConnected();
  app().applicationWillTerminate();
  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  EXPECT_THAT(channelRequests, ::testing::SizeIs(1));
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
}

TEST_F(KestroAppTest, TheExitClosesThePorts) {
  launchConnected();
  ASSERT_EQ(platform.messagePorts().names().size(), 2);
  app().applicationWillTerminate();
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
  EXPECT_TRUE(app().updateMessage().isEmpty());
}

TEST_F(KestroAppTest, TheExitTakesTheWindowAwayBeforeTheModel) {
  launchConnected();
  std::size_t portsLeft = 0;
  QObject::connect(app().window(), &QObject::destroyed,
                   [&] { portsLeft = platform.messagePorts().names().size(); });
  app().applicationWillTerminate();
  EXPECT_EQ(portsLeft, 2);
}

TEST_F(KestroAppTest, TheEndOfTheEventLoopIsTheExit) {
  launch();
  QTimer::singleShot(0, [] { QCoreApplication::exit(0); });
  QCoreApplication::exec();
  EXPECT_EQ(app().window(), nullptr);
  EXPECT_EQ(platform.preferences().events().size(), 6);
}

TEST_F(KestroAppTest, TheSessionsEndIsTheExit) {
  launch();
  // What the toolkit makes of a session manager that ends the session.
  QTimer::singleShot(0, [] {
    QEvent quit(QEvent::Quit);
    QCoreApplication::sendEvent(&app(), &quit);
  });
  QCoreApplication::exec();
  EXPECT_EQ(app().window(), nullptr);
  EXPECT_EQ(platform.preferences().events().size(), 6);
}

// --- Slides --------------------------------------------------------------------------------------

TEST_F(KestroAppTest, APaneSlidesInAndOut) {
  launchConnected();
  show(display("-70"));
  table().setFocusedRow(0);
  QTest::keyClick(&table(), Qt::Key_Return);
  EXPECT_TRUE(stack().isMoving());
  settle();
  QTest::keyClick(&table(), Qt::Key_Backspace);
  EXPECT_TRUE(stack().isMoving());
}

TEST_F(KestroAppTest, AMouseGoesBackWithASlide) {
  launchConnected();
  show(display("-70"));
  for (QWidget* widget : {static_cast<QWidget*>(&stack()),
                          static_cast<QWidget*>(&stack().navigationBar().backButton())}) {
    open(0);
    QTest::mouseClick(widget, widget == &stack() ? Qt::BackButton : Qt::LeftButton);
    EXPECT_EQ(depth(), 1);
    EXPECT_TRUE(stack().isMoving());
    settle();
  }
}

TEST_F(KestroAppTest, APaneWhosePathIsGoneSlidesOut) {
  launchConnected();
  show(display("-70"));
  open(1);
  show(Dictionary{{"Serving", Dictionary{{"RSCP", "-70"}, {"Band", "1"}}}});
  EXPECT_EQ(depth(), 1);
  EXPECT_TRUE(stack().isMoving());
}

TEST_F(KestroAppTest, TheSaveScreenSlidesInAndOut) {
  launchConnected();
  app().showSaveView();
  EXPECT_TRUE(stack().isMoving());
  settle();
  app().closeSaveView();
  EXPECT_TRUE(stack().isMoving());
}

TEST_F(KestroAppTest, ASecondTapOnARowOpensNothingMore) {
  launchConnected();
  show(display("-70"));
  QWidget* viewport = table().viewport();
  const QPoint place = table().cellAtRow(0)->geometry().center();
  QTest::mouseClick(viewport, Qt::LeftButton, {}, place);
  ASSERT_TRUE(stack().isMoving());
  QTest::mouseClick(viewport, Qt::LeftButton, {}, place);
  QTest::mouseDClick(viewport, Qt::LeftButton, {}, place);
  EXPECT_EQ(depth(), 2);
  EXPECT_TRUE(stack().isMoving());
}

TEST_F(KestroAppTest, ATapOnAPaneThatIsPoppedOpensNothing) {
  launchConnected();
  show(display("-70"));
  open(1);
  QWidget* viewport = table().viewport();
  const QPoint place = table().cellAtRow(0)->geometry().center();
  QTest::keyClick(&table(), Qt::Key_Backspace);
  ASSERT_TRUE(stack().isMoving());
  QTest::mouseClick(viewport, Qt::LeftButton, {}, place);
  EXPECT_EQ(depth(), 1);
}

TEST_F(KestroAppTest, APressThatASlideOvertakesOpensNothing) {
  launchConnected();
  show(display("-70"));
  QWidget* viewport = table().viewport();
  const QPoint place = table().cellAtRow(1)->geometry().center();
  QTest::mousePress(viewport, Qt::LeftButton, {}, place);
  table().setFocusedRow(0);
  QTest::keyClick(&table(), Qt::Key_Return);
  QTest::mouseRelease(viewport, Qt::LeftButton, {}, place);
  EXPECT_EQ(title(), "Serving");
  settle();
  QTest::mouseRelease(viewport, Qt::LeftButton, {}, place);
  EXPECT_EQ(depth(), 2);
}

TEST_F(KestroAppTest, APaneThatSlidOutTakesTapsWhenItIsBack) {
  launchConnected();
  show(display("-70"));
  open(0);
  QTest::keyClick(&table(), Qt::Key_Backspace);
  settle();
  QTest::mouseClick(table().viewport(), Qt::LeftButton, {},
                    table().cellAtRow(1)->geometry().center());
  EXPECT_EQ(title(), "Cells");
}

TEST_F(KestroAppTest, KeysDuringASlideGoToThePaneThatComes) {
  launchConnected();
  ASSERT_TRUE(QTest::qWaitForWindowActive(app().window()));
  show(display("-70"));
  table().setFocusedRow(1);
  QTest::keyClick(&table(), Qt::Key_Return);
  ASSERT_TRUE(stack().isMoving());
  EXPECT_EQ(QApplication::focusWidget(), &table());
  const auto press = [](Qt::Key key) { QTest::keyClick(app().window()->windowHandle(), key); };
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  EXPECT_EQ(top().path(), "/Cells/0");
  ASSERT_TRUE(stack().isMoving());
  press(Qt::Key_Backspace);
  EXPECT_EQ(top().path(), "/Cells");
}

// --- Marks ---------------------------------------------------------------------------------------

bool isMarked(int row, const TableView& table) { return table.cellAtRow(row)->isMarkedChanged(); }

TEST_F(KestroAppTest, AChangedValueIsMarked) {
  launchConnected();
  show(display("-70"));
  open(0);
  EXPECT_FALSE(isMarked(0, table()));
  show(display("-71"));
  EXPECT_TRUE(isMarked(0, table()));
  EXPECT_FALSE(isMarked(1, table()));
}

TEST_F(KestroAppTest, NothingIsMarkedWhenPlain) {
  launch({.windowSize = QSize(390, 780), .plain = true});
  connectMonitor();
  show(display("-70"));
  open(0);
  show(display("-71"));
  EXPECT_FALSE(isMarked(0, table()));
}

// --- Saving --------------------------------------------------------------------------------------

TEST_F(KestroAppTest, TheSaveScreenIsShownOnce) {
  offerSaving();
  launchConnected();
  app().showSaveView();
  KestroSaveViewController* screen = app().saveViewController();
  ASSERT_NE(screen, nullptr);
  EXPECT_EQ(stack().presented(), screen);
  app().showSaveView();
  EXPECT_EQ(app().saveViewController(), screen);
}

TEST_F(KestroAppTest, ClosingTheSaveScreenTakesItAway) {
  launchConnected();
  app().showSaveView();
  app().closeSaveView();
  EXPECT_EQ(app().saveViewController(), nullptr);
  EXPECT_EQ(stack().presented(), nullptr);
  app().closeSaveView();
}

TEST_F(KestroAppTest, ControlSOpensTheSaveScreenWhereSavingIsOffered) {
  offerSaving();
  launchConnected();
  QTest::keyClick(&table(), Qt::Key_S, Qt::ControlModifier);
  EXPECT_NE(app().saveViewController(), nullptr);
}

TEST_F(KestroAppTest, ControlSDoesNothingElsewhere) {
  launchConnected();
  QTest::keyClick(&table(), Qt::Key_S, Qt::ControlModifier);
  EXPECT_EQ(app().saveViewController(), nullptr);
}

TEST_F(KestroAppTest, TheToolbarsButtonOpensTheSaveScreen) {
  offerSaving();
  launchConnected();
  QTest::mouseClick(stack().toolbar().widgetOfItem(3), Qt::LeftButton);
  EXPECT_NE(app().saveViewController(), nullptr);
}

TEST_F(KestroAppTest, AFailedWriteShowsTheAlertAndClosesTheScreen) {
  launchConnected();
  platform.deviceRoot().setWriteFailure("full");
  app().showSaveView();
  app().saveViewController()->savePressed();
  EXPECT_NE(app().saveViewController(), nullptr);  // it closes in a later turn
  queue().runReady();
  EXPECT_EQ(app().saveViewController(), nullptr);
  ASSERT_NE(app().alert(), nullptr);
  EXPECT_EQ(app().alert()->title(), "File Error");
  EXPECT_EQ(app().alert()->message(), "Unable to write file to disk");
  EXPECT_EQ(app().alert()->button().text(), "Close");
}

TEST_F(KestroAppTest, TheAlertTakesTheKeysUntilItIsClosed) {
  launchConnected();
  show(display("-70"));
  platform.deviceRoot().setWriteFailure("full");
  app().showSaveView();
  app().saveViewController()->savePressed();
  queue().runReady();
  settle();
  EXPECT_EQ(QApplication::focusWidget(), &app().alert()->button());
  EXPECT_FALSE(table().isEnabled());
  QTest::keyClick(app().alert(), Qt::Key_Escape);
  QTest::qWait(1);
  EXPECT_EQ(app().alert(), nullptr);
  EXPECT_TRUE(table().isEnabled());
  EXPECT_EQ(QApplication::focusWidget(), &table());
}

TEST_F(KestroAppTest, TheShellIsPutBackOnceWhoeverDoesIt) {
  app().restoreRSSI();  // there is nothing yet
  launch();
  app().restoreRSSI();
  const auto& events = platform.preferences().events();
  ASSERT_EQ(events.size(), 6);
  EXPECT_EQ(events[3], "set org.lumo.Shell LumoShowGSMRSSI false");
  app().applicationWillTerminate();
  EXPECT_EQ(events.size(), 6);
}

TEST_F(KestroAppTest, TheHistoryIsSavedWithoutAsking) {
  launchConnected();
  show(display("-70"));  // at 13:00:03
  ASSERT_TRUE(app().saveHistory("Unexpected end"));
  const auto& files = platform.deviceRoot().files();
  const auto file =
      files.find("/var/mobile/Library/Logs/CrashReporter/KestroSnapshot-1330866003.kestro");
  ASSERT_NE(file, files.end());
  const auto saved = coding->parse(file->second);
  ASSERT_TRUE(saved);
  EXPECT_EQ(saved->dictionary()["Description"], Value("Unexpected end"));
  EXPECT_EQ(saved->dictionary()["Data"].array().size(), 1);
}

}  // namespace
}  // namespace kestro
