// SPDX-License-Identifier: MIT
// The screens as a simulated drive fills them. With $KESTRO_PICTURES each leaves its picture there,
// which is how the pictures in the documentation are taken.
#include <gmock/gmock.h>

#include <QPalette>
#include <cstdlib>

#include "Tests/App/WindowFixture.h"

namespace kestro::testing {
namespace {

/// The colours that desktops call dark.
QPalette darkPalette() {
  QPalette palette(QColor(0x30, 0x30, 0x30));
  palette.setColor(QPalette::Window, QColor(0x24, 0x24, 0x24));
  palette.setColor(QPalette::WindowText, QColor(0xf2, 0xf2, 0xf2));
  palette.setColor(QPalette::Base, QColor(0x1b, 0x1b, 0x1d));
  palette.setColor(QPalette::Text, QColor(0xf2, 0xf2, 0xf2));
  palette.setColor(QPalette::PlaceholderText, QColor(0x8e, 0x8e, 0x93));
  palette.setColor(QPalette::Highlight, QColor(0x35, 0x84, 0xe4));
  return palette;
}

class PicturesTest : public WindowTest, public ::testing::WithParamInterface<const char*> {
 protected:
  PicturesTest() : paletteBefore(QApplication::palette()) {
    if (isDark()) QApplication::setPalette(darkPalette());
    startServer({"--source=simulation:LTE"});
    launch();
    EXPECT_TRUE(waitFor([] { return status().starts_with("Updated"); }));
  }
  ~PicturesTest() override { QApplication::setPalette(paletteBefore); }

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

  QPalette paletteBefore;
};

TEST_P(PicturesTest, TheRootPane) {
  EXPECT_GE(rows().size(), 4);
  takePicture("root");
}

TEST_P(PicturesTest, ASection) {
  open("Serving Cell");
  takePicture("section");
}

TEST_P(PicturesTest, AListOfCellsAndOneOfThem) {
  open("Neighbors");
  takePicture("lists");
}

TEST_P(PicturesTest, TheSaveScreenAndTheFileError) {
  ASSERT_TRUE(waitFor([] { return status().starts_with("Updated"); }));
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

INSTANTIATE_TEST_SUITE_P(Colours, PicturesTest, ::testing::Values("light", "dark"),
                         [](const auto& suite) { return std::string(suite.param); });

}  // namespace
}  // namespace kestro::testing
