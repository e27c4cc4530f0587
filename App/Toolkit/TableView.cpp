// SPDX-License-Identifier: MIT
#include "App/Toolkit/TableView.h"

#include <QAccessible>
#include <QApplication>
#include <QClipboard>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QPainter>
#include <QScrollBar>
#include <QScroller>
#include <QToolTip>
#include <QTouchEvent>
#include <QWheelEvent>
#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

#include "App/Toolkit/Colours.h"
#include "App/Toolkit/Column.h"

namespace kestro {
namespace {

constexpr int kHairlineIndent = 16;
constexpr qreal kSidewaysStep = 60;

void setUpScrolling(QWidget* viewport) {
  viewport->setAttribute(Qt::WA_AcceptTouchEvents);
  QScrollerProperties properties = QScroller::scroller(viewport)->scrollerProperties();
  properties.setScrollMetric(QScrollerProperties::HorizontalOvershootPolicy,
                             QScrollerProperties::OvershootAlwaysOff);
  properties.setScrollMetric(QScrollerProperties::VerticalOvershootPolicy,
                             QScrollerProperties::OvershootAlwaysOff);
  QScroller::scroller(viewport)->setScrollerProperties(properties);
}

}  // namespace

TableView::TableView(QWidget* parent)
    : QAbstractScrollArea(parent), _scrollBar(new ThinScrollBar(this)) {
  setFrameShape(QFrame::NoFrame);
  setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
  setVerticalScrollBar(_scrollBar);
  setFocusPolicy(Qt::StrongFocus);
  viewport()->setAutoFillBackground(false);
  verticalScrollBar()->setSingleStep(_rowHeight);
  setUpScrolling(viewport());
  _touchClock.start();
}

TableView::~TableView() = default;

QSize TableView::sizeHint() const { return {320, contentHeight()}; }

// --- Rows and cells ------------------------------------------------------------------------------

void TableView::reloadData() {
  _reusable.merge(std::exchange(_cells, {}));
  _rowCount = _source.numberOfRows ? _source.numberOfRows() : 0;
  _rowHeight = rowHeight();
  _reusable.erase(_reusable.lower_bound(_rowCount), _reusable.end());
  if (_focusedRow >= _rowCount) _focusedRow = _rowCount - 1;
  if (_selectedRow >= _rowCount) _selectedRow = -1;
  if (_pressedRow >= _rowCount) _pressedRow = -1;
  updateScrollRange();
  layoutRows();
}

std::unique_ptr<TableCell> TableView::dequeueReusableCell(const QString& identifier, int row) {
  const auto found = _reusable.find(row);
  if (found == _reusable.end() || found->second->reuseIdentifier() != identifier) return nullptr;
  return std::move(_reusable.extract(found).mapped());
}

TableCell* TableView::cellAtRow(int row) const {
  const auto found = _cells.find(row);
  return found == _cells.end() ? nullptr : found->second.get();
}

void TableView::updateScrollRange() {
  const int height = viewport()->height();
  verticalScrollBar()->setPageStep(height);
  verticalScrollBar()->setRange(0, std::max(0, contentHeight() - height));
}

void TableView::layoutRows() {
  const int top = verticalScrollBar()->value();
  const int first = top / _rowHeight;
  const int last = std::min(_rowCount - 1, (top + viewport()->height()) / _rowHeight);
  retireCells(first, last);
  for (int row = first; row <= last; ++row) showRow(row);
  // What a row on the screen had and did not take again.
  _reusable.erase(_reusable.lower_bound(first), _reusable.upper_bound(last));
  updateStates();
  viewport()->update();
}

/// Cells of rows off the screen are kept while they are near it.
void TableView::retireCells(int first, int last) {
  for (auto entry = _cells.begin(); entry != _cells.end();) {
    auto& [row, cell] = *entry;
    const bool isShown = row >= first && row <= last;
    if (!isShown) {
      cell->hide();
      _reusable.insert_or_assign(row, std::move(cell));
    }
    entry = isShown ? std::next(entry) : _cells.erase(entry);
  }
  const int near = last - first + 1;
  std::erase_if(_reusable, [&](const auto& entry) {
    return entry.first < first - near || entry.first > last + near;
  });
}

void TableView::showRow(int row) {
  const Column column = columnIn(viewport()->width());
  auto& cell = _cells[row];
  const bool isNew = cell == nullptr;
  if (isNew) cell = _source.cellForRow(row);
  // A row's last pixel is its hairline.
  const QRect place(column.left, row * _rowHeight - verticalScrollBar()->value(), column.width,
                    _rowHeight - 1);
  if (cell->parentWidget() != viewport()) cell->setParent(viewport());
  cell->setGeometry(place);
  cell->setOpenHandler([this, row] { select(row); });
  if (isNew) cell->show();
}

void TableView::updateStates() {
  for (const auto& [row, cell] : _cells) {
    cell->setFocusShown(_showsFocus && hasFocus() && row == _focusedRow);
    const bool isPressed = _movement == Movement::Pressed && row == _pressedRow;
    cell->setPressed(isPressed || row == _selectedRow);
  }
}

void TableView::scrollContentsBy(int, int) { layoutRows(); }

void TableView::resizeEvent(QResizeEvent* event) {
  QAbstractScrollArea::resizeEvent(event);
  updateScrollRange();
  layoutRows();
}

void TableView::changeEvent(QEvent* event) {
  QAbstractScrollArea::changeEvent(event);
  if (event->type() == QEvent::FontChange && _source.cellForRow) reloadData();
  if (event->type() == QEvent::EnabledChange && !isEnabled()) cancelPress();
}

void TableView::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  const Column column = columnIn(viewport()->width());
  QPainter painter(viewport());
  _scrollBar->setGround(column.left > 0 ? colours.ground : colours.row);
  painter.fillRect(viewport()->rect(), colours.ground);
  painter.fillRect(QRect(column.left, 0, column.width, viewport()->height()), colours.row);
  if (column.left > 0) {
    painter.fillRect(QRect(column.left - 1, 0, 1, viewport()->height()), colours.hairline);
    painter.fillRect(QRect(column.left + column.width, 0, 1, viewport()->height()),
                     colours.hairline);
  }
  for (const auto& [row, cell] : _cells) {
    painter.fillRect(QRect(column.left + kHairlineIndent, cell->geometry().bottom() + 1,
                           column.width - kHairlineIndent, 1),
                     colours.hairline);
  }
}

