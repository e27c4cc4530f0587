// SPDX-License-Identifier: MIT
// The screen on which a snapshot is described and saved.
#pragma once

#include <QLineEdit>
#include <QWidget>
#include <functional>
#include <memory>
#include <string>

#include "App/Toolkit/TableView.h"
#include "Model/Snapshot.h"
#include "Platform/Platform.h"

namespace Ui {  // NOLINT(readability-identifier-naming): made of the interface file
class KestroSaveViewController;
}  // namespace Ui

namespace kestro {

/// Lists what would be saved and takes a description. Saving and cancelling both end in the
/// screen's closing, which is posted to the main queue.
class KestroSaveViewController : public QWidget {
  Q_OBJECT

 public:
  struct Handlers {
    std::function<void()> close;        ///< called in a later turn of the main queue
    std::function<void()> writeFailed;  ///< called at once when the file cannot be written
    /// Called at once when it was, with its path in this system's own files.
    std::function<void(const std::string& path)> saved = {};
  };

  /// The snapshot's time is now, and its contents are a copy of `saveContents` (null for none).
  /// The platform must outlive the screen and what it posts.
  KestroSaveViewController(Platform& platform, const Value& saveContents, Handlers handlers);
  ~KestroSaveViewController() override;

  /// Writes the snapshot with the description as it stands, then closes, whatever came of it.
  void savePressed();
  /// Closes without writing.
  void cancelPressed();
  /// Enter in the text field: hides the keyboard. Always true.
  bool textFieldShouldReturn();
  /// A touch beside the controls: hides the keyboard.
  void backgroundTouched();

  [[nodiscard]] QLineEdit& saveDescription() const;
  [[nodiscard]] TableView& saveContentTable() const;

 protected:
  void keyPressEvent(QKeyEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void paintEvent(QPaintEvent* event) override;

 private:
  void viewDidLoad();
  void connectControls();
  void hideKeyboard();
  void postClose();
  [[nodiscard]] std::unique_ptr<TableCell> cellForRow(int row);

  Platform& _platform;
  Handlers _handlers;
  Snapshot _snapshot;  ///< the moment at which the screen was made, and a copy of the contents
  std::unique_ptr<Ui::KestroSaveViewController> _ui;
};

}  // namespace kestro
