// SPDX-License-Identifier: MIT
#include "App/MainWindow.h"

#include <utility>

namespace kestro {

MainWindow::MainWindow(std::unique_ptr<NavigationController> navController)
    : _navController(navController.release()) {
  _navController->setParent(this);
  setFocusProxy(_navController);
  setMinimumSize(240, 240);
}

void MainWindow::paintEvent(QPaintEvent*) {
  if (const auto handler = std::exchange(_firstFrame, nullptr)) handler();
}

void MainWindow::resizeEvent(QResizeEvent*) { _navController->setGeometry(rect()); }

}  // namespace kestro