// --- Focus and selection -------------------------------------------------------------------------

void TableView::setFocusedRow(int row) {
  _focusedRow = std::clamp(row, std::min(0, _rowCount - 1), std::max(-1, _rowCount - 1));
  updateStates();
}

void TableView::scrollToRow(int row) {
  QScrollBar* bar = verticalScrollBar();
  const int top = row * _rowHeight;
  const int lowest = top + _rowHeight - viewport()->height();
  bar->setValue(std::clamp(bar->value(), std::min(lowest, top), top));
}

void TableView::deselectRow() {
  _selectedRow = -1;
  updateStates();
}

void TableView::select(int row) {
  if (row < 0 || row >= _rowCount) return;
  _focusedRow = row;
  _selectedRow = row;
  updateStates();
  if (_source.rowSelected) _source.rowSelected(row);
}

void TableView::focusInEvent(QFocusEvent* event) {
  QAbstractScrollArea::focusInEvent(event);
  const Qt::FocusReason reason = event->reason();
  if (reason == Qt::TabFocusReason || reason == Qt::BacktabFocusReason) {
    focusByKey(std::max(0, _focusedRow));
  }
  updateStates();
}

void TableView::focusOutEvent(QFocusEvent* event) {
  QAbstractScrollArea::focusOutEvent(event);
  updateStates();
}

void TableView::focusByKey(int row) {
  _showsFocus = true;
  setFocusedRow(row);
  if (_focusedRow < 0) return;
  scrollToRow(_focusedRow);
  announceFocus();
}

void TableView::announceFocus() const {
  if (TableCell* cell = cellAtRow(_focusedRow)) {
    QAccessibleEvent event(cell, QAccessible::Focus);
    QAccessible::updateAccessibility(&event);
  }
}

// --- Keys ----------------------------------------------------------------------------------------

void TableView::keyPressEvent(QKeyEvent* event) {
  if (const auto row = rowAfter(*event)) {
    focusByKey(*row);
  } else {
    event->setAccepted(actOnFocus(*event));
  }
}

std::optional<int> TableView::rowAfter(const QKeyEvent& event) const {
  if ((event.modifiers() & ~Qt::KeypadModifier) != Qt::NoModifier) return std::nullopt;
  const int page = std::max(1, viewport()->height() / _rowHeight - 1);
  // The first arrow shows where the focus is, or takes it to the first row.
  const int step = _focusedRow >= 0 ? 1 : 0;
  const int from = std::max(0, _focusedRow);
  switch (event.key()) {
    case Qt::Key_Up:
      return from - step;
    case Qt::Key_Down:
      return from + step;
    case Qt::Key_PageUp:
      return from - page;
    case Qt::Key_PageDown:
      return from + page;
    case Qt::Key_Home:
      return 0;
    case Qt::Key_End:
      return _rowCount - 1;
    default:
      return std::nullopt;
  }
}

bool TableView::actOnFocus(const QKeyEvent& event) {
  if (event.matches(QKeySequence::Copy)) {
    if (!_source.textOfRow || _focusedRow < 0) return false;
    const QString text = _source.textOfRow(_focusedRow);
    QGuiApplication::clipboard()->setText(text);
    if (_source.copied) _source.copied(text);
    return true;
  }
  TableCell* cell = cellAtRow(_focusedRow);
  switch (event.key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Select:
      if (_focusedRow < 0) focusByKey(0);
      select(_focusedRow);
      return _focusedRow >= 0;
    case Qt::Key_Left:
      return cell != nullptr && cell->scrollContentBy(-kSidewaysStep);
    case Qt::Key_Right:
      return cell != nullptr && cell->scrollContentBy(kSidewaysStep);
    default:
      return false;
  }
}

