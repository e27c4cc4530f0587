// SPDX-License-Identifier: MIT
#include "App/Toolkit/ActivityIndicator.h"

#include <QPainter>
#include <QTimerEvent>

#include "App/Toolkit/Colours.h"

namespace kestro {
namespace {

constexpr int kSize = 20;
constexpr int kSpokes = 12;
constexpr int kStepMilliseconds = 80;
constexpr QLineF kSpoke(0, -4.5, 0, -8.5);
constexpr qreal kSpokeWidth = 1.8;

}  // namespace

ActivityIndicator::ActivityIndicator(QWidget* parent) : QWidget(parent) {
  setFixedSize(kSize, kSize);
  setAccessibleName(tr("Working"));
  setVisible(false);
}

QSize ActivityIndicator::sizeHint() const { return {kSize, kSize}; }

void ActivityIndicator::startAnimating() {
  _isAnimating = true;
  setVisible(true);
  updateTimer();
}

void ActivityIndicator::stopAnimating() {
  _isAnimating = false;
  setVisible(false);
  updateTimer();
}

void ActivityIndicator::updateTimer() {
  if (!_isAnimating || !isVisible()) {
    _timer.stop();
  } else if (!_timer.isActive()) {
    _timer.start(kStepMilliseconds, this);
  }
}

void ActivityIndicator::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  updateTimer();
}

void ActivityIndicator::hideEvent(QHideEvent* event) {
  QWidget::hideEvent(event);
  updateTimer();
}

void ActivityIndicator::timerEvent(QTimerEvent* event) {
  if (event->timerId() != _timer.timerId()) return QWidget::timerEvent(event);
  _step = (_step + 1) % kSpokes;
  update();
}

void ActivityIndicator::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.translate(QRectF(rect()).center());
  for (int i = 0; i < kSpokes; ++i) {
    const int age = (_step - i + kSpokes) % kSpokes;  // 0 is the newest spoke
    const qreal strength = 1.0 - 0.8 * age / kSpokes;
    painter.setPen(QPen(mixed(colours.bar, colours.faintText, strength), kSpokeWidth, Qt::SolidLine,
                        Qt::RoundCap));
    painter.save();
    painter.rotate(360.0 * i / kSpokes);
    painter.drawLine(kSpoke);
    painter.restore();
  }
}

}  // namespace kestro
