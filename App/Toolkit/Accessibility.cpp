// SPDX-License-Identifier: MIT
#include "App/Toolkit/Accessibility.h"

#include <QAccessibleWidget>
#include <QWidget>
#include <algorithm>
#include <array>

#include "App/Toolkit/TableCell.h"

namespace kestro {
namespace {

struct ClassRole {
  const char* className;
  QAccessible::Role role;
};

/// By class; a derived class has its base's role.
constexpr std::array kRoles = {
    ClassRole{"kestro::TableView", QAccessible::List},
    ClassRole{"kestro::TableCell", QAccessible::ListItem},
    ClassRole{"kestro::ActivityIndicator", QAccessible::Animation},
    ClassRole{"kestro::AlertView", QAccessible::AlertMessage},
    ClassRole{"kestro::Toolbar", QAccessible::ToolBar},
    ClassRole{"kestro::ViewController", QAccessible::Pane},
};

/// A row: it can be selected and opened, which is one for a table.
class CellInterface : public QAccessibleWidget {
 public:
  explicit CellInterface(TableCell& cell) : QAccessibleWidget(&cell, QAccessible::ListItem) {}

  [[nodiscard]] QAccessible::State state() const override {
    QAccessible::State state = QAccessibleWidget::state();
    state.selectable = state.focusable = true;
    state.selected = state.focused = cell().isFocusShown();
    return state;
  }
  [[nodiscard]] QStringList actionNames() const override { return {pressAction()}; }
  void doAction(const QString& action) override {
    if (action == pressAction()) cell().open();
  }

 private:
  [[nodiscard]] TableCell& cell() const { return *static_cast<TableCell*>(widget()); }
};

QAccessibleInterface* makeInterface(const QString& className, QObject* object) {
  auto* widget = qobject_cast<QWidget*>(object);
  const auto found = std::ranges::find(kRoles, className, &ClassRole::className);
  if (widget == nullptr || found == kRoles.end()) return nullptr;
  if (auto* cell = qobject_cast<TableCell*>(widget)) return new CellInterface(*cell);
  return new QAccessibleWidget(widget, found->role);
}

}  // namespace

void installAccessibility() { QAccessible::installFactory(makeInterface); }

}  // namespace kestro
