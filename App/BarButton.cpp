// SPDX-License-Identifier: MIT
#include "App/BarButton.h"

#include <QKeyEvent>
#include <QPainter>
#include <array>
#include <cmath>

#include "App/Colours.h"
#include "App/TextStyle.h"

namespace kestro {
namespace {

constexpr int kPoints = 15;
constexpr int kPadding = 12;
constexpr int kHeight = 36;
constexpr qreal kArrowWidth = 16;
constexpr qreal kRadius = 8;
constexpr std::array kArrow = {QPointF(9, -6.5), QPointF(2.5, 0), QPointF(9, 6.5)};

}  // namespace

BarButton::BarButton(QWidget* parent) : QAbstractButton(parent) {
  setFocusPolicy(Qt::TabFocus);
  setAttribute(Qt::WA_Hover);
  setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
}

void BarButton::setShape(Shape shape) {
  _shape = shape;
  updateGeometry();
  update();
}

void BarButton::setStrong(bool strong) {
  _isStrong = strong;
  updateGeometry();
  update();
}

qreal BarButton::textIndent() const { return _shape == Shape::Back ? kArrowWidth : kPadding; }

QSize BarButton::sizeHint() const {
  const TextStyle& style = systemTextStyle(kPoints, QFont::Bold);
  const qreal width = textIndent() + style.size(text()).width() + kPadding;
  return {static_cast<int>(std::ceil(width)), kHeight};
}

void BarButton::enterEvent(QEnterEvent*) { update(); }
void BarButton::leaveEvent(QEvent*) { update(); }

void BarButton::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter) {
    click();
  } else {
    QAbstractButton::keyPressEvent(event);
  }
}

void BarButton::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  const bool isFilled = _shape == Shape::Filled;
  QColor fill = colours.accent;
  const qreal lit = isDown() ? 0.2 : underMouse() ? 0.1 : 0.0;
  fill.setAlphaF(static_cast<float>(isFilled ? 1 - lit : lit));
  const QRectF frame = QRectF(rect()).adjusted(1, 1, -1, -1);
  painter.setPen(hasFocus() ? QPen(colours.accent, 2) : QPen(Qt::NoPen));
  painter.setBrush(fill);
  painter.drawRoundedRect(frame, kRadius, kRadius);

  const QColor ink = isFilled ? readable(colours.row, colours.accent) : colours.accent;
  painter.setOpacity(isEnabled() ? 1 : 0.4);
  painter.setPen(QPen(ink, 2.4, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  if (_shape == Shape::Back) {
    painter.translate(0, height() * 0.5);
    painter.drawPolyline(kArrow.data(), static_cast<int>(kArrow.size()));
    painter.translate(0, height() * -0.5);
  }
  const TextStyle& style = systemTextStyle(kPoints, _isStrong ? QFont::Bold : QFont::Normal);
  const qreal room = width() - textIndent() - kPadding / 2.0;
  const QString shown = style.elided(text(), room);
  const qreal slack =
      _shape == Shape::Back ? 0 : (room - style.size(shown).width()) * 0.5 - kPadding / 4.0;
  style.draw(painter, QRectF(textIndent() + slack, 0, room, height()), shown);
}

}  // namespace kestro
