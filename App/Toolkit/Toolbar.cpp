// SPDX-License-Identifier: MIT
#include "App/Toolkit/Toolbar.h"

#include <QGraphicsOpacityEffect>
#include <QHBoxLayout>
#include <QLabel>
#include <QPainter>
#include <QPropertyAnimation>
#include <algorithm>
#include <utility>

#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/BarButton.h"
#include "App/Toolkit/Colours.h"
#include "App/Toolkit/Column.h"
#include "App/Toolkit/Motion.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {
namespace {

constexpr int kToolbarMargin = 16;
constexpr int kSpacing = 8;
constexpr int kLabelPoints = 14;

/// A text sized to fit, on one line, with figures of equal width.
class BarLabel : public QLabel {
 public:
  explicit BarLabel(QWidget* parent) : QLabel(parent) {
    setTextFormat(Qt::PlainText);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
  }

  [[nodiscard]] QSize sizeHint() const override {
    return systemTextStyle(kLabelPoints).size(text()).toSize() + QSize(1, 0);
  }
  [[nodiscard]] QSize minimumSizeHint() const override { return {0, sizeHint().height()}; }

 protected:
  void paintEvent(QPaintEvent*) override {
    QPainter painter(this);
    painter.setPen(coloursOf(palette()).text);
    const TextStyle& style = systemTextStyle(kLabelPoints);
    style.draw(painter, rect(), style.elided(text(), width()));
  }
};

void fadeIn(QWidget& widget) {
  auto* effect = new QGraphicsOpacityEffect(&widget);
  widget.setGraphicsEffect(effect);
  auto* animation = new QPropertyAnimation(effect, "opacity", effect);
  animation->setDuration(motionMilliseconds(widget));
  animation->setStartValue(0.0);
  animation->setEndValue(1.0);
  QObject::connect(animation, &QPropertyAnimation::finished, &widget,
                   [&widget] { widget.setGraphicsEffect(nullptr); });
  animation->start();
}

}  // namespace

ToolbarItem ToolbarItem::activityIndicator(bool isAnimating) {
  return {.kind = Kind::ActivityIndicator, .isAnimating = isAnimating};
}

ToolbarItem ToolbarItem::label(QString text) {
  return {.kind = Kind::Label, .text = std::move(text)};
}

ToolbarItem ToolbarItem::flexibleSpace() { return {.kind = Kind::FlexibleSpace}; }

ToolbarItem ToolbarItem::button(QString title, const QKeySequence& shortcut,
                                std::function<void()> action) {
  return {.kind = Kind::Button,
          .text = std::move(title),
          .shortcut = shortcut,
          .action = std::move(action)};
}

Toolbar::Toolbar(QWidget* parent) : QWidget(parent), _layout(new QHBoxLayout(this)) {
  setFixedHeight(kHeight);
  setAccessibleName(tr("Status"));
  _layout->setSpacing(kSpacing);
}

void Toolbar::setItems(std::vector<ToolbarItem> items, bool animated) {
  const bool sameKinds =
      std::ranges::equal(items, _items, {}, &ToolbarItem::kind, &ToolbarItem::kind);
  _items = std::move(items);
  if (!sameKinds) rebuild(animated);
  for (std::size_t i = 0; i < _items.size(); ++i) fill(i);
  _layout->activate();  // the same frame shows texts and their room
}

void Toolbar::rebuild(bool animated) {
  for (QWidget* widget : std::exchange(_widgets, {})) delete widget;
  for (std::size_t i = 0; i < _items.size(); ++i) {
    QWidget* widget = makeWidget(i);
    const bool isSpace = _items[i].kind == ToolbarItem::Kind::FlexibleSpace;
    _layout->addWidget(widget, isSpace ? 1 : 0);
    _widgets.push_back(widget);
    if (animated && !isSpace && motionMilliseconds(*this) > 0) fadeIn(*widget);
  }
}

QWidget* Toolbar::makeWidget(std::size_t index) {
  switch (_items[index].kind) {
    case ToolbarItem::Kind::ActivityIndicator:
      return new ActivityIndicator(this);
    case ToolbarItem::Kind::Label:
      return new BarLabel(this);
    case ToolbarItem::Kind::FlexibleSpace:
      return new QWidget(this);
    case ToolbarItem::Kind::Button:
      break;
  }
  auto* button = new BarButton(this);
  button->setStrong(true);
  connect(button, &BarButton::clicked, this, [this, index] { _items[index].action(); });
  return button;
}

void Toolbar::fill(std::size_t index) {
  const ToolbarItem& item = _items[index];
  QWidget* widget = _widgets[index];
  if (item.kind == ToolbarItem::Kind::Label) {
    static_cast<BarLabel*>(widget)->setText(item.text);
    widget->setToolTip(item.text);  // it may be elided
  }
  if (item.kind == ToolbarItem::Kind::Button) static_cast<BarButton*>(widget)->setText(item.text);
  if (item.kind != ToolbarItem::Kind::ActivityIndicator) return;
  auto* indicator = static_cast<ActivityIndicator*>(widget);
  if (item.isAnimating) {
    indicator->startAnimating();
  } else {
    indicator->stopAnimating();
  }
}

void Toolbar::resizeEvent(QResizeEvent*) {
  const int margin = columnIn(width()).left + kToolbarMargin;
  _layout->setContentsMargins(margin, 1, margin - kSpacing, 0);
}

void Toolbar::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  QPainter painter(this);
  painter.fillRect(rect(), colours.bar);
  painter.fillRect(QRect(0, 0, width(), 1), colours.hairline);
}

}  // namespace kestro
