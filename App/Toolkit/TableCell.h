// SPDX-License-Identifier: MIT
// One row of a table on the screen.
#pragma once

#include <QRectF>
#include <QString>
#include <QVariantAnimation>
#include <QWidget>
#include <functional>
#include <utility>

namespace kestro {

/// The height of every row at usual text sizes.
inline constexpr int kRowHeight = 50;

/// The height of every row: two lines of text find room.
[[nodiscard]] int rowHeight();

enum class CellAccessory { None, DisclosureIndicator, Checkmark };

/// A cell that derived classes paint their content into. The table that shows it owns it, places
/// it, and hands it out again for other rows under its reuse identifier.
class TableCell : public QWidget {
  Q_OBJECT

 public:
  explicit TableCell(QString reuseIdentifier);

  [[nodiscard]] const QString& reuseIdentifier() const noexcept { return _reuseIdentifier; }

  [[nodiscard]] CellAccessory accessory() const noexcept { return _accessory; }
  void setAccessory(CellAccessory accessory);

  /// The area for content, from (0, 0): the cell without its margins and its accessory.
  [[nodiscard]] QRectF contentBounds() const;

  /// Moves content that is wider than its area by `distance` pixels. False when nothing moved.
  virtual bool scrollContentBy(qreal distance);

  /// What its area is too narrow to show, for a tooltip; empty when all is shown.
  [[nodiscard]] virtual QString hiddenText() const { return {}; }

  /// Marks the content as changed for a moment.
  void markChanged();
  [[nodiscard]] bool isMarkedChanged() const noexcept { return _mark > 0; }

  /// States that the table sets.
  void setFocusShown(bool shown);
  [[nodiscard]] bool isFocusShown() const noexcept { return _isFocusShown; }
  /// Selects the row as a click would; for aids that have no mouse.
  void setOpenHandler(std::function<void()> opened) { _opened = std::move(opened); }
  void open() const {
    if (const auto opened = _opened) opened();
  }
  void setPressed(bool pressed);
  [[nodiscard]] bool isPressed() const noexcept { return _isPressed; }

 protected:
  /// Paints the content; the painter's origin is that of the content area, and it is clipped to it.
  virtual void paintContent(QPainter& painter) = 0;
  /// Places the content anew, after the content area has changed.
  virtual void layoutContent() {}
  /// The part of the content area that a mark of change stands behind.
  [[nodiscard]] virtual QRectF markedArea() const { return contentBounds(); }

  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  void setMark(qreal strength);
  void paintAccessory(QPainter& painter) const;

  QString _reuseIdentifier;
  CellAccessory _accessory = CellAccessory::None;
  QVariantAnimation _fading;
  qreal _mark = 0;  ///< how strong the mark of change is, from 0 to 1
  bool _isFocusShown = false;
  bool _isPressed = false;
  std::function<void()> _opened;
};

}  // namespace kestro
