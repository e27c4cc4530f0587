// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QPointingDevice>
#include <QScrollBar>
#include <QSignalSpy>
#include <QTest>

#include "App/Panes/KestroCell.h"
#include "App/Toolkit/TableView.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// A table of numbered rows in a window ten rows high.
class TableViewTest : public ::testing::Test {
 protected:
  static constexpr int kHeight = 10 * kRowHeight;

  TableViewTest() {
    table.setDataSource({.numberOfRows = [this] { return rowCount; },
                         .cellForRow = [this](int row) { return cellForRow(row); },
                         .rowSelected = [this](int row) { selected.push_back(row); },
                         .textOfRow = {}});
    table.resize(400, kHeight);
    table.show();
    table.reloadData();
  }

  std::unique_ptr<TableCell> cellForRow(int row) {
    asked.push_back(row);
    auto cell = table.dequeueReusableCell("cell", row);
    if (cell) {
      reused.push_back(row);
    } else {
      cell = std::make_unique<KestroCell>(KestroCell::Style::KeyValue, "cell");
    }
    auto& kestroCell = static_cast<KestroCell&>(*cell);
    kestroCell.setKey(QString::number(row));
    kestroCell.setValue(value);
    kestroCell.setLayout();
    return cell;
  }
  KestroCell& cell(int row) { return static_cast<KestroCell&>(*table.cellAtRow(row)); }
  void key(Qt::Key key) { QTest::keyClick(&table, key); }
  /// The middle of a row on the screen.
  QPoint middleOf(int row) {
    return {200, row * kRowHeight - table.verticalScrollBar()->value() + kRowHeight / 2};
  }

  int rowCount = 1000;
  QString value = "v";
  std::vector<int> asked;
  std::vector<int> reused;
  std::vector<int> selected;
  TableView table;
};

TEST_F(TableViewTest, OnlyRowsOnTheScreenHaveCells) {
  EXPECT_NE(table.cellAtRow(0), nullptr);
  EXPECT_NE(table.cellAtRow(9), nullptr);
  EXPECT_EQ(table.cellAtRow(11), nullptr);
  EXPECT_LE(table.cellCount(), 11);
}

TEST_F(TableViewTest, AReloadAsksOnlyForRowsOnTheScreenAndReusesTheirCells) {
  TableCell* before = table.cellAtRow(3);
  asked.clear();
  table.reloadData();
  EXPECT_LE(asked.size(), 11);
  EXPECT_EQ(reused, asked);
  EXPECT_EQ(table.cellAtRow(3), before);
}

TEST_F(TableViewTest, RowsAreOfOneHeightOneBelowTheOther) {
  EXPECT_EQ(table.cellAtRow(0)->y(), 0);
  EXPECT_EQ(table.cellAtRow(3)->y(), 3 * kRowHeight);
  EXPECT_EQ(table.cellAtRow(3)->height(), kRowHeight - 1);  // and a hairline
}

TEST_F(TableViewTest, ScrollingFarKeepsTheNumberOfCellsBounded) {
  for (int row = 0; row < rowCount; ++row) table.scrollToRow(row);
  EXPECT_LE(table.cellCount(), 3 * 11 + 1);
  EXPECT_EQ(cell(999).key(), "999");
}

TEST_F(TableViewTest, ACellThatComesBackIsThatOfItsRow) {
  TableCell* before = table.cellAtRow(0);
  table.verticalScrollBar()->setValue(2 * kRowHeight);
  EXPECT_EQ(table.cellAtRow(0), nullptr);
  table.verticalScrollBar()->setValue(0);
  EXPECT_EQ(table.cellAtRow(0), before);
}

TEST_F(TableViewTest, AnotherIdentifierHandsNoCellOut) {
  EXPECT_EQ(table.dequeueReusableCell("other", 0), nullptr);
}

