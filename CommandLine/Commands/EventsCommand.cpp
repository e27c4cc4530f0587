// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/EventsCommand.h"

#include <memory>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/DriveFeed.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/CellRows.h"
#include "CommandLine/InputOptions.h"
#include "CommandLine/Output.h"
#include "CommandLine/RuleOptions.h"

namespace kestro {
namespace {

constexpr const char* kEventsText =
    R"(One row for every change of the serving cell, its technology, area, network and the named states,
for messages that were missing for 5 s and are back, and for rules that are broken and kept again.
Another serving cell is a handover where a packet of the second before says that the phone was
connected ("Connected" names it), else a reselection. "Told by" names the packet that showed the
change. A level is the cell's last one, if that is not older than 10 s.)";

constexpr const char* kEventsExamples =
    R"(  kestro-cli events drive.pcapng
  kestro-cli events drive.pcapng --rule='Measured RSRP < -110 dBm for 4 s'
  kestro-cli events drive.pcapng --rules=alarms.txt --format=csv > events.csv)";

struct EventsOptions {
  InputOptions inputs;
  RuleOptions rules;
  std::string format;
};

int runEvents(const EventsOptions& options) {
  const auto rules = rulesOf(options.rules);
  if (!rules) {
    complain(rules.error().message);
    return kExitNothingDone;
  }
  auto feed = InputFeed::open(options.inputs, true);
  if (!feed) return feed.error();
  Output output = Output::standardOutput();
  const auto writer = makeRowWriter(options.format, output);
  writer->begin(eventColumns());
  const DriveFeed* names = nullptr;
  DriveFeed drives(*std::move(feed), *rules, [&](std::size_t input, const Event& event) {
    writer->row(fieldsOfEvent(event, names->nameOf(input)));
  });
  names = &drives;
  while (output.failureMessage().empty() && drives.takeNext()) {
  }
  if (drives.status() == kExitNothingDone) return kExitNothingDone;
  writer->finish();
  output.flush();
  drives.tellWhatWasMissed();
  if (output.failureMessage().empty()) return drives.status();
  complain(output.failureMessage());
  return kExitNothingDone;
}

}  // namespace

CommandRow eventsCommand() {
  const auto options = std::make_shared<EventsOptions>();
  auto own = ruleRows(options->rules);
  own.push_back(formatOption(options->format, formatRows(rowFormats())));
  return {.name = "events",
          .help = "Tell what happened on a drive: handovers, states, gaps, alarms",
          .options = withInputRows(options->inputs, std::move(own)),
          .sections = {{.text = kEventsText},
                       rulesHelp(),
                       {.title = "Formats", .rows = formatRows(rowFormats())},
                       inputsHelp(),
                       {.title = "Examples", .text = kEventsExamples}},
          .run = [options] { return runEvents(*options); }};
}

}  // namespace kestro
