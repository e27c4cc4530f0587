// SPDX-License-Identifier: MIT
#include "App/Toolkit/NoticeBar.h"

#include <QAccessible>
#include <QEvent>
#include <QLabel>
#include <QPainter>
#include <algorithm>
#include <utility>

#include "App/Toolkit/BarButton.h"
#include "App/Toolkit/Colours.h"
#include "App/Toolkit/Column.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {
namespace {

constexpr int kNoticePoints = 13;
constexpr int kNoticeMargin = 16;
constexpr int kNoticePadding = 5;

/// A path may be wrapped behind each of its folders and hyphens.
QString wrappable(QString text) {
  for (const QChar sign : {u'/', u'-'}) text.replace(sign, QString(sign) + QChar(0x200b));
  return text;
}

int textHeight(const QLabel& label, int width) {
  return label.isHidden() ? 0 : label.heightForWidth(width) + 2 * kNoticePadding;
}

}  // namespace

NoticeBar::NoticeBar(QWidget* parent)
    : QWidget(parent),
      _origin(new QLabel(this)),
      _notice(new QLabel(this)),
      _message(new QLabel(this)),
      _button(new BarButton(this)) {
  for (QLabel* label : {_origin, _notice, _message}) {
    label->setTextFormat(Qt::PlainText);
    label->setWordWrap(label != _origin);
    label->hide();
  }
  _button->hide();
  connect(_button, &BarButton::clicked, this, [this] {
    if (const auto pressed = _pressed) pressed();
    hideMessage();
  });
  _messageTimer.setSingleShot(true);
  connect(&_messageTimer, &QTimer::timeout, this, [this] { hideMessage(); });
  updateFonts();
}

QString NoticeBar::notice() const { return _notice->text(); }
QString NoticeBar::message() const { return _message->text().remove(QChar(0x200b)); }

void NoticeBar::setOrigin(const QString& text) {
  if (std::exchange(_originText, text) == text) return;
  _origin->setVisible(!text.isEmpty());
  _origin->setToolTip(text);
  _origin->setAccessibleName(text);
  contentsChanged();
}

void NoticeBar::setNotice(const QString& text) {
  if (_notice->text() == text) return;
  _notice->setText(text);
  _notice->setVisible(!text.isEmpty());
  contentsChanged();
}

void NoticeBar::showMessage(const QString& text, const QString& buttonTitle,
                            std::function<void()> pressed) {
  _pressed = std::move(pressed);
  _message->setText(wrappable(text));
  _message->setVisible(!text.isEmpty());
  _button->setText(buttonTitle);
  _button->setVisible(!buttonTitle.isEmpty());
  _messageTimer.start(kMessageMilliseconds);
  QAccessibleEvent event(_message, QAccessible::Alert);
  QAccessible::updateAccessibility(&event);
  contentsChanged();
}

void NoticeBar::hideMessage() {
  _pressed = {};
  _message->clear();
  _message->hide();
  _button->hide();
  contentsChanged();
}

void NoticeBar::contentsChanged() {
  if (_heightChanged) _heightChanged();
  placeLines();
  update();
}

void NoticeBar::updateFonts() {
  _origin->setFont(systemTextStyle(kNoticePoints).font());
  _notice->setFont(systemTextStyle(kNoticePoints, QFont::Bold).font());
  _message->setFont(systemTextStyle(kNoticePoints).font());
}

int NoticeBar::heightForWidth(int width) const {
  const int room = columnIn(width).width - 2 * kNoticeMargin;
  const int button = _button->isHidden() ? 0 : _button->sizeHint().width();
  const int message = textHeight(*_message, std::max(1, room - button));
  const int origin = _origin->isHidden() ? 0 : _origin->fontMetrics().height() + 2 * kNoticePadding;
  return origin + textHeight(*_notice, room) +
         (_button->isHidden() ? message : std::max(message, _button->sizeHint().height()));
}

void NoticeBar::placeLines() {
  const Column column = columnIn(width());
  const int left = column.left + kNoticeMargin;
  const int room = column.width - 2 * kNoticeMargin;
  int top = 0;
  if (!_origin->isHidden()) {
    const QFontMetrics metrics = _origin->fontMetrics();
    _origin->setText(metrics.elidedText(_originText, Qt::ElideMiddle, room));
    _origin->setGeometry(left, top + kNoticePadding, room, metrics.height());
    top += metrics.height() + 2 * kNoticePadding;
  }
  if (!_notice->isHidden()) {
    const int height = textHeight(*_notice, room);
    _notice->setGeometry(left, top + kNoticePadding, room, height - 2 * kNoticePadding);
    top += height;
  }
  if (_message->isHidden()) return;
  const int button = _button->isHidden() ? 0 : _button->sizeHint().width();
  _message->setGeometry(left, top, std::max(1, room - button), height() - top);
  const int buttonHeight = _button->sizeHint().height();
  _button->setGeometry(left + room - button + kNoticePadding,
                       top + (height() - top - buttonHeight) / 2, button, buttonHeight);
}

void NoticeBar::resizeEvent(QResizeEvent*) { placeLines(); }

void NoticeBar::changeEvent(QEvent* event) {
  QWidget::changeEvent(event);
  if (event->type() != QEvent::ApplicationFontChange) return;
  updateFonts();
  contentsChanged();
}

void NoticeBar::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  constexpr QColor kAmber(0xff, 0xb3, 0x00);
  QPainter painter(this);
  painter.fillRect(rect(), colours.bar);
  if (!_notice->isHidden()) {
    const QRect place(0, _notice->y() - kNoticePadding, width(),
                      _notice->height() + 2 * kNoticePadding);
    painter.fillRect(place, mixed(colours.bar, kAmber, 0.25));
  }
  painter.fillRect(QRect(0, height() - 1, width(), 1), colours.hairline);
}

}  // namespace kestro
