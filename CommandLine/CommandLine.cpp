// SPDX-License-Identifier: MIT
#include "CommandLine/CommandLine.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "CommandLine/Commands/CodesCommand.h"
#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/DecodeCommand.h"
#include "CommandLine/Commands/ExplainCommand.h"
#include "CommandLine/Commands/RecordCommand.h"
#include "CommandLine/Commands/SnapshotCommand.h"
#include "CommandLine/Commands/WatchCommand.h"
#include "CommandLine/ExitStatus.h"
#include "Options/ProgramOptions.h"
#include "Platform/Bundle.h"
#include "Platform/Linux/LinuxPlatform.h"

namespace kestro {
namespace {

/// Every command, in the order of the help.
constexpr std::array kCommands = {addWatchCommand,   addDecodeCommand, addRecordCommand,
                                  addExplainCommand, addCodesCommand,  addSnapshotCommand};

constexpr const char* kProgramFooter = R"(Exit status:
  0  done
  1  nothing could be done; one line says why
  2  wrong usage
  3  done, but some messages could not be decoded; each is named on standard error

`kestro-cli COMMAND --help` explains a command.)";

}  // namespace

int runCommandLine(int argumentCount, const char* const* arguments) {
  const auto bundle = createBundle();
  CLI::App program("Shows live, or from a recording, what a phone's cellular baseband is doing.",
                   "kestro-cli");
  addVersionOption(program, *bundle);
  program.require_subcommand(1);
  program.footer(kProgramFooter);
  std::vector<Command> commands;
  std::ranges::transform(kCommands, std::back_inserter(commands),
                         [&](const auto& add) { return add(program); });
  try {
    program.parse(argumentCount, arguments);
  } catch (const CLI::ParseError& error) {
    // Help and version are "errors" of status 0, and go to standard output.
    return program.exit(error) == 0 ? kExitDone : kExitWrongUsage;
  }
  const auto chosen = std::ranges::find_if(
      commands, [](const Command& command) { return command.declaration->parsed(); });
  return chosen->run();
}

}  // namespace kestro
