// SPDX-License-Identifier: MIT
#include "App/Toolkit/NavigationController.h"

#include <QKeyEvent>
#include <QMouseEvent>
#include <iterator>
#include <utility>

#include "App/Toolkit/Motion.h"

namespace kestro {
namespace {

/// How far the lower screen moves, in parts of its width, while the upper one moves all of it.
constexpr qreal kParallax = 0.3;

void setUpAnimation(QVariantAnimation& animation) {
  animation.setStartValue(0.0);
  animation.setEndValue(1.0);
  animation.setEasingCurve(QEasingCurve::OutCubic);
}

bool isBackKey(const QKeyEvent& event) {
  return event.key() == Qt::Key_Backspace || event.key() == Qt::Key_Escape ||
         event.key() == Qt::Key_Back || event.matches(QKeySequence::Back);
}

}  // namespace

NavigationController::NavigationController(std::unique_ptr<ViewController> root, QWidget* parent)
    : QWidget(parent),
      _bar(new NavigationBar(this)),
      _area(new QWidget(this)),
      _toolbar(new Toolbar(this)) {
  setUpAnimation(_slide);
  setUpAnimation(_sheetSlide);
  connect(&_slide, &QVariantAnimation::valueChanged, this,
          [this](const QVariant& value) { placeScreens(value.toDouble()); });
  connect(&_slide, &QVariantAnimation::finished, this, [this] { finishSlide(); });
  connect(&_sheetSlide, &QVariantAnimation::valueChanged, this,
          [this](const QVariant& value) { placeSheet(value.toDouble()); });
  connect(&_sheetSlide, &QVariantAnimation::finished, this, [this] { finishSheet(); });
  connect(&_bar->backButton(), &BarButton::clicked, this, [this] { popViewController(true); });
  adopt(*root);
  root->viewWillAppear(false);
  root->show();
  _screens.push_back(std::move(root));
  updateBars(false);
  setFocusProxy(&topViewController());
}

NavigationController::~NavigationController() {
  _slide.stop();
  _sheetSlide.stop();
}

void NavigationController::adopt(ViewController& screen) {
  screen.setParent(_area);
  screen.hide();
  screen.resize(_area->size());
  screen.setChangeHandler([this, &screen](bool animated) {
    if (!_screens.empty() && &screen == &topViewController()) updateBars(animated);
  });
}

QRect NavigationController::screenArea() const {
  return rect().adjusted(0, NavigationBar::kHeight, 0, -Toolbar::kHeight);
}

void NavigationController::resizeEvent(QResizeEvent*) {
  finishSlide();
  finishSheet();
  _bar->setGeometry(0, 0, width(), NavigationBar::kHeight);
  _area->setGeometry(screenArea());
  _toolbar->setGeometry(0, height() - Toolbar::kHeight, width(), Toolbar::kHeight);
  for (const auto& screen : _screens) screen->resize(_area->size());
  if (_sheet) _sheet->setGeometry(rect());
}

void NavigationController::updateBars(bool animated) {
  const QString back = _screens.size() > 1 ? _screens[_screens.size() - 2]->title() : QString();
  _bar->setTitles(topViewController().title(), back);
  _toolbar->setItems(topViewController().toolbarItems(), animated);
}

// --- The stack -----------------------------------------------------------------------------------

void NavigationController::pushViewController(std::unique_ptr<ViewController> screen,
                                              bool animated) {
  finishSlide();
  adopt(*screen);
  ViewController& earlier = topViewController();
  _screens.push_back(std::move(screen));
  bringIn(earlier, true, animated);
}

void NavigationController::popViewController(bool animated) {
  if (_screens.size() > 1) popToIndex(_screens.size() - 2, animated);
}

void NavigationController::popToIndex(std::size_t index, bool animated) {
  if (index + 1 >= _screens.size()) return;
  finishSlide();
  ViewController& earlier = topViewController();
  const auto first = std::next(_screens.begin(), static_cast<std::ptrdiff_t>(index) + 1);
  std::move(first, _screens.end(), std::back_inserter(_leaving));
  _screens.erase(first, _screens.end());
  bringIn(earlier, false, animated);
}

void NavigationController::bringIn(ViewController& earlier, bool isForward, bool animated) {
  ViewController& top = topViewController();
  const int duration = animated && isVisible() ? motionMilliseconds(*this) : 0;
  _bar->beginTransition(isForward);
  earlier.viewWillDisappear(animated);
  top.viewWillAppear(animated);
  if (_willShow) _willShow(top, animated);
  updateBars(false);

  _earlier = &earlier;
  _isForward = isForward;
  setFocusProxy(&top);
  top.show();
  (isForward ? top : earlier).raise();
  if (!_sheet) top.setFocus();
  earlier.setEnabled(false);
  if (duration == 0) return finishSlide();
  placeScreens(0);
  _slide.setDuration(duration);
  _slide.start();
}

void NavigationController::placeScreens(qreal progress) {
  if (!_earlier) return;
  const qreal width = _area->width();
  // The upper screen comes from, or goes to, the right edge.
  const qreal out = _isForward ? -kParallax * width * progress : width * progress;
  const qreal in = _isForward ? width * (1 - progress) : -kParallax * width * (1 - progress);
  _earlier->move(qRound(out), 0);
  topViewController().move(qRound(in), 0);
  _bar->setTransition(progress);
}

void NavigationController::finishSlide() {
  _slide.stop();
  if (!_earlier) return;
  _earlier->hide();
  _earlier->setEnabled(true);
  _earlier = nullptr;
  topViewController().move(0, 0);
  _bar->setTransition(1);
  // A popped screen may be the one whose handler asked for this.
  for (auto& screen : std::exchange(_leaving, {})) screen.release()->deleteLater();
}

bool NavigationController::isMoving() const {
  return _slide.state() == QAbstractAnimation::Running ||
         _sheetSlide.state() == QAbstractAnimation::Running;
}

// --- The sheet -----------------------------------------------------------------------------------

void NavigationController::present(std::unique_ptr<QWidget> sheet, bool animated) {
  finishSheet();
  topViewController().viewWillDisappear(animated);
  setCoveredEnabled(false);
  _sheet = sheet.release();
  _sheet->setParent(this);
  _sheet->setGeometry(rect());
  _sheet->show();
  _sheet->raise();
  _sheet->setFocus();
  const int duration = animated && isVisible() ? motionMilliseconds(*this) : 0;
  if (duration == 0) return;
  placeSheet(0);
  _sheetSlide.setDuration(duration);
  _sheetSlide.start();
}

void NavigationController::dismiss(bool animated) {
  if (!_sheet) return;
  finishSheet();
  _leavingSheet = _sheet;
  _sheet = nullptr;
  _leavingSheet->setEnabled(false);
  setCoveredEnabled(true);
  topViewController().viewWillAppear(animated);
  topViewController().setFocus();
  const int duration = animated && isVisible() ? motionMilliseconds(*this) : 0;
  if (duration == 0) return finishSheet();
  _sheetSlide.setDuration(duration);
  _sheetSlide.start();
}

/// What the sheet covers must not be reached by Tab either.
void NavigationController::setCoveredEnabled(bool enabled) {
  for (QWidget* widget : {static_cast<QWidget*>(_bar), _area, static_cast<QWidget*>(_toolbar)}) {
    widget->setEnabled(enabled);
  }
}

void NavigationController::placeSheet(qreal progress) {
  if (_leavingSheet) {
    _leavingSheet->move(0, qRound(height() * progress));
  } else if (_sheet) {
    _sheet->move(0, qRound(height() * (1 - progress)));
  }
}

void NavigationController::finishSheet() {
  _sheetSlide.stop();
  if (_sheet) _sheet->move(0, 0);
  if (!_leavingSheet) return;
  _leavingSheet->hide();
  _leavingSheet->deleteLater();
  _leavingSheet = nullptr;
}

// --- Keys and buttons ----------------------------------------------------------------------------

bool NavigationController::pressShortcut(const QKeyEvent& event) {
  const QKeySequence pressed(event.keyCombination());
  for (const ToolbarItem& item : topViewController().toolbarItems()) {
    if (item.shortcut.isEmpty() || item.shortcut.matches(pressed) != QKeySequence::ExactMatch) {
      continue;
    }
    const auto action = item.action;  // it may change the items
    action();
    return true;
  }
  return false;
}

void NavigationController::keyPressEvent(QKeyEvent* event) {
  if (_sheet) return;  // what the sheet does not use is not for what it covers
  if (isBackKey(*event)) {
    popViewController(true);
  } else if (!pressShortcut(*event)) {
    event->ignore();
  }
}

void NavigationController::mousePressEvent(QMouseEvent* event) {
  if (!_sheet && event->button() == Qt::BackButton) popViewController(true);
}

}  // namespace kestro
