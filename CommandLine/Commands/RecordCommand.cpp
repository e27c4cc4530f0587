// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/RecordCommand.h"

#include <unistd.h>

#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/LiveRun.h"
#include "CommandLine/Commands/RecordSession.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Output.h"
#include "CommandLine/Terminal/TypedLines.h"
#include "Platform/MainQueue.h"
#include "Recordings/OutputPath.h"
#include "Sources/SourceCatalogue.h"

namespace kestro {
namespace {

constexpr const char* kRecordText =
    R"(Nothing is decoded. A drive becomes one pcapng file, whatever technologies the baseband changes to.
A line typed on the terminal is a note: it becomes a comment of the next message, as a lost
connection and its return do. The recording ends with Ctrl-C or after its duration. Existing files
are replaced. Messages of more than 262,144 bytes are dropped and counted. When a lost connection
has cost messages, the last line says how many, and the exit status is 3.

With the ending .pcap the recording is a pcap capture: it has no notes, and with each change of the
technology it goes on in FILE-2.pcap, FILE-3.pcap and so on.)";

constexpr const char* kRecordExamples = R"(  kestro-cli record -o drive.pcapng
  kestro-cli record -o minute.pcapng --duration=60 --demo
  kestro-cli record -o - | tshark -r -)";

constexpr const char* kSourceTimesHelp =
    "Record the times that the source says, such as a drive-test log's, instead of those at which "
    "messages arrive";

struct RecordOptions {
  LiveOptions live;
  std::string path;
  double durationSeconds = 0;
  bool usesSourceTimes = false;
};

/// The file that a demo plays, if it plays one.
std::vector<std::string> demoFiles(const std::string& source) {
  const auto request = parseSource(source, "");
  const auto* kind = request ? sourceKindNamed(request->kind) : nullptr;
  if (source.empty() || kind == nullptr || kind->isEndless) return {};
  return {request->argument};
}

/// Looks at the output before anything is started.
Result<void> checkOutput(const RecordOptions& options) {
  if (options.path == kStandardOutputPath && ::isatty(STDOUT_FILENO) == 1) {
    return failure("standard output is a terminal, which shows no recording: redirect it");
  }
  const auto inputs = demoFiles(options.live.demoSource);
  if (auto checked = checkOutputIsNoInput(options.path, inputs); !checked) return checked;
  return checkOutputCanBeCreated(options.path);
}

class RecordTask : public LiveTask {
 public:
  RecordTask(const RecordOptions& options, Platform& platform, Finish finish)
      : _options(options),
        _platform(platform),
        _finish(std::move(finish)),
        _session(platform, options.path, demoFiles(options.live.demoSource), complain,
                 [this](const std::string& reason) { _finish(kExitNothingDone, reason); }),
        _notes(platform.mainQueue(), [this](std::string_view line) { _session.addNote(line); }) {}

  void start() override {
    if (_options.durationSeconds > 0) {
      _durationTimer = _platform.mainQueue().scheduleRepeating(
          durationOfSeconds(_options.durationSeconds), [this] { stop(); });
    }
    if (::isatty(STDERR_FILENO) == 1) _session.tellEveryMinute();
    if (_options.usesSourceTimes) _session.useSourceTimes();
    _session.setServerName(_options.live.serverName);
    _session.start();
  }

  void stop() override {
    _session.stop();
    if (const auto summary = _session.summary()) {
      const int status = _session.isIncomplete() ? kExitPartlyDone : kExitDone;
      return _finish(status, "recorded " + *summary);
    }
    _finish(kExitNothingDone, "nothing was recorded: no telephony server could be connected to");
  }

 private:
  const RecordOptions& _options;
  Platform& _platform;
  Finish _finish;
  RecordSession _session;
  TypedLines _notes;
  std::unique_ptr<Timer> _durationTimer;
};

}  // namespace

CommandRow recordCommand() {
  const auto options = std::make_shared<RecordOptions>();
  CommandRow command{
      .name = "record",
      .help = "Record the log channel",
      .options = {{.name = "-o,--output",
                   .value = "FILE.pcapng",
                   .help = "The recording to write; - is standard output",
                   .target = &options->path,
                   .isRequired = true},
                  secondsOption("--duration", "End after so long; 0: only with Ctrl-C",
                                options->durationSeconds),
                  {.name = "--source-times",
                   .help = kSourceTimesHelp,
                   .target = &options->usesSourceTimes}},
      .sections = {{.text = kRecordText}, {.title = "Examples", .text = kRecordExamples}},
      .run = [options]() -> int {
        if (const auto checked = checkOutput(*options); !checked) {
          complain(checked.error().message);
          return kExitNothingDone;
        }
        return runLive(options->live, [&](LinuxPlatform& platform, Finish finish) {
          return std::make_unique<RecordTask>(*options, platform, std::move(finish));
        });
      }};
  for (auto& row : liveOptions(options->live)) command.options.push_back(std::move(row));
  return command;
}

}  // namespace kestro
