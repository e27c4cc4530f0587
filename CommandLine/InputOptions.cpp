// SPDX-License-Identifier: MIT
#include "CommandLine/InputOptions.h"

#include <optional>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "Options/ProgramOptions.h"
#include "Sources/SourceCatalogue.h"

namespace kestro {
namespace {

constexpr const char* kInputsText =
    R"(An INPUT is a recording, known by its content (pcap, pcapng, a DLF log, a snapshot, or a drive-test
log), "-" for one on standard input, or KIND:ARGUMENT as `kestro-telephonyd --source` takes it, played
without waiting: simulation:LTE (which needs --to), stream:PATH. A file that is named like that is
./KIND:ARGUMENT. Several are merged by time. Times are 2019-11-21T15:38:36 (UTC unless a zone
follows: Z, +01:00), or +90s, +2m30s from the first message; #N is a message by its number.)";

OptionRow boundOption(std::string name, std::string help, std::optional<InputBound>& bound) {
  return {.name = std::move(name),
          .value = "TIME",
          .help = std::move(help),
          .target = [&bound](const std::string& text) {
            const auto parsed = parseInputBound(text);
            if (!parsed) return parsed.error().message;
            bound = *parsed;
            return std::string();
          }};
}

std::string inputProblem(const std::string& text) {
  const auto parsed = parseInput(text, "");
  return parsed ? "" : parsed.error().message;
}

}  // namespace

HelpSection inputsHelp() { return {.title = "Inputs", .text = kInputsText}; }

std::vector<OptionRow> inputRows(InputOptions& options) {
  return {
      {.name = "INPUT",
       .help = "What is read; see below",
       .target = &options.inputs,
       .isRequired = true,
       .problem = inputProblem},
      boundOption("--from", "Only messages of this time and later", options.narrowing.from),
      boundOption("--to", "Only messages before this time; with #N, up to that one",
                  options.narrowing.to),
      codeOption(options.narrowing.code),
      {.name = "--technology",
       .value = "NAME",
       .help = "Only messages of this technology; and what a drive-test log, a stream or a DLF log "
               "is taken for:\nIFX, Ondrel_GSM, Ondrel_CDMA, LTE, UTRAN2, auto",
       .target = &options.technology,
       .choices = choicesOf(technologyChoices())},
  };
}

std::vector<OptionRow> withInputRows(InputOptions& options, std::vector<OptionRow> own) {
  auto rows = inputRows(options);
  for (OptionRow& row : own) rows.push_back(std::move(row));
  return rows;
}

std::vector<SourceRequest> requestsOf(const InputOptions& options) {
  std::vector<SourceRequest> requests;
  for (const std::string& text : options.inputs) {
    if (auto request = parseInput(text, technologyChosen(options.technology))) {
      requests.push_back(*std::move(request));
    }
  }
  return requests;
}

std::vector<std::string> filesOf(const InputOptions& options) {
  std::vector<std::string> files;
  for (const SourceRequest& request : requestsOf(options)) {
    const auto* kind = sourceKindNamed(request.kind);
    if (kind != nullptr && !kind->isEndless) files.push_back(request.argument);
  }
  return files;
}

InputNarrowing narrowingOf(const InputOptions& options) {
  InputNarrowing narrowing = options.narrowing;
  narrowing.technology = technologyNamed(options.technology);
  return narrowing;
}

}  // namespace kestro
