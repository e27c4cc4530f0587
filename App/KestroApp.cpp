// SPDX-License-Identifier: MIT
#include "App/KestroApp.h"

#include <QAccessible>
#include <QDesktopServices>
#include <QFileInfo>
#include <QIcon>
#include <QPixmap>
#include <QScreen>
#include <QStringList>
#include <QUrl>
#include <utility>

#include "App/Toolkit/Accessibility.h"
#include "Model/ConnectionProblem.h"
#include "Platform/Bundle.h"
#include "Platform/Clock.h"
#include "Platform/DeviceRoot.h"
#include "Platform/LogSourceState.h"
#include "Platform/MainQueue.h"
#include "Platform/Preferences.h"

namespace kestro {
namespace {

constexpr std::size_t kRoot = 0;
constexpr std::string_view kRootPath = "/";

QString connecting() { return QStringLiteral("Connecting..."); }

/// A text that stands by itself, with a capital letter.
QString sentence(const std::string& text) {
  QString result = QString::fromStdString(text);
  if (!result.isEmpty()) result[0] = result[0].toUpper();
  return result;
}

QIcon iconOf(const Bundle& bundle) {
  const auto contents = bundle.resource("org.kestro.Kestro", "png");
  QPixmap picture;
  if (contents) picture.loadFromData(contents->data(), static_cast<uint>(contents->size()));
  return QIcon(picture);
}

}  // namespace

KestroApp::KestroApp(int& argumentCount, char** arguments)
    : QApplication(argumentCount, arguments) {
  setApplicationName(QStringLiteral("kestro"));
  setApplicationDisplayName(QStringLiteral("Kestro"));
  setDesktopFileName(QStringLiteral("org.kestro.Kestro"));
  installAccessibility();
  connect(this, &QCoreApplication::aboutToQuit, this, [this] { applicationWillTerminate(); });
}

KestroApp::~KestroApp() { applicationWillTerminate(); }

bool KestroApp::notify(QObject* receiver, QEvent* event) noexcept {
  return QApplication::notify(receiver, event);
}

// --- Launch and exit -----------------------------------------------------------------------------

void KestroApp::applicationDidFinishLaunching(Platform& platform, const LaunchOptions& options) {
  _platform = &platform;
  _isPlain = options.plain;
  _serverName = options.serverName;
  _isDemo = options.isDemo;
  _isRenewed = true;
  getRSSIPref();
  getSaveButtonPref();
  _systemColours = std::make_unique<SystemColours>(options.style);
  createWindow(options.windowSize);
  _model = KestroModel::create(platform, [this] { updateViewControllerFromModel(); });
  _model->setConnectionHandler([this](bool) { connectionChanged(); });
  _model->setNewsHandler([this] { updateOrigin(); });
  _updateMessage = connecting();
  showRootPane();
  if (options.connectsAtLaunch) connectAfterFirstFrame();
}

void KestroApp::createWindow(const std::optional<QSize>& size) {
  _window = std::make_unique<MainWindow>();
  _window->setWindowTitle(QStringLiteral("Kestro"));
  _window->setWindowIcon(iconOf(_platform->bundle()));
  placeWindow(size);
}

void KestroApp::showRootPane() {
  PaneHost& host = *this;
  auto root = std::make_unique<KestroPaneController>(host, nullptr, std::string(kRootPath));
  root->setStatus(QStringLiteral("Connecting"), true);
  auto navController = std::make_unique<NavigationController>(std::move(root));
  navController->setWillShow([this](ViewController& pane, bool animated) {
    navigationControllerWillShowViewController(pane, animated);
  });
  _navController = navController.get();
  _window->setNavController(std::move(navController));
  _window->show();
  _window->setFocus();
  // The event loop is entered by the platform, which knows of no accessibility.
  QAccessible::setRootObject(this);
}

void KestroApp::placeWindow(const std::optional<QSize>& size) {
  const QRect available = primaryScreen()->availableGeometry();
  if (!size) {
    _window->setGeometry(available);
    _window->setWindowState(Qt::WindowMaximized);
    return;
  }
  QRect frame(QPoint(), *size);
  frame.moveCenter(available.center());
  _window->setGeometry(frame);
}

/// An attempt to connect may take seconds, in which nothing is painted.
void KestroApp::connectAfterFirstFrame() {
  const auto once = [this, isDone = std::make_shared<bool>(false)] {
    if (!std::exchange(*isDone, true)) restartMonitor();
  };
  _window->setFirstFrameHandler(once);
  _platform->mainQueue().postAfter(kFirstFramePatience, once);
}

void KestroApp::restartMonitor() {
  if (!_platform) return;
  _platform->mainQueue().post([this] {
    if (_model) _model->restartMonitor();
  });
}

void KestroApp::applicationWillTerminate() {
  if (!_platform) return;
  restoreRSSI();
  _updateMessage.clear();
  _saveViewController = nullptr;
  _navController = nullptr;
  _window->hide();
  _window.reset();
  _model.reset();
  _systemColours.reset();
  _platform = nullptr;
}

// --- Preferences ---------------------------------------------------------------------------------

void KestroApp::getRSSIPref() {
  const auto shown = _platform->preferences().boolean(kKestroPreferencesDomain, kShowGSMRssi);
  if (shown.value_or(false)) return;
  _unsetRSSI = true;
  _setGSMRSSI(true);
}

void KestroApp::restoreRSSI() {
  if (_platform && std::exchange(_unsetRSSI, false)) _setGSMRSSI(false);
}

void KestroApp::getSaveButtonPref() {
  _allowSaveButton = _platform->deviceRoot().exists(kSaveButtonPath);
}

void KestroApp::_setGSMRSSI(bool shown) {
  Preferences& preferences = _platform->preferences();
  preferences.setBoolean(kShellPreferencesDomain, kShowGSMRssi, shown);
  preferences.synchronize(kShellPreferencesDomain);
  preferences.notifyChanged(kShellPreferencesDomain, kShowGSMRssi);
}

// --- Panes ---------------------------------------------------------------------------------------

KestroPaneController& KestroApp::paneAt(std::size_t index) const {
  return static_cast<KestroPaneController&>(*_navController->viewControllers()[index]);
}

void KestroApp::pushPane(std::unique_ptr<ViewController> pane) {
  _navController->pushViewController(std::move(pane), true);
}

void KestroApp::navigationControllerWillShowViewController(ViewController& pane, bool) {
  updateStatusForViewController(static_cast<KestroPaneController&>(pane));
}

void KestroApp::updateStatusForViewController(KestroPaneController& pane) {
  const bool isConnected = _model->isConnected();
  pane.setStatus(isConnected ? _updateMessage : connecting(), !isConnected);
}

void KestroApp::updateViewControllerFromModel() {
  if (!_model) return;  // a redraw that was queued before the exit
  reloadPanes();
  if (_model->isConnected()) {
    const Clock& clock = _platform->clock();
    _updateMessage = QString::fromStdString(updatedText(clock, clock.now()));
  }
  updateStatusForViewController(paneAt(_navController->viewControllers().size() - 1));
}

void KestroApp::reloadPanes() {
  NodePointer root = _model->topLevelNodes();
  if (!root) return;  // the channel's technology has no generator: the last display stays
  paneAt(kRoot).reloadWithNode(std::move(root));
  for (std::size_t i = kRoot + 1; i < _navController->viewControllers().size(); ++i) {
    NodePointer node = _model->nodeAtPath(paneAt(i).path());
    if (!node) {
      _navController->popToIndex(i - 1, true);
      return;
    }
    paneAt(i).reloadWithNode(std::move(node));
  }
}

void KestroApp::connectionChanged() {
  if (!_model) return;  // after the exit, by a retry that was queued before
  updateOrigin();
  updateStatusForViewController(paneAt(_navController->viewControllers().size() - 1));
}

// --- Origin --------------------------------------------------------------------------------------

/// In the window's title, and in a line of its own above the panes.
void KestroApp::updateOrigin() {
  if (!_model || !_window) return;
  QStringList parts;
  for (const std::string& part : {_model->technology(), sourceText(_model->source())}) {
    if (!part.empty()) parts.append(QString::fromStdString(part));
  }
  // Before the first connection there is nothing to tell.
  if (!parts.isEmpty()) parts.append(_isDemo ? tr("demo") : QString::fromStdString(_serverName));
  _window->noticeBar().setOrigin(parts.join(QStringLiteral(" · ")));
  _window->noticeBar().setNotice(noticeText());
  parts.append(QStringLiteral("Kestro"));
  _window->setWindowTitle(parts.join(QStringLiteral(" · ")));
  updateRenewal();
}

QString KestroApp::noticeText() const {
  if (_model->problem()) return sentence(problemText(*_model->problem(), _serverName));
  const LogSourceState& source = _model->source();
  if (!_model->isConnected() || !source.hasEnded.value_or(false)) return {};
  return sentence(sourceEndedText(source));
}

void KestroApp::updateRenewal() {
  const bool isRenewed = _model->isConnected() && !_model->source().hasEnded.value_or(false);
  if (std::exchange(_isRenewed, isRenewed) == isRenewed) return;
  for (std::size_t i = 0; i < _navController->viewControllers().size(); ++i) {
    paneAt(i).updateRenewal();
  }
}

void KestroApp::rowCopied(const QString& text) {
  _window->noticeBar().showMessage(tr("Copied: %1").arg(QString(text).replace(u'\t', u' ')));
}

// --- Saving --------------------------------------------------------------------------------------

void KestroApp::showSaveView() {
  if (_saveViewController) return;
  auto screen = std::make_unique<KestroSaveViewController>(
      *_platform, _model->getSaveContents(),
      KestroSaveViewController::Handlers{
          .close = [this] { closeSaveView(); },
          .writeFailed = [this] { showFileError(); },
          .saved = [this](const std::string& path) { showSaved(path); }});
  _saveViewController = screen.get();
  _navController->present(std::move(screen), true);
}

void KestroApp::closeSaveView() {
  if (!_saveViewController) return;
  _saveViewController = nullptr;
  _navController->dismiss(true);
}

void KestroApp::showSaved(const std::string& path) {
  const QString file = QString::fromStdString(path);
  const QUrl folder = QUrl::fromLocalFile(QFileInfo(file).path());
  _window->noticeBar().showMessage(tr("Saved as %1").arg(file), tr("Open Folder"),
                                   [folder] { QDesktopServices::openUrl(folder); });
}

void KestroApp::showFileError() {
  _alert = new AlertView(tr("File Error"), tr("Unable to write file to disk"), tr("Close"),
                         _window.get());
  _alert->open();
}

bool KestroApp::saveHistory(std::string_view description) {
  if (!_model) return false;
  return Snapshot(_platform->clock(), _model->getSaveContents())
      .save(*_platform, description)
      .has_value();
}

}  // namespace kestro
