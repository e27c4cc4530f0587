// SPDX-License-Identifier: MIT
// The screens as a simulated drive fills them. With $KESTRO_PICTURES each leaves its picture there,
// which is how the pictures in the documentation are taken.
#include <gmock/gmock.h>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <set>

#include "App/Toolkit/SystemColours.h"
#include "Tests/App/WindowFixture.h"

namespace kestro::testing {
namespace {

class PicturesTest : public WindowTest, public ::testing::WithParamInterface<const char*> {
 public:
  ~PicturesTest() override { QApplication::setPalette(paletteBefore); }

 protected:
  PicturesTest() : paletteBefore(QApplication::palette()) {
    if (isDark()) QApplication::setPalette(darkPalette());
    startServer({"--source=simulation:LTE"});
    launch();
    EXPECT_TRUE(waitFor([] { return status().starts_with("Updated"); }));
  }

  static bool isDark() { return std::string(GetParam()) == "dark"; }

  static void takePicture(const std::string& name) {
    EXPECT_TRUE(waitFor([] { return !stack().isMoving(); }));
    const char* folder = std::getenv("KESTRO_PICTURES");
    if (folder == nullptr) return;
    const std::string path = std::string(folder) + "/" + name + "-" + GetParam() + ".png";
    EXPECT_TRUE(app().window()->grab().save(QString::fromStdString(path)));
  }
  /// Opens the row with this name.
  static void open(const std::string& name) {
    const auto names = rows();
    const auto found = std::find(names.begin(), names.end(), name + " >");
    ASSERT_NE(found, names.end()) << name;
    tap(static_cast<int>(found - names.begin()));
    EXPECT_EQ(title(), name);
  }

  static void waitUntilUnmarked() {
    EXPECT_TRUE(waitFor([] { return !top().tableView().cellAtRow(0)->isMarkedChanged(); }));
  }

  QPalette paletteBefore;
};

TEST_P(PicturesTest, TheRootPane) {
  EXPECT_GE(rows().size(), 4);
  takePicture("root");
}

TEST_P(PicturesTest, ASection) {
  open("Serving Cell");
  open("Serving Cell Measurements");
  ASSERT_TRUE(waitFor([] { return rows().size() >= 10; }));
  waitUntilUnmarked();
  takePicture("section");
}

TEST_P(PicturesTest, AListOfCellsAndOneOfThem) {
  open("Neighbors");
  open("Neighbor Cells List");
  ASSERT_TRUE(waitFor([] { return rows().size() >= 3; }));
  takePicture("cells");
  open("0");
  EXPECT_GE(rows().size(), 10);
  // With the values that have just changed marked.
  ASSERT_TRUE(waitFor([] { return top().tableView().cellAtRow(1)->isMarkedChanged(); }));
  takePicture("cell");
}

TEST_P(PicturesTest, TheSaveScreenAndTheFileError) {
  // A history of some entries makes a better list.
  std::set<std::string> updates;
  ASSERT_TRUE(waitFor([&] {
    updates.insert(status());
    return updates.size() >= 3;
  }));
  key(Qt::Key_S, Qt::ControlModifier);
  ASSERT_NE(app().saveViewController(), nullptr);
  QTest::keyClicks(&app().saveViewController()->saveDescription(), "Handover near the river");
  takePicture("save");
  std::filesystem::remove(saveFolder());
  app().saveViewController()->savePressed();
  ASSERT_TRUE(waitFor([] { return app().saveViewController() == nullptr; }));
  ASSERT_NE(app().alert(), nullptr);
  takePicture("file-error");
}

TEST_P(PicturesTest, WhereASnapshotWasSaved) {
  key(Qt::Key_S, Qt::ControlModifier);
  app().saveViewController()->savePressed();
  ASSERT_TRUE(waitFor([] { return app().saveViewController() == nullptr; }));
  EXPECT_NE(app().window()->noticeBar().message(), QString());
  takePicture("saved");
}

TEST_P(PicturesTest, ALostConnection) {
  open("Serving Cell");
  open("Serving Cell Measurements");
  server->signal(SIGKILL);
  ASSERT_TRUE(waitFor([] { return !app().window()->noticeBar().notice().isEmpty(); }));
  waitUntilUnmarked();
  takePicture("lost");
}

TEST_P(PicturesTest, LargeTexts) {
  const QFont before = QApplication::font();
  QFont larger = before;
  larger.setPointSize(20);
  QApplication::setFont(larger);
  open("Serving Cell");
  open("Serving Cell Measurements");
  ASSERT_TRUE(waitFor([] { return rows().size() >= 5; }));
  takePicture("large");
  QApplication::setFont(before);
}

INSTANTIATE_TEST_SUITE_P(Colours, PicturesTest, ::testing::Values("light", "dark"),
                         [](const auto& suite) { return std::string(suite.param); });

}  // namespace
}  // namespace kestro::testing
