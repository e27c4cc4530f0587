// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/MeasureCommand.h"

#include <fmt/format.h>

#include <memory>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/MeasureWriter.h"
#include "CommandLine/InputOptions.h"
#include "CommandLine/MeasureFeed.h"
#include "CommandLine/MeasureStore.h"
#include "CommandLine/Output.h"
#include "Measurements/GpxReader.h"

namespace kestro {
namespace {

constexpr const char* kMeasureText =
    R"(What the messages say, value by value: a number with its unit, a state, or a text. A series is
"Section/Key" as the display has them; the item tells one row of a list from the others, whatever
its position: channel and physical cell identity, scrambling code, ARFCN and BSIC, PN offset. A value
that a message says is absent is none. Of drive-test logs what their packets must make up is left out.
-o writes measurements, cells, events and positions into a store, a SQLite file; a recording that is
there already is replaced, and a run that breaks off leaves the file as it was.)";

constexpr const char* kMeasureExamples =
    R"(  kestro-cli measure drive.pcapng > drive.csv
  kestro-cli measure drive.pcapng --series='*RSRP' --changes
  kestro-cli measure drive.pcapng --track=drive.gpx --format=ndjson
  kestro-cli measure *.pcapng -o drives.sqlite)";

struct MeasureOptions {
  InputOptions inputs;
  std::string format;
  std::vector<std::string> series;
  bool changes = false;
  std::string track;
  std::string store;
};

/// The track in a file, none for an empty name.
Result<Track> trackOf(const std::string& path) {
  if (path.empty()) return Track();
  std::uint64_t leftOut = 0;
  auto track = readGpxFile(path, leftOut);
  if (track && leftOut != 0) {
    complain(fmt::format("{}: {} points without a time or a place were left out", path, leftOut));
  }
  return track;
}

int writeLines(const MeasureOptions& options, MeasureChoice choice) {
  auto feed = InputFeed::open(options.inputs, true);
  if (!feed) return feed.error();
  MeasureFeed drives(*std::move(feed), std::move(choice));
  Output output = Output::standardOutput();
  const auto writer = makeMeasureWriter(options.format, output);
  writer->begin(!options.track.empty());
  const auto write = [&writer](const ChosenValues& values) { writer->take(values); };
  while (output.failureMessage().empty() && drives.takeNext(write)) {
  }
  if (drives.status() == kExitNothingDone) return kExitNothingDone;
  writer->finish();
  output.flush();
  if (output.failureMessage().empty() || output.readerIsGone()) return drives.status();
  return nothingDone(output.failureMessage());
}

int runMeasure(const MeasureOptions& options) {
  auto track = trackOf(options.track);
  if (!track) return nothingDone(track.error().message);
  MeasureChoice choice{
      .series = options.series, .changesOnly = options.changes, .track = *std::move(track)};
  if (options.store.empty()) return writeLines(options, std::move(choice));
  choice.followsCells = true;
  return writeStore(options.inputs, choice, options.store);
}

std::vector<OptionRow> measureRows(MeasureOptions& options) {
  return {
      formatOption(options.format, formatRows(measureFormats())),
      {.name = "--series",
       .value = "GLOB",
       .help = "Only series of such a name: \"*\" stands for any characters, \"/\" as well; may be "
               "given\nseveral times",
       .target = &options.series},
      {.name = "--changes",
       .help = "Only values that differ from the series' last one",
       .target = &options.changes},
      {.name = "--track",
       .value = "FILE",
       .help = "A GPX track: each value has the position at its time",
       .target = &options.track},
      {.name = "-o,--output",
       .value = "FILE",
       .help = "Write a store, a SQLite file, in place of lines",
       .target = &options.store,
       .excludes = "--format"},
  };
}

}  // namespace

CommandRow measureCommand() {
  const auto options = std::make_shared<MeasureOptions>();
  return {.name = "measure",
          .help = "Turn messages into numbers over time: lines, or a SQLite store",
          .options = withInputRows(options->inputs, measureRows(*options)),
          .sections = {{.text = kMeasureText},
                       {.title = "Formats", .rows = formatRows(measureFormats())},
                       inputsHelp(),
                       {.title = "Examples", .text = kMeasureExamples}},
          .run = [options] { return runMeasure(*options); }};
}

}  // namespace kestro
