// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/CodesCommand.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/CodesFormats.h"
#include "CommandLine/OfflinePlatform.h"
#include "CommandLine/Output.h"

namespace kestro {
namespace {

constexpr const char* kCodesFooter = R"(Formats:
  table     code by code: the packet, its least length, the sections and their keys
  markdown  a document, with where every key is read and how it is shown
  json      all of that for programs: an array of technologies

Examples:
  kestro-cli codes --technology=LTE
  kestro-cli codes --format=json | jq '.[].codes[] | .code + " " + .name')";

struct CodesOptions {
  std::string technology;
  std::string format;
};

int runCodes(const CodesOptions& options) {
  OfflinePlatform platform;
  std::vector<TechnologyCodes> technologies;
  for (const std::string_view technology : LogGenerator::technologies()) {
    if (!options.technology.empty() && options.technology != technology) continue;
    technologies.push_back(codesOfTechnology(platform, technology));
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

Command addCodesCommand(CLI::App& program) {
  const auto options = std::make_shared<CodesOptions>();
  CLI::App* command =
      program.add_subcommand("codes", "List every log code with its sections and keys");
  const auto technologies = LogGenerator::technologies();
  const std::vector<std::string> names(technologies.begin(), technologies.end());
  command->add_option("--technology", options->technology, "Only the codes of this one")
      ->check(CLI::IsMember(names))
      ->option_text(fmt::format("{}", fmt::join(names, "|")));
  addFormatOption(*command, options->format, formatNames(codesFormats()));
  command->footer(kCodesFooter);
  return {command, [options] { return runCodes(*options); }};
}

}  // namespace kestro