// --- Mouse and touch -----------------------------------------------------------------------------

int TableView::rowAt(const QPoint& position) const {
  const Column column = columnIn(viewport()->width());
  const bool isInside = position.x() >= column.left && position.x() < column.left + column.width;
  const int row = (position.y() + verticalScrollBar()->value()) / _rowHeight;
  return isInside && position.y() >= 0 && row < _rowCount ? row : -1;
}

void TableView::press(int row) {
  _pressedRow = row;
  updateStates();
}

void TableView::pressAt(const QPointF& position) {
  _showsFocus = false;
  _movement = Movement::Pressed;
  _pressPosition = _lastPosition = position;
  press(rowAt(position.toPoint()));
}

void TableView::moveTo(const QPointF& position) {
  if (_movement == Movement::Pressed) {
    const QPointF moved = position - _pressPosition;
    if (moved.manhattanLength() < QApplication::startDragDistance()) return;
    const bool isSideways = std::abs(moved.x()) > std::abs(moved.y());
    _movement = isSideways ? Movement::Sideways : Movement::Elsewhere;
    updateStates();
  }
  if (_movement == Movement::Sideways) pan(position);
}

void TableView::releaseAt(const QPointF& position) {
  const Movement movement = std::exchange(_movement, Movement::None);
  const int row = std::exchange(_pressedRow, -1);
  updateStates();
  if (movement != Movement::Pressed || row < 0 || row != rowAt(position.toPoint())) return;
  _showsFocus = true;
  select(row);
}

void TableView::cancelPress() {
  QScroller::scroller(viewport())->stop();
  _movement = Movement::None;
  press(-1);
}

void TableView::mousePressEvent(QMouseEvent* event) {
  event->setAccepted(event->button() == Qt::LeftButton);
  if (event->isAccepted()) pressAt(event->position());
}

void TableView::mouseMoveEvent(QMouseEvent* event) { moveTo(event->position()); }

void TableView::mouseReleaseEvent(QMouseEvent* event) {
  if (event->button() == Qt::LeftButton) releaseAt(event->position());
}

void TableView::showToolTip(const QHelpEvent& event) const {
  const TableCell* cell = cellAtRow(rowAt(event.pos()));
  QToolTip::showText(event.globalPos(), cell == nullptr ? QString() : cell->hiddenText(),
                     viewport());
}

bool TableView::viewportEvent(QEvent* event) {
  switch (event->type()) {
    case QEvent::ToolTip:
      showToolTip(static_cast<QHelpEvent&>(*event));
      return true;
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
      // Touches come to a table that is disabled all the same.
      if (isEnabled()) touch(static_cast<QTouchEvent&>(*event));
      event->accept();
      return true;
    case QEvent::TouchCancel:  // the system takes the touch away: there are no points
      cancelPress();
      event->accept();
      return true;
    default:
      return QAbstractScrollArea::viewportEvent(event);
  }
}

/// One finger presses, moves content sideways, or scrolls; it stops rows that coast, too.
void TableView::touch(const QTouchEvent& event) {
  QScroller* scroller = QScroller::scroller(viewport());
  const QPointF position = event.points().first().position();
  const auto scroll = [&](QScroller::Input input) {
    scroller->handleInput(input, position, _touchClock.elapsed());
  };
  if (event.type() == QEvent::TouchBegin) {
    const bool coasts = scroller->state() == QScroller::Scrolling;
    pressAt(position);
    if (coasts) _movement = Movement::Elsewhere;
    scroll(QScroller::InputPress);
  } else if (event.type() == QEvent::TouchUpdate) {
    moveTo(position);
    if (_movement != Movement::Sideways) scroll(QScroller::InputMove);
  } else {
    scroll(QScroller::InputRelease);
    releaseAt(position);
  }
}

void TableView::pan(const QPointF& position) {
  const qreal distance = std::exchange(_lastPosition, position).x() - position.x();
  if (TableCell* cell = cellAtRow(_pressedRow)) cell->scrollContentBy(distance);
}

void TableView::wheelEvent(QWheelEvent* event) {
  const QPoint pixels =
      event->pixelDelta().isNull() ? event->angleDelta() / 2 : event->pixelDelta();
  const bool isShifted = (event->modifiers() & Qt::ShiftModifier) != 0;
  if (!isShifted && std::abs(pixels.x()) <= std::abs(pixels.y())) {
    QAbstractScrollArea::wheelEvent(event);
    return;
  }
  const int distance = pixels.x() != 0 ? pixels.x() : pixels.y();
  TableCell* cell = cellAtRow(rowAt(event->position().toPoint()));
  if (cell != nullptr) cell->scrollContentBy(-distance);
  event->accept();
}

}  // namespace kestro
