// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <QApplication>
#include <QFontMetricsF>

#include "App/Panes/KestroCell.h"

namespace kestro {
namespace {

class KestroCellTest : public ::testing::Test {
 protected:
  static std::unique_ptr<KestroCell> makeCell(KestroCell::Style style, int width = 400) {
    auto cell = std::make_unique<KestroCell>(style, "id");
    cell->resize(width, kRowHeight);
    return cell;
  }
};

TEST_F(KestroCellTest, AKeyOnlyCellHasNoValue) {
  const auto cell = makeCell(KestroCell::Style::Key);
  cell->setValue("1");
  EXPECT_FALSE(cell->valueLabel());
  EXPECT_EQ(cell->value(), "");
  EXPECT_EQ(cell->reuseIdentifier(), "id");
}

TEST_F(KestroCellTest, TheKeyIsBoldAndTheValueRegularFifteen) {
  const auto cell = makeCell(KestroCell::Style::KeyValue);
  EXPECT_EQ(cell->keyLabel().style().font().weight(), QFont::Bold);
  EXPECT_EQ(cell->valueLabel()->style().font().weight(), QFont::Normal);
  EXPECT_EQ(cell->valueLabel()->style().font().pixelSize(), 15);
}

TEST_F(KestroCellTest, BothTextsAreMeasuredInBold) {
  const auto cell = makeCell(KestroCell::Style::KeyValue);
  cell->setKey("RSCP");
  cell->setValue("-70 dBm");
  cell->setLayout();
  const QSizeF bold = systemTextStyle(15, QFont::Bold).size("-70 dBm");
  EXPECT_EQ(cell->valueLabel()->frame.size(), bold);
  EXPECT_EQ(cell->valueLabel()->frame.right(), cell->contentBounds().width());
  EXPECT_EQ(cell->keyLabel().frame.left(), 10);
}

TEST_F(KestroCellTest, TheLayoutFollowsTheCellsWidth) {
  const auto cell = makeCell(KestroCell::Style::KeyValue);
  cell->setKey("RSCP");
  cell->setValue("-70 dBm");
  cell->setLayout();
  cell->show();
  cell->resize(600, kRowHeight);
  EXPECT_EQ(cell->valueLabel()->frame.right(), cell->contentBounds().width());
}

TEST_F(KestroCellTest, AnAccessoryTakesItsRoomFromTheContent) {
  const auto cell = makeCell(KestroCell::Style::Key);
  const qreal before = cell->contentBounds().width();
  cell->setAccessory(CellAccessory::DisclosureIndicator);
  EXPECT_LT(cell->contentBounds().width(), before);
}

TEST_F(KestroCellTest, AContainerThatIsWideEnoughDoesNotScroll) {
  const auto cell = makeCell(KestroCell::Style::KeyValue);
  cell->setKey("A");
  cell->setValue("1");
  cell->setLayout();
  EXPECT_FALSE(cell->scrollContentBy(10));
}

TEST_F(KestroCellTest, AWideContentScrollsToItsEndAndBack) {
  const auto cell = makeCell(KestroCell::Style::KeyValue);
  cell->setKey("A");
  cell->setValue(QString(100, u'8'));
  cell->setLayout();
  EXPECT_TRUE(cell->scrollContentBy(1e6));
  EXPECT_EQ(cell->containerOffset(),
            cell->containerContentSize().width() - cell->containerFrame().width());
  EXPECT_FALSE(cell->scrollContentBy(1));
  EXPECT_TRUE(cell->scrollContentBy(-1e6));
  EXPECT_EQ(cell->containerOffset(), 0);
}

TEST_F(KestroCellTest, AReloadKeepsHowFarTheContentIsScrolled) {
  const auto cell = makeCell(KestroCell::Style::KeyValue);
  cell->setValue(QString(100, u'8'));
  cell->setLayout();
  cell->scrollContentBy(30);
  cell->setValue(QString(100, u'7'));
  cell->setLayout();
  EXPECT_EQ(cell->containerOffset(), 30);
  cell->setValue("1");
  cell->setLayout();
  EXPECT_EQ(cell->containerOffset(), 0);
}

TEST_F(KestroCellTest, ScreenReadersHearNameAndValue) {
  const auto cell = makeCell(KestroCell::Style::KeyValue);
  cell->setKey("RSCP");
  cell->setValue("-70 dBm");
  EXPECT_EQ(cell->accessibleName(), "RSCP");
  EXPECT_EQ(cell->accessibleDescription(), "-70 dBm");
}

TEST_F(KestroCellTest, WhatIsNotShownWholeIsATooltip) {
  const auto leaf = makeCell(KestroCell::Style::KeyValue);
  leaf->setKey("RSCP");
  leaf->setValue("-70 dBm");
  leaf->setLayout();
  EXPECT_EQ(leaf->hiddenText(), "");
  leaf->setValue(QString(100, u'8'));
  leaf->setLayout();
  EXPECT_EQ(leaf->hiddenText(), "RSCP\n" + QString(100, u'8'));
  const auto tree = makeCell(KestroCell::Style::Key);
  tree->setKey("Short");
  tree->setLayoutKey();
  EXPECT_EQ(tree->hiddenText(), "");
  tree->setKey(QString(100, u'n'));
  tree->setLayoutKey();
  EXPECT_EQ(tree->hiddenText(), QString(100, u'n'));
}

TEST_F(KestroCellTest, AtAnyTextSizeAMeasurementIsWhole) {
  const QFont before = QApplication::font();
  for (const int pixels : {14, 20, 27, 60}) {
    QFont larger = before;
    larger.setPixelSize(pixels);
    QApplication::setFont(larger);
    for (const int width : {240, 390, 760}) {
      const auto cell = makeCell(KestroCell::Style::KeyValue, width);
      cell->resize(width, rowHeight());
      cell->setKey("Measured RSRP");
      cell->setValue("-88.50 dBm");
      cell->setLayout();
      const QRectF& key = cell->keyLabel().frame;
      const QRectF& value = cell->valueLabel()->frame;
      EXPECT_TRUE(cell->contentBounds().contains(value)) << pixels << " " << width;
      EXPECT_FALSE(key.intersects(value)) << pixels << " " << width;
    }
  }
  QApplication::setFont(before);
}

}  // namespace
}  // namespace kestro
