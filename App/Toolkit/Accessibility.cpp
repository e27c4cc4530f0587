// SPDX-License-Identifier: MIT
#include "App/Toolkit/Accessibility.h"

#include <QAccessibleWidget>
#include <QWidget>
#include <algorithm>
#include <array>

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

QAccessibleInterface* makeInterface(const QString& className, QObject* object) {
  auto* widget = qobject_cast<QWidget*>(object);
  const auto found = std::ranges::find(kRoles, className, &ClassRole::className);
  if (widget == nullptr || found == kRoles.end()) return nullptr;
  return new QAccessibleWidget(widget, found->role);
}

}  // namespace

void installAccessibility() { QAccessible::installFactory(makeInterface); }

}  // namespace kestro
