// SPDX-License-Identifier: MIT
// A screen of a navigation stack.
#pragma once

#include <QWidget>
#include <functional>
#include <utility>
#include <vector>

#include "App/Toolkit/Toolbar.h"

namespace kestro {

class ViewController : public QWidget {
  Q_OBJECT

 public:
  explicit ViewController(QWidget* parent = nullptr) : QWidget(parent) {}

  /// Called each time before the screen comes on top, and before it leaves the top.
  virtual void viewWillAppear(bool /*animated*/) {}
  virtual void viewWillDisappear(bool /*animated*/) {}

  [[nodiscard]] const QString& title() const noexcept { return _title; }
  void setTitle(const QString& title) {
    _title = title;
    setAccessibleName(title);
    tellStack(false);
  }

  [[nodiscard]] const std::vector<ToolbarItem>& toolbarItems() const noexcept {
    return _toolbarItems;
  }
  void setToolbarItems(std::vector<ToolbarItem> items, bool animated) {
    _toolbarItems = std::move(items);
    tellStack(animated);
  }

  /// For the stack that holds the screen: told when the title or the items have changed.
  void setChangeHandler(std::function<void(bool animated)> handler) {
    _changed = std::move(handler);
  }

 private:
  void tellStack(bool animated) const {
    if (_changed) _changed(animated);
  }

  QString _title;
  std::vector<ToolbarItem> _toolbarItems;
  std::function<void(bool animated)> _changed;
};

}  // namespace kestro
