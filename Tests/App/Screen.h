// SPDX-License-Identifier: MIT
// What is to be seen on the screen, as text.
#pragma once

#include <string>
#include <vector>

#include "App/Panes/KestroCell.h"
#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/TableView.h"
#include "App/Toolkit/Toolbar.h"

namespace kestro::testing {

/// A row of a pane: "name = value", "name >" where it opens, "name" where it shows nothing more.
inline std::string textOfCell(const TableCell& tableCell) {
  const auto& cell = static_cast<const KestroCell&>(tableCell);
  const std::string key = cell.key().toStdString();
  if (cell.accessory() == CellAccessory::DisclosureIndicator) return key + " >";
  return cell.valueLabel() ? key + " = " + cell.value().toStdString() : key;
}

/// The rows on the screen.
inline std::vector<std::string> rowsOf(const TableView& table) {
  std::vector<std::string> result;
  for (int row = 0; row < table.rowCount(); ++row) {
    if (const TableCell* cell = table.cellAtRow(row)) result.push_back(textOfCell(*cell));
  }
  return result;
}

inline std::string statusOf(const Toolbar& toolbar) {
  for (const ToolbarItem& item : toolbar.items()) {
    if (item.kind == ToolbarItem::Kind::Label) return item.text.toStdString();
  }
  return "no label";
}

inline bool isLoadingShown(const Toolbar& toolbar) {
  const auto* indicator = static_cast<ActivityIndicator*>(toolbar.widgetOfItem(0));
  return indicator->isAnimating() && !indicator->isHidden();
}

/// The kinds of the items, from left to right.
inline std::string kindsOf(const std::vector<ToolbarItem>& items) {
  std::string result;
  for (const ToolbarItem& item : items) {
    switch (item.kind) {
      case ToolbarItem::Kind::ActivityIndicator:
        result += "indicator ";
        break;
      case ToolbarItem::Kind::Label:
        result += "label ";
        break;
      case ToolbarItem::Kind::FlexibleSpace:
        result += "space ";
        break;
      case ToolbarItem::Kind::Button:
        result += "button ";
        break;
    }
  }
  return result;
}

}  // namespace kestro::testing
