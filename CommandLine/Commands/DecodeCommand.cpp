// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/DecodeCommand.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/RecordingFeed.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/DecodeWriter.h"
#include "CommandLine/OfflineServices.h"
#include "CommandLine/Output.h"
#include "Model/Replay.h"
#include "Recordings/OutputPath.h"
#include "Recordings/PcapReader.h"

namespace kestro {
namespace {

constexpr const char* kDecodeExamples = R"(  kestro-cli decode drive.pcap
  kestro-cli decode drive.pcap --format=json | jq '.display'
  kestro-cli decode drive.pcap --format=csv --refresh-every=0 > every-message.csv)";

struct DecodeOptions {
  std::string capture;
  std::string format;
  double refreshSeconds = 2;
  std::string logFile;
  std::optional<LogPriority> shownLog;
};

/// One run of the command.
class Decoder {
 public:
  Decoder(const DecodeOptions& options, PcapReader reader, std::optional<Output> logFile)
      : _options(options),
        _feed(options.capture, std::move(reader)),
        _services(std::move(logFile), options.shownLog) {}

  int run() {
    // The generator is gone before the log is finished: it leaves lines when it goes.
    return decode() ? finish() : kExitNothingDone;
  }

 private:
  /// Writes the capture's displays; false when nothing could be done.
  [[nodiscard]] bool decode() {
    const auto generator = _feed.makeGenerator(_services.forGenerator());
    if (!generator) return false;
    const std::unique_ptr<DecodeWriter> writer = makeWriter();
    Replay replay(*generator, _services.clock(),
                  {.refreshInterval = durationOfSeconds(_options.refreshSeconds)},
                  [&](const ReplayRefresh& refresh) { writer->refreshed(refresh); });
    writer->begin();
    while (_output.failureMessage().empty() && _feed.feedNext(replay)) {
    }
    if (_feed.status() == kExitNothingDone) return false;
    replay.finish();
    writer->finish({.technology = _feed.technology(),
                    .messages = _feed.messageCount(),
                    .display = replay.display()});
    return true;
  }

  [[nodiscard]] std::unique_ptr<DecodeWriter> makeWriter() {
    const auto& formats = decodeFormats();
    return std::ranges::find(formats, _options.format, &DecodeFormat::name)->makeWriter(_output);
  }

  /// Hands the outputs to the system; the exit status.
  [[nodiscard]] int finish() {
    _output.flush();
    if (!_output.failureMessage().empty()) {
      complain(_output.failureMessage());
      return kExitNothingDone;
    }
    if (const auto logged = _services.finishLog(); !logged) {
      complain(logged.error().message);
      return kExitNothingDone;
    }
    return _feed.status();
  }

  const DecodeOptions& _options;
  RecordingFeed _feed;
  OfflineServices _services;
  Output _output = Output::standardOutput();
};

int runDecode(const DecodeOptions& options) {
  auto reader = PcapReader::open(options.capture);
  if (!reader) {
    complain(reader.error().message);
    return kExitNothingDone;
  }
  std::optional<Output> logFile;
  if (!options.logFile.empty()) {
    const std::string inputs[] = {options.capture};
    if (const auto checked = checkOutputIsNoInput(options.logFile, inputs); !checked) {
      complain(checked.error().message);
      return kExitNothingDone;
    }
    auto created = Output::create(options.logFile);
    if (!created) {
      complain(created.error().message);
      return kExitNothingDone;
    }
    logFile = *std::move(created);
  }
  return Decoder(options, *std::move(reader), std::move(logFile)).run();
}

}  // namespace

CommandRow decodeCommand() {
  const auto options = std::make_shared<DecodeOptions>();
  return {.name = "decode",
          .help = "Decode a recorded capture",
          .options = {captureArgument(options->capture),
                      formatOption(options->format, formatRows(decodeFormats())),
                      secondsOption("--refresh-every",
                                    "The capture's time between refreshes; 0: after every message",
                                    options->refreshSeconds),
                      {.name = "--log-json",
                       .value = "FILE",
                       .help = "Write every line of the system log there, as "
                               "{\"priority\",\"message\"}",
                       .target = &options->logFile},
                      shownLogOption(options->shownLog)},
          .sections = {{.title = "Formats",
                        .rows = formatRows(decodeFormats()),
                        .text = kTimesAndNumbers},
                       {.title = "Examples", .text = kDecodeExamples}},
          .run = [options] { return runDecode(*options); }};
}

}  // namespace kestro
