// SPDX-License-Identifier: MIT
// The program's window.
#pragma once

#include <QWidget>
#include <functional>
#include <memory>

#include "App/Toolkit/NavigationController.h"
#include "App/Toolkit/NoticeBar.h"

namespace kestro {

/// Holds a navigation stack, which it owns, below the lines of a notice bar. It is empty at first.
/// Ctrl-Q and Ctrl-W close it, F11 gives it the whole screen and takes that back.
class MainWindow : public QWidget {
  Q_OBJECT

 public:
  MainWindow();

  void setNavController(std::unique_ptr<NavigationController> navController);

  [[nodiscard]] NoticeBar& noticeBar() const noexcept { return *_noticeBar; }

  /// Called once, while the window is painted for the first time.
  void setFirstFrameHandler(std::function<void()> handler) { _firstFrame = std::move(handler); }

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  void placeParts();
  void addShortcuts();
  void toggleFullScreen();

  NoticeBar* _noticeBar;
  NavigationController* _navController = nullptr;
  std::function<void()> _firstFrame;
};

}  // namespace kestro
