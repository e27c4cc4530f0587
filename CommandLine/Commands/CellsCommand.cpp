// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/CellsCommand.h"

#include <memory>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/DriveFeed.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/CellRows.h"
#include "CommandLine/InputOptions.h"
#include "CommandLine/Output.h"

namespace kestro {
namespace {

constexpr const char* kCellsText =
    R"(One row for every cell that served or was measured as a neighbour, in the order in which they were
first seen. A cell is its cell identity where a message names that, else its channel and physical
identity ("1300/14"; "-/14" where the channel is not known): physical cell identity, scrambling code,
base-station identity code or PN offset. A neighbour known by these two only takes the identity that
was last seen for them in the ten minutes before; a cell that has such values is marked as assumed.
Levels are RSRP, RSCP or the received level in dBm; qualities RSRQ, Ec/N0 or pilot energy in dB.)";

constexpr const char* kCellsExamples =
    R"(  kestro-cli cells drive.pcapng
  kestro-cli cells drive.pcapng --format=csv > cells.csv
  kestro-cli cells drive.csv --format=json | jq '.[] | select(.serving_s > 60)')";

struct CellsOptions {
  InputOptions inputs;
  std::string format;
};

int runCells(const CellsOptions& options) {
  auto feed = InputFeed::open(options.inputs, false);
  if (!feed) return feed.error();
  DriveFeed drives(*std::move(feed), {}, [](std::size_t, const Event&) {});
  while (drives.takeNext()) {
  }
  if (drives.status() == kExitNothingDone) return kExitNothingDone;
  Output output = Output::standardOutput();
  const auto writer = makeRowWriter(options.format, output);
  writer->begin(cellColumns());
  for (std::size_t i = 0; i < drives.inputCount(); ++i) {
    for (const Cell& cell : drives.watchOf(i).cells().all()) {
      writer->row(fieldsOfCell(cell, drives.nameOf(i)));
    }
  }
  writer->finish();
  output.flush();
  drives.tellWhatWasMissed();
  if (output.failureMessage().empty()) return drives.status();
  complain(output.failureMessage());
  return kExitNothingDone;
}

}  // namespace

CommandRow cellsCommand() {
  const auto options = std::make_shared<CellsOptions>();
  return {.name = "cells",
          .help = "List the cells of a drive, with their levels and the time they served",
          .options = withInputRows(options->inputs,
                                   {formatOption(options->format, formatRows(rowFormats()))}),
          .sections = {{.text = kCellsText},
                       {.title = "Formats", .rows = formatRows(rowFormats())},
                       inputsHelp(),
                       {.title = "Examples", .text = kCellsExamples}},
          .run = [options] { return runCells(*options); }};
}

}  // namespace kestro
