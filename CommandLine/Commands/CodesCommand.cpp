// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/CodesCommand.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/CodesFormats.h"
#include "CommandLine/OfflineServices.h"
#include "CommandLine/Output.h"
#include "Options/ProgramOptions.h"

namespace kestro {
namespace {

constexpr const char* kCodesExamples = R"(  kestro-cli codes --technology=LTE
  kestro-cli codes --format=json | jq '.[].codes[] | .code + " " + .name')";

struct CodesOptions {
  std::string technology;
  std::string format;
  std::optional<LogPriority> shownLog;
};

int runCodes(const CodesOptions& options) {
  OfflineServices services(std::nullopt, options.shownLog);
  std::vector<TechnologyCodes> technologies;
  for (const std::string_view technology : LogGenerator::technologies()) {
    if (!options.technology.empty() && options.technology != technology) continue;
    technologies.push_back(codesOfTechnology(services.forGenerator(), technology));
  }
  const auto format = std::ranges::find(codesFormats(), options.format, &CodesFormat::name);
  Output output = Output::standardOutput();
  output.write(format->text(technologies));
  output.flush();
  if (output.failureMessage().empty()) return kExitDone;
  complain(output.failureMessage());
  return kExitNothingDone;
}

}  // namespace

CommandRow codesCommand() {
  const auto options = std::make_shared<CodesOptions>();
  return {.name = "codes",
          .help = "List every log code with its sections and keys",
          .options = {{.name = "--technology",
                       .help = "Only the codes of this one",
                       .target = &options->technology,
                       .choices = choicesOf(LogGenerator::technologies())},
                      formatOption(options->format, formatRows(codesFormats())),
                      shownLogOption(options->shownLog)},
          .sections = {{.title = "Formats", .rows = formatRows(codesFormats())},
                       {.title = "Examples", .text = kCodesExamples}},
          .run = [options] { return runCodes(*options); }};
}

}  // namespace kestro
