// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QTest>

#include "App/Panes/KestroSaveViewController.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::Contains;
using ::testing::IsEmpty;

constexpr Moment kOpened{1'330'862'709s};  // 2012-03-04 12:05:09 UTC

class KestroSaveViewControllerTest : public ::testing::Test {
 protected:
  KestroSaveViewControllerTest() {
    platform.clock().setNow(kOpened);
    platform.clock().setTimeZone(1h, false);
  }

  void open(const Value& contents) {
    screen = std::make_unique<KestroSaveViewController>(
        platform, contents,
        KestroSaveViewController::Handlers{.close = [this] { ++closes; },
                                           .writeFailed = [this] { ++failures; }});
    screen->resize(390, 780);
    screen->show();
  }
  /// The one file that was written.
  Dictionary file() {
    EXPECT_EQ(platform.deviceRoot().files().size(), 1);
    return coding->parse(platform.deviceRoot().files().begin()->second)->dictionary();
  }
  std::string path() { return platform.deviceRoot().files().begin()->first; }
  QString rowText(int row) { return screen->saveContentTable().cellAtRow(row)->accessibleName(); }
  QWidget* control(const char* name) { return screen->findChild<QWidget*>(name); }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::unique_ptr<KestroSaveViewController> screen;
  int closes = 0;
  int failures = 0;
};

Dictionary entry(const char* description) {
  return {{"Display", "x"}, {"Description", description}};
}

TEST_F(KestroSaveViewControllerTest, TheEntriesAreListedInOrderWithCheckMarks) {
  open(Array{entry("first"), entry("last"), Dictionary()});
  TableView& table = screen->saveContentTable();
  ASSERT_EQ(table.rowCount(), 3);
  EXPECT_EQ(rowText(0), "first");
  EXPECT_EQ(rowText(1), "last");
  EXPECT_EQ(rowText(2), "");
  EXPECT_EQ(table.cellAtRow(0)->accessory(), CellAccessory::Checkmark);
  EXPECT_EQ(table.cellAtRow(0)->reuseIdentifier(), "SaveHistoryContentCell");
}

TEST_F(KestroSaveViewControllerTest, TheEntriesAreInHelveticaThirteen) {
  open(Array{entry("first")});
  const QFont& font = screen->saveContentTable().cellAtRow(0)->font();
  EXPECT_EQ(font.family(), "Helvetica");
  EXPECT_EQ(font.pixelSize(), 13);
}

TEST_F(KestroSaveViewControllerTest, EnterInTheFieldIsTaken) {
  open(Array());
  EXPECT_TRUE(screen->textFieldShouldReturn());
}

TEST_F(KestroSaveViewControllerTest, SavingWritesTimeDataAndDescription) {
  open(Array{entry("first")});
  screen->saveDescription().setText("in the tunnel");
  platform.clock().setNow(kOpened + 60s);
  screen->savePressed();
  EXPECT_EQ(path(), "/var/mobile/Library/Logs/CrashReporter/KestroSnapshot-1330862769.kestro");
  const Dictionary saved = file();
  ASSERT_EQ(saved.size(), 3);
  EXPECT_EQ(saved.keyAt(0), Value("Timestamp"));
  EXPECT_EQ(saved.valueAt(0), Value("2012-03-04 13:05:09 +0100"));
  EXPECT_EQ(saved.keyAt(1), Value("Data"));
  EXPECT_EQ(saved.valueAt(1), Value(Array{entry("first")}));
  EXPECT_EQ(saved.keyAt(2), Value("Description"));
  EXPECT_EQ(saved.valueAt(2), Value("in the tunnel"));
}

TEST_F(KestroSaveViewControllerTest, TheContentsAreThoseOfTheOpening) {
  const Array contents{entry("first")};
  open(contents);
  Array changed = contents;
  changed.append(entry("later"));
  screen->savePressed();
  EXPECT_EQ(file()["Data"].array().size(), 1);
}

TEST_F(KestroSaveViewControllerTest, AnEmptyHistoryIsSavedAsAnEmptyArray) {
  open(Array());
  EXPECT_EQ(screen->saveContentTable().rowCount(), 0);
  screen->savePressed();
  EXPECT_TRUE(file()["Data"].isArray());
  EXPECT_EQ(file()["Description"], Value(""));
}

TEST_F(KestroSaveViewControllerTest, WithoutContentsTheFileHoldsTheTimeOnly) {
  open(Value());
  screen->savePressed();
  EXPECT_EQ(file().size(), 1);
}

TEST_F(KestroSaveViewControllerTest, SavingClosesInALaterTurn) {
  open(Array());
  screen->savePressed();
  EXPECT_EQ(closes, 0);
  platform.mainQueue().runReady();
  EXPECT_EQ(closes, 1);
  EXPECT_EQ(failures, 0);
}

TEST_F(KestroSaveViewControllerTest, CancellingClosesAndWritesNothing) {
  open(Array());
  screen->cancelPressed();
  platform.mainQueue().runReady();
  EXPECT_EQ(closes, 1);
  EXPECT_THAT(platform.deviceRoot().files(), IsEmpty());
}

TEST_F(KestroSaveViewControllerTest, AFailedWriteIsLoggedAndToldAndClosesAllTheSame) {
  open(Array());
  platform.deviceRoot().setWriteFailure("no space");
  screen->savePressed();
  EXPECT_EQ(failures, 1);
  platform.mainQueue().runReady();
  EXPECT_EQ(closes, 1);
  EXPECT_THAT(platform.systemLog().lines(),
              Contains(RecordingSystemLog::Line{
                  LogPriority::Error,
                  "Unable to write snapshot to "
                  "/var/mobile/Library/Logs/CrashReporter/KestroSnapshot-1330862709.kestro"}));
}

TEST_F(KestroSaveViewControllerTest, TheButtonsAreWired) {
  open(Array());
  QTest::mouseClick(control("cancelButton"), Qt::LeftButton);
  platform.mainQueue().runReady();
  EXPECT_EQ(closes, 1);
  QTest::mouseClick(control("saveButton"), Qt::LeftButton);
  platform.mainQueue().runReady();
  EXPECT_EQ(closes, 2);
  EXPECT_EQ(platform.deviceRoot().files().size(), 1);
}

TEST_F(KestroSaveViewControllerTest, EscapeCancelsAndControlSSaves) {
  open(Array());
  QTest::keyClick(&screen->saveDescription(), Qt::Key_Escape);
  platform.mainQueue().runReady();
  EXPECT_EQ(closes, 1);
  EXPECT_THAT(platform.deviceRoot().files(), IsEmpty());
  QTest::keyClick(&screen->saveDescription(), Qt::Key_S, Qt::ControlModifier);
  EXPECT_EQ(platform.deviceRoot().files().size(), 1);
}

TEST_F(KestroSaveViewControllerTest, EnterTheBackgroundAndRowsHideTheKeyboardOnly) {
  open(Array{entry("first")});
  QApplication::setActiveWindow(screen.get());
  QLineEdit& field = screen->saveDescription();
  const auto expectHidden = [&](const std::function<void()>& act) {
    field.setFocus();
    ASSERT_TRUE(field.hasFocus());
    act();
    EXPECT_FALSE(field.hasFocus());
  };
  expectHidden([&] { QTest::keyClick(&field, Qt::Key_Return); });
  expectHidden([&] { QTest::mouseClick(control("background"), Qt::LeftButton, {}, {5, 600}); });
  expectHidden([&] {
    QTest::mouseClick(screen->saveContentTable().viewport(), Qt::LeftButton, {}, {50, 20});
  });
  EXPECT_EQ(screen->saveContentTable().selectedRow(), -1);
  platform.mainQueue().runReady();
  EXPECT_EQ(closes, 0);
}

}  // namespace
}  // namespace kestro
