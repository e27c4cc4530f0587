// SPDX-License-Identifier: MIT
#include "App/MainWindow.h"

#include <utility>

namespace kestro {

MainWindow::MainWindow() { setMinimumSize(240, 240); }

void MainWindow::setNavController(std::unique_ptr<NavigationController> navController) {
  delete std::exchange(_navController, navController.release());
  _navController->setParent(this);
  _navController->setGeometry(rect());
  setFocusProxy(_navController);
}

void MainWindow::paintEvent(QPaintEvent*) {
  if (const auto handler = std::exchange(_firstFrame, nullptr)) handler();
}

void MainWindow::resizeEvent(QResizeEvent*) {
  if (_navController != nullptr) _navController->setGeometry(rect());
}

}  // namespace kestro
