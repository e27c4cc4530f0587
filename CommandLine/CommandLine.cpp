// SPDX-License-Identifier: MIT
#include "CommandLine/CommandLine.h"

#include <variant>

#include "CommandLine/Commands/CellsCommand.h"
#include "CommandLine/Commands/CodesCommand.h"
#include "CommandLine/Commands/ConvertCommand.h"
#include "CommandLine/Commands/DecodeCommand.h"
#include "CommandLine/Commands/EventsCommand.h"
#include "CommandLine/Commands/ExplainCommand.h"
#include "CommandLine/Commands/InfoCommand.h"
#include "CommandLine/Commands/MeasureCommand.h"
#include "CommandLine/Commands/RecordCommand.h"
#include "CommandLine/Commands/SnapshotCommand.h"
#include "CommandLine/Commands/WatchCommand.h"
#include "Options/ArgumentParser.h"
#include "Options/ProgramOptions.h"
#include "Platform/Bundle.h"
#include "Platform/Linux/LinuxPlatform.h"

namespace kestro {

CommandRow commandLineProgram(const Bundle& bundle) {
  return {.name = "kestro-cli",
          .help = "Shows live, or from a recording, what a phone's cellular baseband is doing.",
          .options = {versionOption("kestro-cli", bundle)},
          .commands = {watchCommand(), recordCommand(), decodeCommand(), convertCommand(),
                       explainCommand(), infoCommand(), measureCommand(), cellsCommand(),
                       eventsCommand(), codesCommand(), snapshotCommand()},
          .sections = {{.title = "Exit status",
                        .rows = {{"0", "done"},
                                 {"1", "nothing could be done; one line says why"},
                                 {"2", "wrong usage"},
                                 {"3",
                                  "done, but some messages could not be decoded or were not "
                                  "recorded; standard error says which, or how many"}}},
                       {.text = "`kestro-cli COMMAND --help` explains a command."}}};
}

int runCommandLine(int argumentCount, const char* const* arguments) {
  const auto bundle = createBundle();
  const CommandRow program = commandLineProgram(*bundle);
  const auto parsed = parseArguments(program, argumentCount, arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) return tell(*text);
  return std::get<const CommandRow*>(parsed)->run();
}

}  // namespace kestro
