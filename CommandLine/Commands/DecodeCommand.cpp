// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/DecodeCommand.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/ReplayedInputs.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/DecodeWriter.h"
#include "CommandLine/InputFeed.h"
#include "CommandLine/OfflineServices.h"
#include "CommandLine/Output.h"
#include "Recordings/OutputPath.h"

namespace kestro {
namespace {

constexpr const char* kDecodeExamples = R"(  kestro-cli decode drive.pcapng
  kestro-cli decode drive.pcapng --format=json | jq '.display'
  kestro-cli decode monday.pcapng tuesday.csv --from=2019-11-25 --to=2019-11-26
  kestro-cli decode drive.pcapng --format=csv --refresh-every=0 > every-message.csv)";

struct DecodeOptions {
  InputOptions inputs;
  std::string format;
  double refreshSeconds = 2;
  std::string logFile;
  std::optional<LogPriority> shownLog;

  [[nodiscard]] const DecodeFormat& chosenFormat() const {
    return *std::ranges::find(decodeFormats(), format, &DecodeFormat::name);
  }
};

/// One run of the command.
class Decoder {
 public:
  Decoder(const DecodeOptions& options, InputFeed feed, std::optional<Output> logFile)
      : _options(options),
        _feed(std::move(feed)),
        _services(std::move(logFile), options.shownLog) {}

  int run() {
    // The generator is gone before the log is finished: it leaves lines when it goes.
    return decode() ? finish() : kExitNothingDone;
  }

 private:
  /// Writes the displays; false when nothing could be done.
  [[nodiscard]] bool decode() {
    const auto& format = _options.chosenFormat();
    const auto writer = format.makeWriter(
        _output, format.isStreamed && _feed.hasSeveralTechnologies(_options.inputs));
    ReplayedInputs replayed(_feed, _services,
                            {.refreshInterval = durationOfSeconds(_options.refreshSeconds)},
                            [&](const ReplayRefresh& refresh) { writer->refreshed(refresh); });
    writer->begin();
    while (_output.failureMessage().empty() && replayed.feedNext()) {
    }
    if (_feed.status() == kExitNothingDone) return false;
    Replay& replay = replayed.replay();
    replay.finish();
    writer->finish({.technology = replay.technology(),
                    .messages = _feed.wantedCount(),
                    .display = replay.display()});
    return true;
  }

  /// Hands the outputs to the system; the exit status.
  [[nodiscard]] int finish() {
    _output.flush();
    if (!_output.failureMessage().empty()) return nothingDone(_output.failureMessage());
    if (const auto logged = _services.finishLog(); !logged) {
      return nothingDone(logged.error().message);
    }
    return _feed.status();
  }

  const DecodeOptions& _options;
  InputFeed _feed;
  OfflineServices _services;
  Output _output = Output::standardOutput();
};

int runDecode(const DecodeOptions& options) {
  auto feed = InputFeed::open(options.inputs, options.chosenFormat().isStreamed);
  if (!feed) return feed.error();
  std::optional<Output> logFile;
  if (!options.logFile.empty()) {
    const auto checked = checkOutputIsNoInput(options.logFile, filesOf(options.inputs));
    if (!checked) return nothingDone(checked.error().message);
    auto created = Output::create(options.logFile);
    if (!created) return nothingDone(created.error().message);
    logFile = *std::move(created);
  }
  return Decoder(options, *std::move(feed), std::move(logFile)).run();
}

}  // namespace

CommandRow decodeCommand() {
  const auto options = std::make_shared<DecodeOptions>();
  return {.name = "decode",
          .help = "Decode recordings",
          .options = withInputRows(
              options->inputs,
              {formatOption(options->format, formatRows(decodeFormats())),
               secondsOption("--refresh-every",
                             "The recording's time between refreshes; 0: after every message",
                             options->refreshSeconds),
               {.name = "--log-json",
                .value = "FILE",
                .help = "Write every line of the system log there, as {\"priority\",\"message\"}",
                .target = &options->logFile},
               shownLogOption(options->shownLog)}),
          .sections = {{.title = "Formats",
                        .rows = formatRows(decodeFormats()),
                        .text = kTimesAndNumbers},
                       inputsHelp(),
                       {.title = "Examples", .text = kDecodeExamples}},
          .run = [options] { return runDecode(*options); }};
}

}  // namespace kestro
