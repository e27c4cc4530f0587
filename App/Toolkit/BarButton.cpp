// SPDX-License-Identifier: MIT
#include "App/Toolkit/BarButton.h"

#include <QKeyEvent>
#include <QPainter>
#include <array>
#include <cmath>

#include "App/Toolkit/Colours.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {
namespace {

constexpr int kButtonPoints = 15;
constexpr int kPadding = 12;
constexpr int kHeight = 36;
constexpr qreal kArrowWidth = 16;
constexpr qreal kButtonRadius = 8;
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
  const TextStyle& style = systemTextStyle(kButtonPoints, QFont::Bold);
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
  paintFrame(painter, colours.accent);
  const bool isFilled = _shape == Shape::Filled;
  const QColor ink = isFilled ? readable(colours.row, colours.accent) : colours.accent;
  painter.setOpacity(isEnabled() ? 1 : 0.4);
  painter.setPen(QPen(ink, 2.4, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  paintContent(painter);
}

void BarButton::paintFrame(QPainter& painter, QColor fill) const {
  const qreal lit = isDown() ? 0.2 : underMouse() ? 0.1 : 0.0;
  painter.setPen(hasFocus() ? QPen(fill, 2) : QPen(Qt::NoPen));
  fill.setAlphaF(static_cast<float>(_shape == Shape::Filled ? 1 - lit : lit));
  painter.setBrush(fill);
  painter.drawRoundedRect(QRectF(rect()).adjusted(1, 1, -1, -1), kButtonRadius, kButtonRadius);
}

void BarButton::paintContent(QPainter& painter) const {
  const TextStyle& style = systemTextStyle(kButtonPoints, _isStrong ? QFont::Bold : QFont::Normal);
  const qreal room = width() - textIndent() - kPadding / 2.0;
  const QString shown = style.elided(text(), room);
  QRectF frame(textIndent(), 0, room, height());
  if (_shape == Shape::Back) {
    painter.translate(0, height() * 0.5);
    painter.drawPolyline(kArrow.data(), static_cast<int>(kArrow.size()));
    painter.translate(0, height() * -0.5);
  } else {
    frame.moveLeft((width() - style.size(shown).width()) * 0.5);
  }
  style.draw(painter, frame, shown);
}

}  // namespace kestro
