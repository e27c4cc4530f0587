// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/DecodeCommand.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "CommandLine/Commands/RecordingFeed.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/DecodeWriter.h"
#include "CommandLine/OfflinePlatform.h"
#include "CommandLine/Output.h"
#include "Model/Replay.h"
#include "Recordings/PcapReader.h"

namespace kestro {
namespace {

constexpr const char* kDecodeFooter = R"(Formats:
  tree    the display after the last message, for people
  json    one object: "technology", "messages" (how many) and the last "display"
  ndjson  one line a refresh: "time", "message" (the last one's number) and "display"
  csv     one line for each value and refresh: time,message,path,value
Times are the capture's, in UTC. Messages are numbered from 1, counting every record.

Examples:
  kestro-cli decode drive.pcap
  kestro-cli decode drive.pcap --format=json | jq '.display'
  kestro-cli decode drive.pcap --format=csv --refresh-every=0 > every-message.csv)";

struct DecodeOptions {
  std::string capture;
  std::string format;
  double refreshSeconds = 2;
  std::string logFile;
};

/// One run of the command.
class Decoder {
 public:
  Decoder(const DecodeOptions& options, PcapReader reader, std::optional<Output> logFile)
      : _options(options),
        _feed(options.capture, std::move(reader)),
        _platform(std::move(logFile)) {}

  int run() {
    // The generator is gone before the log is finished: it leaves lines when it goes.
    return decode() ? finish() : kExitNothingDone;
  }

 private:
  /// Writes the capture's displays; false when nothing could be done.
  [[nodiscard]] bool decode() {
    const auto generator = _feed.makeGenerator(_platform);
    if (!generator) return false;
    const std::unique_ptr<DecodeWriter> writer = makeWriter();
    Replay replay(*generator, _platform.clock(),
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
    if (const auto logged = _platform.finishLog(); !logged) {
      complain(logged.error().message);
      return kExitNothingDone;
    }
    return _feed.status();
  }

  const DecodeOptions& _options;
  RecordingFeed _feed;
  OfflinePlatform _platform;
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

Command addDecodeCommand(CLI::App& program) {
  const auto options = std::make_shared<DecodeOptions>();
  CLI::App* command = program.add_subcommand("decode", "Decode a recorded capture");
  command->add_option("CAPTURE", options->capture, "The capture, a pcap file")
      ->required()
      ->option_text(" ");
  addFormatOption(*command, options->format, formatNames(decodeFormats()));
  addSecondsOption(*command, "--refresh-every", options->refreshSeconds,
                   "The capture's time between refreshes; 0: after every message");
  command
      ->add_option("--log-json", options->logFile,
                   "Write every line of the system log there, as {\"priority\",\"message\"}")
      ->option_text("FILE");
  command->footer(kDecodeFooter);
  return {command, [options] { return runDecode(*options); }};
}

}  // namespace kestro