TEST_F(TableViewTest, ArrowsMoveTheFocusOnly) {
  key(Qt::Key_Down);
  EXPECT_EQ(table.focusedRow(), 0);
  key(Qt::Key_Down);
  key(Qt::Key_Down);
  key(Qt::Key_Up);
  EXPECT_EQ(table.focusedRow(), 1);
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, TheFocusStopsAtBothEnds) {
  key(Qt::Key_End);
  key(Qt::Key_Down);
  EXPECT_EQ(table.focusedRow(), 999);
  key(Qt::Key_Home);
  key(Qt::Key_Up);
  EXPECT_EQ(table.focusedRow(), 0);
}

TEST_F(TableViewTest, TheFocusedRowIsScrolledIntoView) {
  key(Qt::Key_End);
  EXPECT_EQ(table.verticalScrollBar()->value(), 1000 * kRowHeight - kHeight);
  key(Qt::Key_Home);
  EXPECT_EQ(table.verticalScrollBar()->value(), 0);
  key(Qt::Key_PageDown);
  EXPECT_EQ(table.focusedRow(), 9);
}

TEST_F(TableViewTest, EnterSelectsTheFocusedRow) {
  key(Qt::Key_Down);
  key(Qt::Key_Return);
  key(Qt::Key_Down);
  key(Qt::Key_Enter);
  EXPECT_THAT(selected, ElementsAre(0, 1));
}

TEST_F(TableViewTest, EnterWithoutAFocusedRowSelectsTheFirst) {
  key(Qt::Key_Return);
  EXPECT_THAT(selected, ElementsAre(0));
  EXPECT_EQ(table.focusedRow(), 0);
}

TEST_F(TableViewTest, AnEmptyTableTakesKeys) {
  rowCount = 0;
  table.reloadData();
  for (const Qt::Key press : {Qt::Key_Down, Qt::Key_Up, Qt::Key_End, Qt::Key_Return}) key(press);
  EXPECT_EQ(table.focusedRow(), -1);
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, AClickSelectsItsRowAndMovesTheFocusThere) {
  QTest::mouseClick(table.viewport(), Qt::LeftButton, {}, middleOf(4));
  EXPECT_THAT(selected, ElementsAre(4));
  EXPECT_EQ(table.focusedRow(), 4);
  EXPECT_EQ(table.selectedRow(), 4);
  table.deselectRow();
  EXPECT_EQ(table.selectedRow(), -1);
}

TEST_F(TableViewTest, AClickBelowTheLastRowSelectsNothing) {
  rowCount = 2;
  table.reloadData();
  QTest::mouseClick(table.viewport(), Qt::LeftButton, {}, middleOf(5));
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, ARowIsPressedUntilThePointerLeavesIt) {
  QTest::mousePress(table.viewport(), Qt::LeftButton, {}, middleOf(2));
  EXPECT_TRUE(table.cellAtRow(2)->isPressed());
  QTest::mouseMove(table.viewport(), middleOf(4));
  EXPECT_FALSE(table.cellAtRow(2)->isPressed());
  QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, middleOf(4));
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, ASidewaysMovementMovesTheRowsContent) {
  value = QString(100, u'0');
  table.reloadData();
  QTest::mousePress(table.viewport(), Qt::LeftButton, {}, middleOf(1));
  QTest::mouseMove(table.viewport(), middleOf(1) - QPoint(40, 0));
  QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, middleOf(1) - QPoint(40, 0));
  EXPECT_EQ(cell(1).containerOffset(), 40);
  EXPECT_EQ(cell(2).containerOffset(), 0);
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, RightAndLeftMoveTheFocusedRowsContent) {
  value = QString(100, u'0');
  table.reloadData();
  key(Qt::Key_Down);
  key(Qt::Key_Right);
  EXPECT_GT(cell(0).containerOffset(), 0);
  key(Qt::Key_Left);
  EXPECT_EQ(cell(0).containerOffset(), 0);
}

