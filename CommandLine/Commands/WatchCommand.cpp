// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/WatchCommand.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/EventSession.h"
#include "CommandLine/Commands/LiveRun.h"
#include "CommandLine/Commands/WatchSession.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Output.h"
#include "CommandLine/RuleOptions.h"
#include "CommandLine/Terminal/WatchView.h"

namespace kestro {
namespace {

constexpr const char* kWatchExamples = R"(  kestro-cli watch --demo
  kestro-cli watch --demo=drive-test:drive.csv
  kestro-cli watch --format=ndjson --count=10
  kestro-cli watch --format=events --rule='Measured RSRP < -110 dBm for 4 s')";

constexpr std::string_view kEventsFormat = "events";

struct WatchOptions {
  LiveOptions live;
  std::string format;
  std::optional<std::uint64_t> count;
  RuleOptions rules;
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

class EventsTask : public LiveTask {
 public:
  EventsTask(const WatchOptions& options, std::vector<Rule> rules, Platform& platform,
             Finish finish)
      : _finish(std::move(finish)),
        _session(platform, std::move(rules), options.count, [this] { sessionEnded(); }) {}

  void start() override { _session.start(); }
  void stop() override { _finish(kExitDone, ""); }

 private:
  void sessionEnded() {
    const Output& output = _session.output();
    if (output.failureMessage().empty() || output.readerIsGone()) return _finish(kExitDone, "");
    _finish(kExitNothingDone, output.failureMessage());
  }

  Finish _finish;
  EventSession _session;
};

/// The formats of displays, and events.
std::vector<HelpRow> liveFormatRows() {
  auto rows = formatRows(watchFormats());
  rows.push_back({std::string(kEventsFormat),
                  "one line of JSON an event, with the members of `events --format=json`"});
  return rows;
}

int runWatch(const WatchOptions& options) {
  const auto rules = rulesOf(options.rules);
  if (!rules) {
    complain(rules.error().message);
    return kExitNothingDone;
  }
  if (options.format != kEventsFormat && !rules->empty()) {
    complain("rules are for --format=events");
    return kExitWrongUsage;
  }
  return runLive(
      options.live, [&](LinuxPlatform& platform, Finish finish) -> std::unique_ptr<LiveTask> {
        if (options.format != kEventsFormat) {
          return std::make_unique<WatchTask>(options, platform, std::move(finish));
        }
        return std::make_unique<EventsTask>(options, *rules, platform, std::move(finish));
      });
}

}  // namespace

CommandRow watchCommand() {
  const auto options = std::make_shared<WatchOptions>();
  CommandRow command{
      .name = "watch",
      .help = "Show the live display",
      .options = liveOptions(options->live),
      .sections = {{.title = "Formats",
                    .rows = liveFormatRows(),
                    .text = "The display refreshes every 2 s while data arrives. Ctrl-C ends it."},
                   rulesHelp(),
                   {.title = "Examples", .text = kWatchExamples}},
      .run = [options] { return runWatch(*options); }};
  command.options.push_back(formatOption(options->format, liveFormatRows()));
  command.options.push_back({.name = "--count",
                             .value = "N",
                             .help = "End after so many refreshes, or events",
                             .target = &options->count,
                             .range = NumberRange{1}});
  for (OptionRow& row : ruleRows(options->rules)) command.options.push_back(std::move(row));
  return command;
}

}  // namespace kestro
