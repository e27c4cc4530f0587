// SPDX-License-Identifier: MIT
#include "App/Program.h"

#include <fmt/format.h>
#include <unistd.h>

#include <QPixmap>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "App/KestroApp.h"
#include "App/Options.h"
#include "Model/LastWords.h"
#include "Options/ArgumentParser.h"
#include "Platform/Bundle.h"
#include "Platform/DemoServer.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TextSink.h"
#include "Sources/SourceCatalogue.h"

namespace kestro {
namespace {

constexpr int kDone = 0;
constexpr int kNothingDone = 1;
/// What is said and saved at an unexpected end takes no longer.
constexpr unsigned kLastWordsSeconds = 5;

void complain(std::string_view message) {
  standardErrorSink().writeLine(fmt::format("kestro: {}", message));
}

bool hasDisplay() {
  for (const char* variable : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"}) {
    const char* value = std::getenv(variable);
    if (value != nullptr && value[0] != '\0') return true;
  }
  return false;
}

LinuxPlatformOptions platformOptions(const Options& options, const DemoServer* demo) {
  LinuxPlatformOptions result;
  result.logThreshold = options.live.logThreshold;
  result.telephonyServerName = options.live.serverName;
  result.standardOutputToStandardError = false;
  if (demo != nullptr) result.portDirectory = demo->portDirectory();
  return result;
}

/// One run of the window. What is wrong with it is said at its end.
class Run {
 public:
  Run(const Options& options, KestroApp& app, DemoServer* demo)
      : _options(options),
        _app(app),
        _demo(demo),
        _platform(createLinuxPlatform(platformOptions(options, demo))),
        _lastWords([this](std::string_view line) { endUnexpectedly(line); }) {}

  int run() {
    if (const auto made = _platform->createDefaultDeviceRoot(); !made) {
      _platform->systemLog().write(LogPriority::Error, made.error().message);
    }
    _platform->setTerminationHandler([this] { finish(kDone, ""); });
    _app.applicationDidFinishLaunching(*_platform, {.windowSize = _options.windowSize(),
                                                    .plain = _options.plain,
                                                    .style = _options.colourStyle(),
                                                    .serverName = _options.live.serverName,
                                                    .isDemo = _demo != nullptr,
                                                    .connectsAtLaunch = _demo == nullptr});
    if (_demo != nullptr) watchDemo();
    if (!_options.screenshot.empty()) scheduleScreenshot();
    const int status = _platform->run();
    _app.applicationWillTerminate();
    if (!_complaint.empty()) complain(_complaint);
    return status;
  }

 private:
  void finish(int status, std::string complaint) {
    if (std::exchange(_isOver, true)) return;
    _complaint = std::move(complaint);
    _platform->quit(status);
  }

  void watchDemo() {
    _demoWatch = _demo->watch(
        *_platform, _options.live.serverName, [this] { _app.restartMonitor(); },
        [this](const std::string& reason) {
          finish(kNothingDone, "the demo's telephony server: " + reason);
        });
  }

  void scheduleScreenshot() {
    const std::chrono::duration<double> delay(_options.after);
    _platform->mainQueue().postAfter(std::chrono::duration_cast<std::chrono::nanoseconds>(delay),
                                     [this] { takeScreenshot(); });
  }

  void takeScreenshot() {
    if (_app.window() == nullptr) return;
    const QString file = QString::fromStdString(_options.screenshot);
    if (_app.window()->grab().save(file)) return finish(kDone, "");
    finish(kNothingDone, "cannot write the picture " + _options.screenshot);
  }

  /// Says why first, then saves; whatever of it hangs is cut short, and the cause stays said.
  void endUnexpectedly(std::string_view line) {
    std::signal(SIGALRM, [](int) { std::abort(); });
    ::alarm(kLastWordsSeconds);
    complain(line);
    _platform->systemLog().write(LogPriority::Error, line);
    if (!_app.saveHistory("Unexpected end")) complain("the history could not be saved");
    _app.restoreRSSI();
    if (_demo != nullptr) _demo->removeDirectory();
    _platform->flushSystemLog();
  }

  const Options& _options;
  KestroApp& _app;
  DemoServer* _demo;
  std::unique_ptr<LinuxPlatform> _platform;
  LastWords _lastWords;
  std::unique_ptr<Timer> _demoWatch;
  std::string _complaint;
  bool _isOver = false;
};

}  // namespace

int runProgram(int argumentCount, char** arguments) {
  Options options;
  if (const auto status = Options::parse(*createBundle(), argumentCount, arguments, options))
    return *status;
  if (!options.live.demoSource.empty()) {
    if (const auto source = parseSource(options.live.demoSource, ""); !source) {
      complain("--demo: " + source.error().message);
      return kWrongUsage;
    }
  }
  if (!hasDisplay()) {
    complain("there is no display here; `kestro-cli watch` shows the same on a terminal");
    return kNothingDone;
  }
  // A reader of standard error that goes away is no reason to die.
  std::signal(SIGPIPE, SIG_IGN);
  std::unique_ptr<DemoServer> demo;
  if (!options.live.demoSource.empty()) {
    auto started = startDemoServer({.source = options.live.demoSource,
                                    .speed = options.live.demoSpeed,
                                    .loops = options.live.demoLoops});
    if (!started) {
      complain(started.error().message);
      return kNothingDone;
    }
    demo = *std::move(started);
  }
  int ownArgumentCount = 1;  // the toolkit knows nothing of our options
  KestroApp app(ownArgumentCount, arguments);
  return Run(options, app, demo.get()).run();
}

}  // namespace kestro
