// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/LiveRun.h"

#include <csignal>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

#include "CommandLine/ExitStatus.h"
#include "CommandLine/Output.h"
#include "CommandLine/Terminal/FullScreen.h"
#include "Model/LastWords.h"
#include "Platform/DemoServer.h"
#include "Platform/MainQueue.h"
#include "Platform/SystemLog.h"
#include "Sources/SourceCatalogue.h"

namespace kestro {
namespace {

LinuxPlatformOptions platformOptions(const LiveOptions& options, const DemoServer* demo) {
  LinuxPlatformOptions result;
  result.logThreshold = options.logThreshold;
  result.telephonyServerName = options.serverName;
  if (demo != nullptr) result.portDirectory = demo->portDirectory();
  return result;
}

/// One run of a task.
class Run {
 public:
  Run(const LiveOptions& options, const LiveTaskMaker& makeTask, DemoServer* demo)
      : _serverName(options.serverName),
        _demo(demo),
        _platform(createLinuxPlatform(platformOptions(options, demo))),
        _lastWords([this](std::string_view line) { endUnexpectedly(line); }),
        _task(makeTask(*_platform, [this](int exitStatus, std::string complaint) {
          finish(exitStatus, std::move(complaint));
        })) {}
  Run(const Run&) = delete;
  Run& operator=(const Run&) = delete;
  ~Run() = default;

  /// Runs until the task finishes; the exit status.
  int untilFinished() {
    _platform->setTerminationHandler([this] { _task->stop(); });
    _platform->setResizeHandler([this] { _task->resized(); });
    startWithServer();
    const int exitStatus = _platform->run();
    _task.reset();
    if (!_complaint.empty()) complain(_complaint);
    return exitStatus;
  }

 private:
  void startWithServer() {
    if (_demo == nullptr) return _platform->mainQueue().post([this] { _task->start(); });
    _demoWatch = _demo->watch(
        *_platform, _serverName, [this] { _task->start(); },
        [this](const std::string& reason) {
          finish(kExitNothingDone, "the demo's telephony server: " + reason);
        });
  }

  void finish(int exitStatus, std::string complaint) {
    if (_isFinished) return;
    _isFinished = true;
    _complaint = std::move(complaint);
    _platform->mainQueue().post(
        [&platform = *_platform, exitStatus] { platform.quit(exitStatus); });
  }

  void endUnexpectedly(std::string_view line) {
    FullScreen::restore();
    complain(line);
    _platform->systemLog().write(LogPriority::Error, line);
    _platform->flushSystemLog();
    if (_demo != nullptr) _demo->removeDirectory();
  }

  const std::string& _serverName;
  DemoServer* _demo;
  std::unique_ptr<LinuxPlatform> _platform;
  LastWords _lastWords;
  bool _isFinished = false;
  std::string _complaint;
  std::unique_ptr<LiveTask> _task;
  std::unique_ptr<Timer> _demoWatch;
};

}  // namespace

int runLive(const LiveOptions& options, const LiveTaskMaker& makeTask) {
  // A reader that goes away is noticed where it is written to; dying of it would leave things
  // behind.
  std::signal(SIGPIPE, SIG_IGN);
  if (options.demoSource.empty()) return Run(options, makeTask, nullptr).untilFinished();
  if (const auto source = parseSource(options.demoSource, ""); !source) {
    complain("--demo: " + source.error().message);
    return kExitWrongUsage;
  }
  const auto demo = startDemoServer(
      {.source = options.demoSource, .speed = options.demoSpeed, .loops = options.demoLoops});
  if (!demo) {
    complain(demo.error().message);
    return kExitNothingDone;
  }
  return Run(options, makeTask, demo->get()).untilFinished();
}

}  // namespace kestro
