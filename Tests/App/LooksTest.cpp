// SPDX-License-Identifier: MIT
// Texts, colours and columns.
#include <gtest/gtest.h>

#include <QApplication>
#include <QFontDatabase>

#include "App/Toolkit/Colours.h"
#include "App/Toolkit/Column.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {
namespace {

TEST(TextStyleTest, FiguresOfOneCountAreOfOneWidthInEveryFont) {
  for (const QString& family : QFontDatabase::families()) {
    QFont font(family);
    font.setPixelSize(15);
    const TextStyle style(font);
    EXPECT_EQ(style.size("-111.1 dBm"), style.size("-888.8 dBm")) << family.toStdString();
  }
}

TEST(TextStyleTest, AWiderTextIsElidedAndFits) {
  const TextStyle& style = systemTextStyle(15);
  EXPECT_EQ(style.elided("Band", 1000), "Band");
  const QString elided = style.elided("Serving Cell Measurement", 100);
  EXPECT_TRUE(elided.endsWith(u'…'));
  EXPECT_LE(style.size(elided).width(), 100);
}

TEST(TextStyleTest, TheSystemsTextScaleCountsWithinBounds) {
  EXPECT_EQ(textScale(7), 1);
  EXPECT_EQ(textScale(14), 1);
  EXPECT_EQ(textScale(21), 1.5);
  EXPECT_EQ(textScale(100), 2);
}

TEST(TextStyleTest, ALargerSystemFontEnlargesTexts) {
  const QFont before = QApplication::font();
  QFont larger = before;
  larger.setPixelSize(28);
  QApplication::setFont(larger);
  EXPECT_EQ(systemTextStyle(15).font().pixelSize(), 30);
  QApplication::setFont(before);
}

TEST(ColoursTest, ContrastIsThatOfTheLuminances) {
  EXPECT_NEAR(contrast(Qt::black, Qt::white), 21, 1e-6);
  EXPECT_NEAR(contrast(Qt::white, Qt::white), 1, 1e-6);
}

TEST(ColoursTest, MixingGoesFromOneToTheOther) {
  EXPECT_EQ(mixed(Qt::black, Qt::white, 0).rgb(), QColor(Qt::black).rgb());
  EXPECT_EQ(mixed(Qt::black, Qt::white, 1).rgb(), QColor(Qt::white).rgb());
  EXPECT_NEAR(mixed(Qt::black, Qt::white, 0.5).redF(), 0.5, 0.01);
}

QPalette paletteOf(const QColor& window, const QColor& base, const QColor& text) {
  QPalette palette;
  palette.setColor(QPalette::Window, window);
  palette.setColor(QPalette::Base, base);
  palette.setColor(QPalette::Text, text);
  palette.setColor(QPalette::Highlight, QColor(0x30, 0x8c, 0xc6));
  return palette;
}

void expectReadable(const Colours& colours) {
  EXPECT_GE(contrast(colours.accent, colours.row), 4.5);
  EXPECT_GE(contrast(colours.accent, colours.bar), 4.5);
  EXPECT_GE(contrast(colours.faintText, colours.row), 4.5);
}

TEST(ColoursTest, AllTextCanBeReadInTheLight) {
  expectReadable(coloursOf(paletteOf(QColor(0xef, 0xef, 0xef), Qt::white, Qt::black)));
}

TEST(ColoursTest, AllTextCanBeReadInTheDark) {
  expectReadable(
      coloursOf(paletteOf(QColor(0x24, 0x24, 0x24), QColor(0x1e, 0x1e, 0x1e), Qt::white)));
}

TEST(ColumnTest, ItFillsANarrowWindowAndStandsInTheMiddleOfAWideOne) {
  EXPECT_EQ(columnIn(390).left, 0);
  EXPECT_EQ(columnIn(390).width, 390);
  EXPECT_EQ(columnIn(1760).left, 500);
  EXPECT_EQ(columnIn(1760).width, 760);
}

}  // namespace
}  // namespace kestro
