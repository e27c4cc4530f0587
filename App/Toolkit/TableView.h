// SPDX-License-Identifier: MIT
// A table of one section, with rows of one height and cells that are used again.
#pragma once

#include <QAbstractScrollArea>
#include <QElapsedTimer>
#include <QPointF>
#include <functional>
#include <map>
#include <memory>
#include <optional>

#include "App/Toolkit/TableCell.h"
#include "App/Toolkit/ThinScrollBar.h"

class QHelpEvent;
class QTouchEvent;

namespace kestro {

/// Only rows on the screen have cells. It scrolls by wheel, scroll bar, keys and, kinetically, by
/// touch; a sideways movement moves the content of the row under it. Arrows, Page Up and Down, Home
/// and End move the focus from row to row; Enter selects the focused row, as a click or tap does a
/// row; Enter without a focused row selects the first. The focus shows once a key has moved it or
/// a row was clicked. Events that it has no use for go to its parent.
class TableView : public QAbstractScrollArea {
  Q_OBJECT

 public:
  /// Where rows come from; each function is called often and must not change the table.
  struct DataSource {
    std::function<int()> numberOfRows;
    /// Makes the cell for a row, or fills one that `dequeueReusableCell` hands out.
    std::function<std::unique_ptr<TableCell>(int row)> cellForRow;
    std::function<void(int row)> rowSelected;
    /// What copying a row puts on the clipboard; without the function nothing is copied.
    std::function<QString(int row)> textOfRow;
    /// Told what was put there.
    std::function<void(const QString& text)> copied = {};
  };

  explicit TableView(QWidget* parent = nullptr);
  ~TableView() override;
  void setDataSource(DataSource source) { _source = std::move(source); }

  /// Reads all rows anew. Scroll position, focus and cells stay with their row numbers.
  void reloadData();
  /// The cell that this row had before under the identifier, for `cellForRow` to fill anew; null
  /// when there is none, and a new one is to be made.
  [[nodiscard]] std::unique_ptr<TableCell> dequeueReusableCell(const QString& identifier, int row);

  [[nodiscard]] int rowCount() const noexcept { return _rowCount; }
  /// The cell of a row on the screen, else null.
  [[nodiscard]] TableCell* cellAtRow(int row) const;
  /// How many cells exist, on the screen and kept for rows near it.
  [[nodiscard]] std::size_t cellCount() const { return _cells.size() + _reusable.size(); }

  /// The row that keys act on; -1 for none.
  [[nodiscard]] int focusedRow() const noexcept { return _focusedRow; }
  /// Moves the focus; a row that does not exist means the nearest, or none in an empty table.
  void setFocusedRow(int row);
  /// Moves the focus to a row that exists after the next reload.
  void focusRowAtReload(int row) noexcept { _focusedRow = row; }
  void scrollToRow(int row);

  /// The row that was selected last and is not deselected; -1 for none.
  [[nodiscard]] int selectedRow() const noexcept { return _selectedRow; }
  void deselectRow();

  /// The height of all rows, so that nothing has to be scrolled.
  [[nodiscard]] int contentHeight() const noexcept { return _rowCount * _rowHeight; }
  [[nodiscard]] QSize sizeHint() const override;

 protected:
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;
  void wheelEvent(QWheelEvent* event) override;
  bool viewportEvent(QEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void paintEvent(QPaintEvent* event) override;
  void focusInEvent(QFocusEvent* event) override;
  void focusOutEvent(QFocusEvent* event) override;
  void changeEvent(QEvent* event) override;
  void scrollContentsBy(int dx, int dy) override;

 private:
  using Cells = std::map<int, std::unique_ptr<TableCell>>;

  [[nodiscard]] int rowAt(const QPoint& position) const;
  void layoutRows();
  void updateScrollRange();
  void showRow(int row);
  void retireCells(int first, int last);
  void updateStates();
  void select(int row);
  /// The row that a key moves the focus to; absent for keys that do not move it.
  [[nodiscard]] std::optional<int> rowAfter(const QKeyEvent& event) const;
  [[nodiscard]] bool actOnFocus(const QKeyEvent& event);
  void focusByKey(int row);
  void press(int row);
  void pressAt(const QPointF& position);
  void moveTo(const QPointF& position);
  void releaseAt(const QPointF& position);
  void cancelPress();
  void touch(const QTouchEvent& event);
  void pan(const QPointF& position);
  void announceFocus() const;
  void showToolTip(const QHelpEvent& event) const;

  ThinScrollBar* _scrollBar;
  DataSource _source;
  Cells _cells;     ///< of the rows on the screen
  Cells _reusable;  ///< of rows near it, and of those being reloaded
  int _rowCount = 0;
  int _rowHeight = kRowHeight;
  int _focusedRow = -1;
  int _selectedRow = -1;
  bool _showsFocus = false;

  enum class Movement { None, Pressed, Sideways, Elsewhere };
  Movement _movement = Movement::None;
  int _pressedRow = -1;
  QPointF _pressPosition;
  QPointF _lastPosition;
  QElapsedTimer _touchClock;
};

}  // namespace kestro
