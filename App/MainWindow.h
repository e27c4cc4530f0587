// SPDX-License-Identifier: MIT
// The program's window.
#pragma once

#include <QWidget>
#include <functional>
#include <memory>

#include "App/Toolkit/NavigationController.h"

namespace kestro {

/// Holds a navigation stack, which fills it and which it owns. It is empty at first.
class MainWindow : public QWidget {
  Q_OBJECT

 public:
  MainWindow();

  void setNavController(std::unique_ptr<NavigationController> navController);

  /// Called once, while the window is painted for the first time.
  void setFirstFrameHandler(std::function<void()> handler) { _firstFrame = std::move(handler); }

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  NavigationController* _navController = nullptr;
  std::function<void()> _firstFrame;
};

}  // namespace kestro
