// SPDX-License-Identifier: MIT
// The screen for one node of the display tree: its children, one a row.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "App/Panes/KestroCell.h"
#include "App/Toolkit/NavigationController.h"
#include "App/Toolkit/TableView.h"
#include "App/Toolkit/ViewController.h"
#include "Model/KestroModelNode.h"

namespace kestro {

/// What panes ask of the application object.
class PaneHost {
 public:
  PaneHost() = default;
  virtual ~PaneHost() = default;
  PaneHost(const PaneHost&) = delete;
  PaneHost& operator=(const PaneHost&) = delete;

  [[nodiscard]] virtual bool allowSaveButton() const = 0;
  /// Whether values that have changed are marked for a moment.
  [[nodiscard]] virtual bool marksChanges() const = 0;
  /// Whether values are still renewed; what is not is drawn so that nobody takes it for live.
  [[nodiscard]] virtual bool isRenewed() const { return true; }
  virtual void showSaveView() = 0;
  /// A row's text is on the clipboard now.
  virtual void rowCopied(const QString& /*text*/) {}
  /// Puts a pane on top of the stack, animated.
  virtual void pushPane(std::unique_ptr<ViewController> pane) = 0;
};

class KestroPaneController : public ViewController {
  Q_OBJECT

 public:
  /// `node` may be null: there is no data yet. The host must outlive the pane.
  KestroPaneController(PaneHost& host, NodePointer node, std::string path);

  void viewWillAppear(bool animated) override;
  void viewWillDisappear(bool animated) override;

  /// The text and the indicator of the toolbar.
  void setStatus(const QString& status, bool isLoading);
  /// Shows another node in this one's place, with the scroll position and the focus as they are.
  void reloadWithNode(NodePointer node);
  /// Shows whether its values are renewed, as the host says now.
  void updateRenewal();
  /// The pane's path in the tree; "/" for the root.
  [[nodiscard]] const std::string& path() const noexcept { return _keyPath; }

  [[nodiscard]] TableView& tableView() const noexcept { return *_table; }

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  void createToolbarItems();
  void updateTitle();
  [[nodiscard]] int rowCount() const;
  /// The node of a row, which must exist.
  [[nodiscard]] const NodePointer& nodeAtRow(int row) const;
  [[nodiscard]] std::unique_ptr<TableCell> cellForRow(int row);
  void rowSelected(int row);
  [[nodiscard]] QString textOfRow(int row) const;
  void keepFocusOn(const std::string& name);
  [[nodiscard]] bool hasChanged(int row) const;

  PaneHost& _host;
  NodePointer _nodes;
  NodePointer _earlierNodes;  ///< only during a reload: what was shown before
  std::string _keyPath;
  QString _status;
  bool _isLoading = true;
  TableView* _table;
};

}  // namespace kestro