TEST_F(TableViewTest, ATapSelectsItsRow) {
  const std::unique_ptr<QPointingDevice> device(QTest::createTouchDevice());
  const QPoint place = table.viewport()->mapTo(&table, middleOf(3));
  QTest::touchEvent(&table, device.get()).press(0, place, &table);
  QTest::touchEvent(&table, device.get()).release(0, place, &table);
  EXPECT_THAT(selected, ElementsAre(3));
}

TEST_F(TableViewTest, AFingerThatMovesScrollsAndSelectsNothing) {
  const std::unique_ptr<QPointingDevice> device(QTest::createTouchDevice());
  QTest::touchEvent(&table, device.get()).press(0, QPoint(200, 400), &table);
  for (int y = 390; y >= 100; y -= 10) {
    QTest::qWait(2);
    QTest::touchEvent(&table, device.get()).move(0, QPoint(200, y), &table);
  }
  QTest::touchEvent(&table, device.get()).release(0, QPoint(200, 100), &table);
  EXPECT_THAT(selected, IsEmpty());
  EXPECT_GT(table.verticalScrollBar()->value(), 100);
}

TEST_F(TableViewTest, ATouchThatTheSystemTakesAwaySelectsNothing) {
  const std::unique_ptr<QPointingDevice> device(QTest::createTouchDevice());
  QTest::touchEvent(&table, device.get()).press(0, middleOf(3), &table);
  ASSERT_TRUE(cell(3).isPressed());
  QTouchEvent cancel(QEvent::TouchCancel, device.get());  // it comes without points
  QCoreApplication::sendEvent(table.viewport(), &cancel);
  EXPECT_FALSE(cell(3).isPressed());
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, ATableThatIsDisabledTakesNoTouch) {
  const std::unique_ptr<QPointingDevice> device(QTest::createTouchDevice());
  const QPoint place = table.viewport()->mapTo(&table, middleOf(3));
  table.setEnabled(false);
  QTest::touchEvent(&table, device.get()).press(0, place, &table);
  QTest::touchEvent(&table, device.get()).release(0, place, &table);
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, ADisabledTableForgetsThatARowIsPressed) {
  const std::unique_ptr<QPointingDevice> device(QTest::createTouchDevice());
  const QPoint place = table.viewport()->mapTo(&table, middleOf(3));
  QTest::touchEvent(&table, device.get()).press(0, place, &table);
  ASSERT_TRUE(cell(3).isPressed());
  table.setEnabled(false);
  EXPECT_FALSE(cell(3).isPressed());
  table.setEnabled(true);
  QTest::touchEvent(&table, device.get()).release(0, place, &table);
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, AFingerThatStopsCoastingRowsSelectsNone) {
  const std::unique_ptr<QPointingDevice> device(QTest::createTouchDevice());
  QTest::touchEvent(&table, device.get()).press(0, QPoint(200, 400), &table);
  for (int y = 380; y >= 100; y -= 40) {
    QTest::qWait(5);
    QTest::touchEvent(&table, device.get()).move(0, QPoint(200, y), &table);
  }
  QTest::touchEvent(&table, device.get()).release(0, QPoint(200, 100), &table);
  const int released = table.verticalScrollBar()->value();
  ASSERT_TRUE(QTest::qWaitFor([&] { return table.verticalScrollBar()->value() > released; }));
  QTest::touchEvent(&table, device.get()).press(0, QPoint(200, 200), &table);
  QTest::touchEvent(&table, device.get()).release(0, QPoint(200, 200), &table);
  EXPECT_THAT(selected, IsEmpty());
}

TEST_F(TableViewTest, AWideTableKeepsItsRowsInAColumnInTheMiddle) {
  table.resize(1760, kHeight);
  const int inside = table.viewport()->width();
  EXPECT_EQ(table.cellAtRow(0)->width(), 760);
  EXPECT_EQ(table.cellAtRow(0)->x(), (inside - 760) / 2);
}

}  // namespace
}  // namespace kestro
