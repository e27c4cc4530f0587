// SPDX-License-Identifier: MIT
#include "App/Toolkit/TableCell.h"

#include <QPainter>
#include <QPainterPath>
#include <algorithm>
#include <array>
#include <cmath>
#include <utility>

#include "App/Toolkit/Colours.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {
namespace {

constexpr qreal kLeftMargin = 6;  // the content has a margin of its own
constexpr qreal kRightMargin = 16;
constexpr qreal kAccessoryWidth = 22;
constexpr qreal kFocusBarWidth = 3;

constexpr int kRowPoints = 15;
constexpr int kRowPadding = 8;

constexpr int kMarkMilliseconds = 1600;
constexpr qreal kMarkStrength = 0.26;
constexpr qreal kMarkRadius = 5;

// Strokes around the middle of the accessory.
constexpr std::array kChevron = {QPointF(-3, -5), QPointF(2, 0), QPointF(-3, 5)};
constexpr std::array kCheck = {QPointF(-6, 0), QPointF(-2, 4.5), QPointF(6, -5)};

}  // namespace

int rowHeight() {
  const qreal line = systemTextStyle(kRowPoints, QFont::Bold).size(QStringLiteral("Ag")).height();
  return std::max(kRowHeight, static_cast<int>(std::ceil(2 * line)) + kRowPadding);
}

TableCell::TableCell(QString reuseIdentifier) : _reuseIdentifier(std::move(reuseIdentifier)) {
  // Where a press began and what became of it is the table's to know.
  setAttribute(Qt::WA_TransparentForMouseEvents);
  _fading.setDuration(kMarkMilliseconds);
  _fading.setStartValue(1.0);
  _fading.setEndValue(0.0);
  _fading.setEasingCurve(QEasingCurve::InQuad);
  connect(&_fading, &QVariantAnimation::valueChanged, this,
          [this](const QVariant& value) { setMark(value.toDouble()); });
}

void TableCell::setAccessory(CellAccessory accessory) {
  if (_accessory == accessory) return;
  _accessory = accessory;
  layoutContent();
  update();
}

QRectF TableCell::contentBounds() const {
  const qreal accessoryWidth = _accessory == CellAccessory::None ? 0 : kAccessoryWidth;
  return {0, 0, std::max(0.0, width() - kLeftMargin - kRightMargin - accessoryWidth),
          static_cast<qreal>(height())};
}

bool TableCell::scrollContentBy(qreal) { return false; }

void TableCell::markChanged() {
  _fading.stop();
  _fading.start();
  setMark(1);
}

void TableCell::setMark(qreal strength) {
  _mark = strength;
  update();
}

void TableCell::setFocusShown(bool shown) {
  if (std::exchange(_isFocusShown, shown) != shown) update();
}

void TableCell::setPressed(bool pressed) {
  if (std::exchange(_isPressed, pressed) != pressed) update();
}

void TableCell::resizeEvent(QResizeEvent*) { layoutContent(); }

void TableCell::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  const QColor row = _isFocusShown ? colours.focused : colours.row;
  painter.fillRect(rect(), _isPressed ? colours.pressed : row);
  if (_isFocusShown) painter.fillRect(QRectF(0, 0, kFocusBarWidth, height()), colours.accent);

  painter.save();
  painter.translate(kLeftMargin, 0);
  if (_mark > 0) {
    QColor mark = colours.accent;
    mark.setAlphaF(static_cast<float>(kMarkStrength * _mark));
    painter.setPen(Qt::NoPen);
    painter.setBrush(mark);
    painter.drawRoundedRect(markedArea(), kMarkRadius, kMarkRadius);
  }
  painter.setClipRect(contentBounds());
  painter.setPen(colours.text);
  paintContent(painter);
  painter.restore();

  paintAccessory(painter);
}

void TableCell::paintAccessory(QPainter& painter) const {
  if (_accessory == CellAccessory::None) return;
  const Colours colours = coloursOf(palette());
  const bool isCheck = _accessory == CellAccessory::Checkmark;
  const auto& strokes = isCheck ? kCheck : kChevron;
  const QColor colour = isCheck ? colours.accent : mixed(colours.row, colours.text, 0.4);
  painter.translate(width() - kRightMargin - kAccessoryWidth * 0.5 + 4, height() * 0.5);
  painter.setPen(QPen(colour, 2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter.drawPolyline(strokes.data(), static_cast<int>(strokes.size()));
}

}  // namespace kestro
