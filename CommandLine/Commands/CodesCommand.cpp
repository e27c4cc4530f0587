// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/CodesCommand.h"

#include <fmt/format.h>

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
#include "Platform/Bundle.h"

namespace kestro {
namespace {

constexpr const char* kCodesExamples = R"(  kestro-cli codes --technology=LTE
  kestro-cli codes --format=json | jq '.[].codes[] | .code + " " + .name'
  kestro-cli codes --format=lua > ~/.local/lib/wireshark/plugins/kestro.lua)";

struct CodesOptions {
  std::string technology;
  std::string format;
  std::optional<LogPriority> shownLog;
};

int fail(std::string_view reason) {
  complain(reason);
  return kExitNothingDone;
}

int runCodes(const CodesOptions& options) {
  OfflineServices services(std::nullopt, options.shownLog);
  std::vector<TechnologyCodes> technologies;
  for (const std::string_view technology : LogGenerator::technologies()) {
    if (!options.technology.empty() && options.technology != technology) continue;
    technologies.push_back(codesOfTechnology(services.forGenerator(), technology));
  }
  const auto format = std::ranges::find(codesFormats(), options.format, &CodesFormat::name);
  Output output = Output::standardOutput();
  for (const auto& [name, extension] : format->preamble) {
    const auto contents = services.forGenerator().bundle.resource(name, extension);
    if (!contents) return fail(fmt::format("the resource {}.{} is missing", name, extension));
    output.write({reinterpret_cast<const char*>(contents->data()), contents->size()});
  }
  output.write(format->text(technologies));
  output.flush();
  return output.failureMessage().empty() ? kExitDone : fail(output.failureMessage());
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
