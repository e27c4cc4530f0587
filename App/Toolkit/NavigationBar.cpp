// SPDX-License-Identifier: MIT
#include "App/Toolkit/NavigationBar.h"

#include <QPainter>
#include <algorithm>

#include "App/Toolkit/Colours.h"
#include "App/Toolkit/Column.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {
namespace {

constexpr int kBarTitlePoints = 17;
constexpr int kBarMargin = 8;
constexpr qreal kShift = 90;
/// The part of the column that the way back may take from the title.
constexpr qreal kBackShare = 0.34;

}  // namespace

NavigationBar::NavigationBar(QWidget* parent) : QWidget(parent), _back(new BarButton(this)) {
  setFixedHeight(kHeight);
  _back->setShape(BarButton::Shape::Back);
  _back->hide();
}

void NavigationBar::setTitles(const QString& title, const QString& backTitle) {
  _title = title;
  setAccessibleName(title);
  setToolTip(title);  // it may be elided
  _back->setVisible(!backTitle.isNull());
  _back->setText(backTitle);
  _back->setAccessibleName(tr("Back to %1").arg(backTitle));
  placeBackButton();
  update();
}

void NavigationBar::placeBackButton() {
  const Column column = columnIn(width());
  const QSize size = _back->sizeHint();
  const int most = static_cast<int>(column.width * kBackShare);
  _back->setGeometry(column.left + kBarMargin, (kHeight - size.height()) / 2,
                     std::min(size.width(), most), size.height());
}

void NavigationBar::resizeEvent(QResizeEvent*) { placeBackButton(); }

void NavigationBar::beginTransition(bool isForward) {
  _earlierTitle = _title;
  _direction = isForward ? 1 : -1;
  _progress = 0;
}

void NavigationBar::setTransition(qreal progress) {
  _progress = progress;
  update();
}

void NavigationBar::paintTitle(QPainter& painter, const QString& title, qreal shift,
                               qreal opacity) const {
  const TextStyle& style = systemTextStyle(kBarTitlePoints, QFont::Bold);
  const Column column = columnIn(width());
  // In the middle of the bar, unless the way back needs the room.
  const qreal left =
      _back->isHidden() ? column.left + kBarMargin : _back->geometry().right() + kBarMargin;
  const qreal right = column.left + column.width - 2.0 * kBarMargin;
  const QString shown = style.elided(title, right - left);
  const qreal textWidth = style.size(shown).width();
  const qreal middle = (width() - textWidth) * 0.5;
  painter.setOpacity(opacity);
  style.draw(painter,
             QRectF(std::max(left, std::min(middle, right - textWidth)) + shift * _direction, 0,
                    textWidth, kHeight),
             shown);
}

void NavigationBar::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  QPainter painter(this);
  painter.fillRect(rect(), colours.bar);
  painter.fillRect(QRect(0, height() - 1, width(), 1), colours.hairline);
  painter.setPen(colours.text);
  if (_progress < 1) paintTitle(painter, _earlierTitle, -kShift * _progress, 1 - _progress);
  paintTitle(painter, _title, kShift * (1 - _progress), _progress);
}

}  // namespace kestro
