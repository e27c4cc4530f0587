// SPDX-License-Identifier: MIT
#include "App/Panes/KestroPaneController.h"

#include <utility>

#include "Model/NodePair.h"

namespace kestro {
namespace {

const std::vector<NodePointer>& childrenOf(const NodePointer& node) {
  static const std::vector<NodePointer> kNone;
  const std::vector<NodePointer>* children = node ? node->childNodes() : nullptr;
  return children == nullptr ? kNone : *children;
}

QString paneIdentifier() { return QStringLiteral("KestroPaneControllerCell"); }

}  // namespace

KestroPaneController::KestroPaneController(PaneHost& host, NodePointer node, std::string path)
    : _host(host),
      _nodes(std::move(node)),
      _keyPath(std::move(path)),
      _status(QStringLiteral("")),
      _table(new TableView(this)) {
  setFocusProxy(_table);
  _table->setDataSource({.numberOfRows = [this] { return rowCount(); },
                         .cellForRow = [this](int row) { return cellForRow(row); },
                         .rowSelected = [this](int row) { rowSelected(row); },
                         .textOfRow = [this](int row) { return textOfRow(row); },
                         .copied = [this](const QString& text) { _host.rowCopied(text); }});
  updateTitle();
  _table->reloadData();
}

void KestroPaneController::viewWillAppear(bool) {
  updateTitle();
  createToolbarItems();
  _table->deselectRow();
}

void KestroPaneController::viewWillDisappear(bool) { _table->clearFocus(); }

void KestroPaneController::setStatus(const QString& status, bool isLoading) {
  _status = status.isNull() ? QStringLiteral("") : status;
  _isLoading = isLoading;
  createToolbarItems();
}

void KestroPaneController::updateTitle() {
  setTitle(_nodes ? QString::fromStdString(_nodes->displayName()) : QStringLiteral("Kestro"));
  _table->setAccessibleName(title());
}

void KestroPaneController::createToolbarItems() {
  std::vector<ToolbarItem> items{ToolbarItem::activityIndicator(_isLoading),
                                 ToolbarItem::label(_status), ToolbarItem::flexibleSpace()};
  if (_host.allowSaveButton()) {
    items.push_back(
        ToolbarItem::button(tr("Save"), QKeySequence::Save, [this] { _host.showSaveView(); }));
  }
  setToolbarItems(std::move(items), true);
}

// --- Rows ----------------------------------------------------------------------------------------

int KestroPaneController::rowCount() const { return static_cast<int>(childrenOf(_nodes).size()); }

const NodePointer& KestroPaneController::nodeAtRow(int row) const {
  return childrenOf(_nodes)[static_cast<std::size_t>(row)];
}

void KestroPaneController::reloadWithNode(NodePointer node) {
  const int focused = _table->focusedRow();
  const std::string name = focused < 0 ? std::string() : nodeAtRow(focused)->displayName();
  _earlierNodes = std::exchange(_nodes, std::move(node));
  updateTitle();
  if (focused >= 0) keepFocusOn(name);
  _table->reloadData();
  _earlierNodes.reset();
  createToolbarItems();
}

void KestroPaneController::updateRenewal() { _table->reloadData(); }

/// Rows may have come or gone above the one that has the focus.
void KestroPaneController::keepFocusOn(const std::string& name) {
  const int focused = _table->focusedRow();
  const auto row = childPlace(_nodes.get(), static_cast<std::size_t>(focused), name);
  if (row && static_cast<int>(*row) != focused) {
    _table->focusRowAtReload(static_cast<int>(*row));
  }
}

/// A row that is new is not marked.
bool KestroPaneController::hasChanged(int row) const {
  if (!_earlierNodes || !_host.marksChanges()) return false;
  return NodePair(*_nodes, _earlierNodes.get()).child(static_cast<std::size_t>(row)).isChanged();
}

std::unique_ptr<TableCell> KestroPaneController::cellForRow(int row) {
  const KestroModelNode& node = *nodeAtRow(row);
  const bool isTree = node.childNodes() != nullptr;
  // Both kinds share the identifier: a row that changes its kind keeps the cell that it had.
  std::unique_ptr<TableCell> reused = _table->dequeueReusableCell(paneIdentifier(), row);
  std::unique_ptr<KestroCell> cell(static_cast<KestroCell*>(reused.release()));
  if (!cell) {
    cell = std::make_unique<KestroCell>(
        isTree ? KestroCell::Style::Key : KestroCell::Style::KeyValue, paneIdentifier());
  }
  cell->setKey(QString::fromStdString(node.displayName()));
  cell->setAccessory(isTree ? CellAccessory::DisclosureIndicator : CellAccessory::None);
  cell->setValue(isTree ? QString() : QString::fromStdString(*node.value()));
  cell->setRenewed(_host.isRenewed());
  if (isTree) {
    cell->setLayoutKey();
  } else {
    cell->setLayout();
    if (hasChanged(row)) cell->markChanged();
  }
  return cell;
}

void KestroPaneController::rowSelected(int row) {
  const NodePointer node = nodeAtRow(row);
  if (node->childNodes() == nullptr) {
    _table->deselectRow();
    return;
  }
  auto pane = std::make_unique<KestroPaneController>(
      _host, node, pathByAppending(_keyPath, node->displayName()));
  pane->setStatus(_status, _isLoading);
  _host.pushPane(std::move(pane));
}

QString KestroPaneController::textOfRow(int row) const {
  const KestroModelNode& node = *nodeAtRow(row);
  const QString name = QString::fromStdString(node.displayName());
  return node.value() == nullptr ? name : name + u'\t' + QString::fromStdString(*node.value());
}

void KestroPaneController::resizeEvent(QResizeEvent*) { _table->setGeometry(rect()); }

}  // namespace kestro
