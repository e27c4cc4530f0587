// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/WatchCommand.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/LiveRun.h"
#include "CommandLine/Commands/WatchSession.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Terminal/WatchView.h"

namespace kestro {
namespace {

constexpr const char* kWatchExamples = R"(  kestro-cli watch --demo
  kestro-cli watch --demo=drive-test:drive.csv
  kestro-cli watch --format=ndjson --count=10)";

struct WatchOptions {
  LiveOptions live;
  std::string format;
  std::optional<std::uint64_t> count;
};

class WatchTask : public LiveTask {
 public:
  WatchTask(const WatchOptions& options, Platform& platform, Finish finish)
      : _finish(std::move(finish)),
        _view(makeView(options)),
        _session(
            platform, *_view, options.count, [this] { sessionEnded(); }, options.live.serverName) {}

  void start() override { _session.start(); }
  void stop() override { _finish(kExitDone, ""); }
  void resized() override { _session.redraw(); }

 private:
  static std::unique_ptr<WatchView> makeView(const WatchOptions& options) {
    const auto& formats = watchFormats();
    const auto format = std::ranges::find(formats, options.format, &WatchFormat::name);
    return format->makeView(options.live.demoSource.empty() ? options.live.serverName : "demo");
  }

  void sessionEnded() {
    if (_view->failureMessage().empty() || _view->readerIsGone()) return _finish(kExitDone, "");
    _finish(kExitNothingDone, std::string(_view->failureMessage()));
  }

  Finish _finish;
  std::unique_ptr<WatchView> _view;
  WatchSession _session;
};

}  // namespace

CommandRow watchCommand() {
  const auto options = std::make_shared<WatchOptions>();
  CommandRow command{
      .name = "watch",
      .help = "Show the live display",
      .options = liveOptions(options->live),
      .sections = {{.title = "Formats",
                    .rows = formatRows(watchFormats()),
                    .text = "The display refreshes every 2 s while data arrives. Ctrl-C ends it."},
                   {.title = "Examples", .text = kWatchExamples}},
      .run = [options] {
        return runLive(options->live, [&](LinuxPlatform& platform, Finish finish) {
          return std::make_unique<WatchTask>(*options, platform, std::move(finish));
        });
      }};
  command.options.push_back(formatOption(options->format, formatRows(watchFormats())));
  command.options.push_back({.name = "--count",
                             .value = "N",
                             .help = "End after so many refreshes",
                             .target = &options->count,
                             .range = NumberRange{1}});
  return command;
}

}  // namespace kestro
