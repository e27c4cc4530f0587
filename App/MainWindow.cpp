// SPDX-License-Identifier: MIT
#include "App/MainWindow.h"

#include <QKeySequence>
#include <QShortcut>
#include <utility>

namespace kestro {

MainWindow::MainWindow() : _noticeBar(new NoticeBar(this)) {
  setMinimumSize(240, 240);
  _noticeBar->setHeightHandler([this] { placeParts(); });
  addShortcuts();
}

void MainWindow::addShortcuts() {
  for (const QKeySequence& keys :
       {QKeySequence(Qt::CTRL | Qt::Key_Q), QKeySequence(Qt::CTRL | Qt::Key_W)}) {
    connect(new QShortcut(keys, this), &QShortcut::activated, this, &QWidget::close);
  }
  connect(new QShortcut(QKeySequence(Qt::Key_F11), this), &QShortcut::activated, this,
          &MainWindow::toggleFullScreen);
}

void MainWindow::toggleFullScreen() { setWindowState(windowState() ^ Qt::WindowFullScreen); }

void MainWindow::placeParts() {
  const int top = _noticeBar->heightForWidth(width());
  _noticeBar->setGeometry(0, 0, width(), top);
  if (_navController != nullptr) _navController->setGeometry(0, top, width(), height() - top);
}

void MainWindow::setNavController(std::unique_ptr<NavigationController> navController) {
  delete std::exchange(_navController, navController.release());
  _navController->setParent(this);
  placeParts();
  setFocusProxy(_navController);
}

void MainWindow::paintEvent(QPaintEvent*) {
  if (const auto handler = std::exchange(_firstFrame, nullptr)) handler();
}

void MainWindow::resizeEvent(QResizeEvent*) { placeParts(); }

}  // namespace kestro
