// SPDX-License-Identifier: MIT
#include "App/Toolkit/ThinScrollBar.h"

#include <QPainter>
#include <QStyleOptionSlider>

#include "App/Toolkit/Colours.h"

namespace kestro {
namespace {

constexpr int kWidth = 12;
constexpr qreal kHandleWidth = 5;
constexpr qreal kActiveHandleWidth = 7;

}  // namespace

ThinScrollBar::ThinScrollBar(QWidget* parent) : QScrollBar(Qt::Vertical, parent) {
  setAttribute(Qt::WA_Hover);
}

void ThinScrollBar::setGround(const QColor& ground) {
  if (_ground == ground) return;
  _ground = ground;
  update();
}

QSize ThinScrollBar::sizeHint() const { return {kWidth, QScrollBar::sizeHint().height()}; }

void ThinScrollBar::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  QStyleOptionSlider option;
  initStyleOption(&option);
  const QRectF handle =
      style()->subControlRect(QStyle::CC_ScrollBar, &option, QStyle::SC_ScrollBarSlider, this);
  const bool isActive = isSliderDown() || underMouse();
  const qreal handleWidth = isActive ? kActiveHandleWidth : kHandleWidth;
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.fillRect(rect(), _ground);
  painter.setPen(Qt::NoPen);
  painter.setBrush(mixed(_ground, colours.text, isActive ? 0.45 : 0.28));
  painter.drawRoundedRect(QRectF(handle.center().x() - handleWidth / 2, handle.top() + 2,
                                 handleWidth, handle.height() - 4),
                          handleWidth / 2, handleWidth / 2);
}

}  // namespace kestro
