// SPDX-License-Identifier: MIT
// A stack of screens between a navigation bar and a toolbar. Only the top screen is seen.
#pragma once

#include <QPointer>
#include <QVariantAnimation>
#include <QWidget>
#include <functional>
#include <memory>
#include <span>
#include <vector>

#include "App/Toolkit/NavigationBar.h"
#include "App/Toolkit/Toolbar.h"
#include "App/Toolkit/ViewController.h"

namespace kestro {

/// The stack owns its screens; one that was popped lives until it has slid out. While screens
/// slide, keys go to the one that comes, and the one that leaves is disabled. Backspace, Escape,
/// the system's "back" keys and mouse button, and the bar's button pop the top screen. The shortcut
/// of a toolbar button presses it.
class NavigationController : public QWidget {
  Q_OBJECT

 public:
  using WillShow = std::function<void(ViewController& screen, bool animated)>;
  using Screens = std::vector<std::unique_ptr<ViewController>>;

  explicit NavigationController(std::unique_ptr<ViewController> root, QWidget* parent = nullptr);
  ~NavigationController() override;

  /// `willShow` is called for every screen that is about to come on top.
  void setWillShow(WillShow willShow) { _willShow = std::move(willShow); }

  /// From the bottom up; never empty.
  [[nodiscard]] std::span<const std::unique_ptr<ViewController>> viewControllers() const noexcept {
    return _screens;
  }
  [[nodiscard]] ViewController& topViewController() const noexcept { return *_screens.back(); }

  void pushViewController(std::unique_ptr<ViewController> screen, bool animated);
  /// Does nothing when the root is on top.
  void popViewController(bool animated);
  /// Pops what is above the screen with this index.
  void popToIndex(std::size_t index, bool animated);

  /// Shows a widget over everything until `dismiss`. The stack owns it. There is one at a time.
  void present(std::unique_ptr<QWidget> sheet, bool animated);
  /// Takes the sheet away; it lives until it has slid out.
  void dismiss(bool animated);
  [[nodiscard]] QWidget* presented() const noexcept { return _sheet; }

  [[nodiscard]] NavigationBar& navigationBar() const noexcept { return *_bar; }
  [[nodiscard]] Toolbar& toolbar() const noexcept { return *_toolbar; }
  [[nodiscard]] bool isMoving() const;

 protected:
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  void adopt(ViewController& screen);
  /// Lets the top screen come in, in place of `earlier`.
  void bringIn(ViewController& earlier, bool isForward, bool animated);
  void placeScreens(qreal progress);
  void finishSlide();
  void updateBars(bool animated);
  void setCoveredEnabled(bool enabled);
  void placeSheet(qreal progress);
  void finishSheet();
  [[nodiscard]] bool pressShortcut(const QKeyEvent& event);
  [[nodiscard]] QRect screenArea() const;

  WillShow _willShow;
  Screens _screens;
  Screens _leaving;  ///< popped, until they have slid out
  NavigationBar* _bar;
  QWidget* _area;  ///< clips the screens
  Toolbar* _toolbar;
  QVariantAnimation _slide;
  QPointer<ViewController> _earlier;  ///< what slides out
  bool _isForward = true;
  QPointer<QWidget> _sheet;
  QPointer<QWidget> _leavingSheet;
  QVariantAnimation _sheetSlide;
};

}  // namespace kestro
