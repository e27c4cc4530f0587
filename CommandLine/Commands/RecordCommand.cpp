// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/RecordCommand.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>
#include <utility>

#include "CommandLine/Commands/LiveRun.h"
#include "CommandLine/Commands/RecordSession.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Output.h"
#include "Platform/MainQueue.h"

namespace kestro {
namespace {

constexpr const char* kRecordFooter =
    R"(Nothing is decoded. The recording ends with Ctrl-C or after its duration, and goes on over lost
connections; when the baseband changes its technology it goes on in FILE-2.pcap, FILE-3.pcap and
so on. Existing files are replaced. Messages of more than 262,144 bytes are dropped and counted.

Examples:
  kestro-cli record -o drive.pcap
  kestro-cli record -o minute.pcap --duration=60 --demo)";

struct RecordOptions {
  LiveOptions live;
  std::string path;
  double durationSeconds = 0;
};

class RecordTask : public LiveTask {
 public:
  RecordTask(const RecordOptions& options, Platform& platform, Finish finish)
      : _options(options),
        _platform(platform),
        _finish(std::move(finish)),
        _session(platform, options.path, complain,
                 [this](const std::string& reason) { _finish(kExitNothingDone, reason); }) {}

  void start() override {
    if (_options.durationSeconds > 0) {
      _durationTimer = _platform.mainQueue().scheduleRepeating(
          durationOfSeconds(_options.durationSeconds), [this] { stop(); });
    }
    _session.start();
  }

  void stop() override {
    _session.stop();
    if (const auto summary = _session.summary()) return _finish(kExitDone, "recorded " + *summary);
    _finish(kExitNothingDone, "nothing was recorded: no telephony server could be connected to");
  }

 private:
  const RecordOptions& _options;
  Platform& _platform;
  Finish _finish;
  RecordSession _session;
  std::unique_ptr<Timer> _durationTimer;
};

}  // namespace

Command addRecordCommand(CLI::App& program) {
  const auto options = std::make_shared<RecordOptions>();
  CLI::App* command = program.add_subcommand("record", "Record the log channel as a capture");
  command->add_option("-o,--output", options->path, "The capture to write")
      ->required()
      ->option_text("FILE.pcap");
  addSecondsOption(*command, "--duration", options->durationSeconds,
                   "End after so long; 0: only with Ctrl-C");
  addLiveOptions(*command, options->live);
  command->footer(kRecordFooter);
  return {command, [options] {
            return runLive(options->live, [&](LinuxPlatform& platform, Finish finish) {
              return std::make_unique<RecordTask>(*options, platform, std::move(finish));
            });
          }};
}

}  // namespace kestro
