// SPDX-License-Identifier: MIT
// The bar at the bottom of a screen, and what stands in it.
#pragma once

#include <QKeySequence>
#include <QString>
#include <QWidget>
#include <functional>
#include <vector>

class QHBoxLayout;

namespace kestro {

/// One thing in a toolbar, from left to right.
struct ToolbarItem {
  enum class Kind { ActivityIndicator, Label, FlexibleSpace, Button };

  [[nodiscard]] static ToolbarItem activityIndicator(bool isAnimating);
  [[nodiscard]] static ToolbarItem label(QString text);
  [[nodiscard]] static ToolbarItem flexibleSpace();
  /// `shortcut` presses it too, while the screen is on top.
  [[nodiscard]] static ToolbarItem button(QString title, const QKeySequence& shortcut,
                                          std::function<void()> action);

  Kind kind = Kind::FlexibleSpace;
  QString text = {};
  bool isAnimating = false;
  QKeySequence shortcut = {};
  std::function<void()> action = {};
};

class Toolbar : public QWidget {
  Q_OBJECT

 public:
  static constexpr int kHeight = 48;

  explicit Toolbar(QWidget* parent = nullptr);

  /// Shows these items. Where their kinds are those of the items before, in number and order, the
  /// widgets stay and only change what they show. New widgets fade in when `animated`.
  void setItems(std::vector<ToolbarItem> items, bool animated);
  [[nodiscard]] const std::vector<ToolbarItem>& items() const noexcept { return _items; }
  /// The widget that shows an item.
  [[nodiscard]] QWidget* widgetOfItem(std::size_t index) const { return _widgets.at(index); }

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  void rebuild(bool animated);
  [[nodiscard]] QWidget* makeWidget(std::size_t index);
  void fill(std::size_t index);

  std::vector<ToolbarItem> _items;
  std::vector<QWidget*> _widgets;  ///< one an item, owned as children
  QHBoxLayout* _layout;
};

}  // namespace kestro
