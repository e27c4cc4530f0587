// SPDX-License-Identifier: MIT
#include "CommandLine/LiveRun.h"

#include <fmt/format.h>

#include <CLI/CLI.hpp>
#include <csignal>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "CommandLine/ExitStatus.h"
#include "CommandLine/FullScreen.h"
#include "CommandLine/Output.h"
#include "Model/LastWords.h"
#include "Platform/MainQueue.h"
#include "Platform/PortName.h"

namespace kestro {
namespace {

constexpr int kDebugPriority = static_cast<int>(LogPriority::Debug);

std::string checkPortName(const std::string& name) {
  if (isPortName(name)) return "";
  return "'" + name + "' is no port name (1 to 64 letters, digits, '.', '-', '_')";
}

LinuxPlatformOptions platformOptions(const LiveOptions& options, const DemoServer* demo) {
  LinuxPlatformOptions result;
  result.logThreshold = static_cast<LogPriority>(options.logPriority);
  result.telephonyServerName = options.serverName;
  if (demo != nullptr) result.portDirectory = demo->portDirectory();
  return result;
}

/// How a run ends; empty while it goes on.
struct Ending {
  int exitStatus;
  std::string complaint;
};

int run(const LiveOptions& options, const LiveTaskMaker& makeTask, DemoServer* demo) {
  const auto platform = createLinuxPlatform(platformOptions(options, demo));
  const LastWords lastWords([&](std::string_view line) {
    FullScreen::restore();
    complain(line);
    platform->systemLog().write(LogPriority::Error, line);
    platform->flushSystemLog();
    if (demo != nullptr) demo->removeDirectory();
  });
  std::optional<Ending> ending;
  const auto finish = [&](int exitStatus, std::string complaint) {
    if (ending) return;
    ending = {exitStatus, std::move(complaint)};
    platform->mainQueue().post([&platform = *platform, exitStatus] { platform.quit(exitStatus); });
  };
  std::unique_ptr<LiveTask> task = makeTask(*platform, finish);
  platform->setTerminationHandler([&] { task->stop(); });
  platform->setResizeHandler([&] { task->resized(); });
  std::unique_ptr<Timer> demoWatch;
  if (demo == nullptr) {
    platform->mainQueue().post([&] { task->start(); });
  } else {
    demoWatch = demo->watch(
        *platform, options.serverName, [&] { task->start(); },
        [&](const std::string& reason) {
          finish(kExitNothingDone, "the demo's telephony server: " + reason);
        });
  }
  const int exitStatus = platform->run();
  task.reset();
  if (ending && !ending->complaint.empty()) complain(ending->complaint);
  return exitStatus;
}

}  // namespace

void addLiveOptions(CLI::App& command, LiveOptions& options) {
  auto* server = command.add_option("--server", options.serverName, "The telephony server's port")
                     ->check(CLI::Validator(checkPortName, ""))
                     ->option_text("NAME (default: " + options.serverName + ")");
  command
      .add_option_function<std::string>(
          "--demo",
          [&options](const std::string& source) {
            options.demoSource = source.empty() ? kDefaultDemoSource : source;
          },
          "Start a telephony server of one's own with this source; `kestro-telephonyd --help` "
          "lists them")
      ->expected(0, 1)
      ->excludes(server)
      ->option_text(fmt::format("[=SOURCE] (default: {})", kDefaultDemoSource));
  command
      .add_option("--log-priority", options.logPriority,
                  "The system log gets lines up to this priority: 3 errors, 4 warnings, 5 notices")
      ->check(CLI::Range(0, kDebugPriority))
      ->option_text(fmt::format("N (default: {})", options.logPriority));
}

int runLive(const LiveOptions& options, const LiveTaskMaker& makeTask) {
  // A reader that goes away is noticed where it is written to; dying of it would leave things
  // behind.
  std::signal(SIGPIPE, SIG_IGN);
  if (options.demoSource.empty()) return run(options, makeTask, nullptr);
  const auto demo = startDemoServer(options.demoSource);
  if (!demo) {
    complain(demo.error().message);
    return kExitNothingDone;
  }
  return run(options, makeTask, demo->get());
}

}  // namespace kestro
