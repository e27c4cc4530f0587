// SPDX-License-Identifier: MIT
#include "App/Toolkit/AlertView.h"

#include <QKeyEvent>
#include <QPainter>
#include <algorithm>

#include "App/Toolkit/Colours.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {
namespace {

constexpr int kAlertTitlePoints = 17;
constexpr int kMessagePoints = 14;
constexpr int kPanelWidth = 300;
constexpr int kPanelHeight = 152;
constexpr int kAlertMargin = 20;
constexpr int kLineGap = 8;
constexpr qreal kAlertRadius = 14;
constexpr QColor kShade(0, 0, 0, 110);

}  // namespace

AlertView::AlertView(const QString& title, const QString& message, const QString& buttonTitle,
                     QWidget* parent)
    : QWidget(parent), _title(title), _message(message), _button(new BarButton(this)) {
  setAccessibleName(title);
  setAccessibleDescription(message);
  setFocusProxy(_button);
  _button->setText(buttonTitle);
  _button->setShape(BarButton::Shape::Filled);
  _button->setStrong(true);
  connect(_button, &BarButton::clicked, this, [this] { dismiss(); });
  parent->installEventFilter(this);
}

/// What it covers must not be reached by keys, and must not take them back.
void AlertView::setCoveredEnabled(bool enabled) {
  const auto siblings = parentWidget()->findChildren<QWidget*>(Qt::FindDirectChildrenOnly);
  for (QWidget* sibling : siblings) {
    if (sibling != this) sibling->setEnabled(enabled);
  }
}

void AlertView::open() {
  setCoveredEnabled(false);
  setGeometry(parentWidget()->rect());
  show();
  raise();
  _button->setFocus(Qt::ActiveWindowFocusReason);
}

void AlertView::dismiss() {
  hide();
  setCoveredEnabled(true);
  parentWidget()->setFocus();
  deleteLater();
}

QRect AlertView::panel() const {
  QRect result(0, 0, std::min(kPanelWidth, width() - 2 * kAlertMargin), kPanelHeight);
  result.moveCenter(rect().center());
  return result;
}

void AlertView::resizeEvent(QResizeEvent*) {
  const QRect frame = panel().adjusted(kAlertMargin, 0, -kAlertMargin, -kAlertMargin);
  const int height = _button->sizeHint().height();
  _button->setGeometry(frame.left(), frame.bottom() - height, frame.width(), height);
}

void AlertView::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.fillRect(rect(), kShade);
  painter.setPen(colours.hairline);
  painter.setBrush(colours.row);
  painter.drawRoundedRect(QRectF(panel()).adjusted(0.5, 0.5, -0.5, -0.5), kAlertRadius,
                          kAlertRadius);

  qreal top = panel().top() + kAlertMargin;
  const auto centred = [&](const TextStyle& style, const QString& text) {
    const QSizeF size = style.size(text);
    style.draw(painter, QRectF(QPointF(panel().center().x() - size.width() / 2, top), size), text);
    top += size.height() + kLineGap;
  };
  painter.setPen(colours.text);
  centred(systemTextStyle(kAlertTitlePoints, QFont::Bold), _title);
  painter.setPen(colours.faintText);
  centred(systemTextStyle(kMessagePoints), _message);
}

void AlertView::keyPressEvent(QKeyEvent* event) {
  const int key = event->key();
  if (key == Qt::Key_Escape || key == Qt::Key_Return || key == Qt::Key_Enter) dismiss();
}

void AlertView::mousePressEvent(QMouseEvent*) {}  // nothing behind it can be pressed

bool AlertView::focusNextPrevChild(bool) { return true; }  // the button keeps the focus

bool AlertView::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::Resize) setGeometry(parentWidget()->rect());
  return QWidget::eventFilter(watched, event);
}

}  // namespace kestro
