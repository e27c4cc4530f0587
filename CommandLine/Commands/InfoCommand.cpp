// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/InfoCommand.h"

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Formats/InputSummary.h"
#include "CommandLine/Formats/PacketNames.h"
#include "CommandLine/InputFeed.h"
#include "CommandLine/Output.h"

namespace kestro {
namespace {

constexpr const char* kInfoText =
    R"(Of every input: its form, its span, messages and bytes by technology and by log code, gaps of 5 s
and more, notes, and what is damaged. Nothing is decoded. Each input is told of by itself, its
messages numbered from 1.)";

constexpr const char* kInfoExamples = R"(  kestro-cli info drive.pcapng
  kestro-cli info *.pcapng --format=json | jq '.inputs[] | {input, messages, gapCount}')";

constexpr const char* kTable = "table";
constexpr const char* kJson = "json";

std::vector<HelpRow> infoFormats() {
  return {{kTable, "for people"},
          {kJson, "one object, \"inputs\"; no more than 1,000 gaps and notes of an input"}};
}

struct InfoOptions {
  InputOptions inputs;
  std::string format;
};

/// What the packets of all technologies are called.
class Names {
 public:
  [[nodiscard]] std::string_view nameOf(const InputSummary::Kind& kind) {
    auto& known = _known[kind.first];
    if (!known.names) {
      known.generator = LogGenerator::generatorFromTechnology(_services.forGenerator(), kind.first);
      if (!known.generator) return {};
      known.names.emplace(*known.generator);
    }
    return kind.second ? known.names->nameOf(*kind.second) : std::string_view();
  }

 private:
  struct Known {
    std::unique_ptr<LogGenerator> generator;
    std::optional<PacketNames> names;
  };
  OfflineServices _services;
  std::map<std::string_view, Known> _known;
};

InputSummary summaryOf(InputFeed& feed) {
  InputSummary summary;
  summary.name = feed.name();
  summary.form = feed.inputs().reader(0).form();
  const InputFeed::Handler add = [&](const InputMessage& message) -> Result<void> {
    summary.add(message);
    return {};
  };
  feed.setCutHandler(add);
  while (feed.takeNext(add)) {
  }
  const InputReader& reader = feed.inputs().reader(0);
  for (const auto& note : reader.closingNotes()) summary.addClosingNote(note);
  summary.passedOverCount = reader.passedOverCount();
  summary.damage = feed.damage();
  return summary;
}

/// Writes what has been summed up; the exit status.
int write(const std::vector<InputSummary>& summaries, std::string_view format, int status) {
  Names names;
  const NameOfKind nameOf = [&names](const auto& kind) { return names.nameOf(kind); };
  std::string text;
  if (format == kJson) {
    appendInfoJson(text, summaries, nameOf);
  } else {
    for (const auto& summary : summaries) {
      if (!text.empty()) text += '\n';
      appendInfoTable(text, summary, nameOf);
    }
  }
  Output output = Output::standardOutput();
  output.write(text);
  output.flush();
  return output.failureMessage().empty() ? status : nothingDone(output.failureMessage());
}

int runInfo(const InfoOptions& options) {
  std::vector<InputSummary> summaries;
  int status = kExitDone;
  for (const std::string& input : options.inputs.inputs) {
    InputOptions one = options.inputs;
    one.inputs = {input};
    auto feed = InputFeed::open(one, false);
    if (!feed && feed.error() == kExitWrongUsage) return feed.error();
    if (!feed) {
      status = kExitNothingDone;
      continue;
    }
    summaries.push_back(summaryOf(*feed));
    if (status == kExitDone && feed->status() != kExitDone) status = kExitPartlyDone;
  }
  return summaries.empty() ? status : write(summaries, options.format, status);
}

}  // namespace

CommandRow infoCommand() {
  const auto options = std::make_shared<InfoOptions>();
  return {.name = "info",
          .help = "Tell what recordings hold",
          .options = withInputRows(options->inputs, {formatOption(options->format, infoFormats())}),
          .sections = {{.text = kInfoText},
                       {.title = "Formats", .rows = infoFormats()},
                       inputsHelp(),
                       {.title = "Examples", .text = kInfoExamples}},
          .run = [options] { return runInfo(*options); }};
}

}  // namespace kestro
