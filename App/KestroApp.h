// SPDX-License-Identifier: MIT
// The application object: the window with its stack of panes, the model behind it, and what happens
// at launch and at exit.
#pragma once

#include <QApplication>
#include <QPointer>
#include <QSize>
#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "App/MainWindow.h"
#include "App/Panes/KestroPaneController.h"
#include "App/Panes/KestroSaveViewController.h"
#include "App/Toolkit/AlertView.h"
#include "App/Toolkit/NavigationController.h"
#include "App/Toolkit/SystemColours.h"
#include "Model/KestroModel.h"
#include "Platform/Platform.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {

/// Where this exists on the device, panes have a "Save" button.
inline constexpr std::string_view kSaveButtonPath =
    "/NorrowInternal/Library/PreferenceBundles/Carrier Settings.bundle";
/// The preference for the signal strength as a number.
inline constexpr std::string_view kShowGSMRssi = "LumoShowGSMRSSI";

/// How long connecting waits, at most, for the window's first frame.
inline constexpr std::chrono::seconds kFirstFramePatience{1};

struct LaunchOptions {
  /// The window's size; without one it covers the main screen's available area.
  std::optional<QSize> windowSize;
  /// No marks at values that have changed.
  bool plain = false;
  ColourStyle style = ColourStyle::System;
  /// The port that is connected to, as the title and notices call it.
  std::string serverName = std::string(kDefaultServerName);
  /// Whether that is a server of the program's own.
  bool isDemo = false;
  /// Whether connecting begins by itself, once the first frame is shown; else `restartMonitor` does
  /// it.
  bool connectsAtLaunch = true;
};

/// Exceptions end the process where they are thrown: none unwinds through the toolkit.
class KestroApp : public QApplication, private PaneHost {
  Q_OBJECT

 public:
  KestroApp(int& argumentCount, char** arguments);
  ~KestroApp() override;
  KestroApp(const KestroApp&) = delete;
  KestroApp& operator=(const KestroApp&) = delete;

  /// Shows the window, with nothing connected yet. The platform must live until
  /// `applicationWillTerminate`.
  void applicationDidFinishLaunching(Platform& platform, const LaunchOptions& options = {});
  /// Puts back what launching changed, and lets go of window and model. Runs by itself when the
  /// event loop ends; a second call does nothing.
  void applicationWillTerminate();

  /// Has the shell show the signal strength as before, if launching has changed that; for who ends
  /// the process. A second call does nothing.
  void restoreRSSI();

  /// Connects, or connects anew, in a later turn of the main queue.
  void restartMonitor();

  /// Has the shell show the signal strength as a number until the exit, unless this program's own
  /// preference is set: then it is left alone.
  void getRSSIPref();
  /// Looks whether the device has `kSaveButtonPath`; `allowSaveButton` says so from then on.
  void getSaveButtonPref();
  /// Writes the shell's preference, and tells that it has changed.
  // NOLINTNEXTLINE(readability-identifier-naming)
  void _setGSMRSSI(bool shown);

  /// Shows the save screen with a copy of the history; does nothing while it is shown.
  void showSaveView() override;
  /// Takes the save screen away, if it is shown.
  void closeSaveView();
  /// Shows "Connecting..." in the pane's toolbar, or the update message while connected.
  void updateStatusForViewController(KestroPaneController& pane);
  /// Shows the model's present tree in all panes. The first one whose path is gone is popped, with
  /// all above it. Without a tree the panes stay as they are.
  void updateViewControllerFromModel();
  /// Brings the status of a pane up to date before it comes on top.
  void navigationControllerWillShowViewController(ViewController& pane, bool animated);

  /// Saves the history without asking; for who ends the process. False when it could not be saved.
  bool saveHistory(std::string_view description);

  [[nodiscard]] MainWindow* window() const noexcept { return _window.get(); }
  [[nodiscard]] NavigationController* navController() const noexcept { return _navController; }
  [[nodiscard]] KestroSaveViewController* saveViewController() const noexcept {
    return _saveViewController;
  }
  /// The message that a failed write left on the screen, until it is closed.
  [[nodiscard]] AlertView* alert() const noexcept { return _alert; }
  /// What the toolbar says while connected: "Connecting..." until the first refresh.
  [[nodiscard]] const QString& updateMessage() const noexcept { return _updateMessage; }
  void setUpdateMessage(const QString& message) { _updateMessage = message; }
  [[nodiscard]] bool allowSaveButton() const override { return _allowSaveButton; }
  void setAllowSaveButton(bool allow) noexcept { _allowSaveButton = allow; }

  /// Ends the process where a handler throws.
  bool notify(QObject* receiver, QEvent* event) noexcept override;

 private:
  [[nodiscard]] bool marksChanges() const override { return !_isPlain; }
  void pushPane(std::unique_ptr<ViewController> pane) override;
  [[nodiscard]] bool isRenewed() const override { return _isRenewed; }
  void rowCopied(const QString& text) override;

  void createWindow(const std::optional<QSize>& size);
  void placeWindow(const std::optional<QSize>& size);
  void showRootPane();
  void connectAfterFirstFrame();
  void reloadPanes();
  void connectionChanged();
  void updateOrigin();
  void updateRenewal();
  [[nodiscard]] QString noticeText() const;
  void showSaved(const std::string& path);
  void showFileError();
  [[nodiscard]] KestroPaneController& paneAt(std::size_t index) const;

  Platform* _platform = nullptr;  ///< null before launch and after exit
  std::unique_ptr<MainWindow> _window;
  NavigationController* _navController = nullptr;           ///< the window's
  KestroSaveViewController* _saveViewController = nullptr;  ///< the stack's, while it is shown
  std::shared_ptr<KestroModel> _model;
  bool _unsetRSSI = false;
  bool _allowSaveButton = false;
  QString _updateMessage;

  std::unique_ptr<SystemColours> _systemColours;
  QPointer<AlertView> _alert;
  bool _isPlain = false;
  std::string _serverName;
  bool _isDemo = false;
  bool _isRenewed = true;  ///< also before there is anything that could be renewed
};

}  // namespace kestro
