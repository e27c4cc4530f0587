// SPDX-License-Identifier: MIT
#include "TelephonyServer/Options.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <string_view>
#include <utility>
#include <vector>

#include "Options/ProgramOptions.h"

namespace kestro {
namespace {

std::string indented(std::string_view text, std::string_view indent) {
  std::string result(indent);
  for (const char c : text) {
    result += c;
    if (c == '\n') result += indent;
  }
  return result;
}

constexpr const char* kPlayingText =
    R"(The source's time passes whether or not a client is connected. When it has ended, the
server stays: clients keep their channels, and no more messages come.)";
constexpr const char* kExamples = R"(  kestro-telephonyd
  kestro-telephonyd --source=capture:drive.pcap --speed=10 --loop
  kestro-telephonyd --source=drive-test:log.csv --technology=IFX
  kestro-telephonyd --source=modem --gps=gpsd
  bridge | kestro-telephonyd --source=stream:- --technology=LTE)";
constexpr const char* kPortsText =
    R"(Ports live in $KESTRO_PORT_DIR, else $XDG_RUNTIME_DIR/kestro, else /tmp/kestro-<uid>.
Exit status: 0 ended as asked, 1 nothing could be done, 2 wrong usage.)";

std::string sourcesText() {
  std::string text;
  for (const auto& kind : sourceKinds()) {
    text += fmt::format("  {}\n{}\n", kind.form, indented(kind.description, "      "));
  }
  return text;
}

std::vector<OptionRow> sourceOptions(ServerArguments& arguments) {
  return {
      {.name = "--source",
       .value = "KIND[:ARGUMENT]",
       .help = "Where the messages come from (below)",
       .target = &arguments.source},
      {.name = "--technology",
       .value = "NAME",
       .help = fmt::format("What the messages are, whatever the source says:\n{}",
                           fmt::join(technologyChoices(), ", ")),
       .target = &arguments.technology,
       .choices = choicesOf(technologyChoices())},
      speedOption(arguments.options.playback.speed),
      loopOption(arguments.options.playback.loop),
      {.name = "--gps",
       .value = "gpsd[:HOST[:PORT]]",
       .help = "Of a modem: where positions come from;\nthe modem itself unless given",
       .target = &arguments.gps},
      {.name = "--personal",
       .help = "Of a modem: show IMSI, ICCID, IMEI, numbers and addresses\nwhole, not the last "
               "four digits alone",
       .target = &arguments.isPersonal},
      {.name = "--list-modems",
       .help = "List the modems that ModemManager has, and end",
       .target = &arguments.options.listsModems},
  };
}

Result<void> understand(ServerArguments& arguments) {
  ServerOptions& options = arguments.options;
  auto source = parseSource(arguments.source, technologyChosen(arguments.technology));
  if (!source) return tl::unexpected(source.error());
  options.source = *std::move(source);
  const bool isModem = options.source.kind == "modem";
  if (!arguments.gps.empty() && !isModem) return failure("--gps goes with --source=modem");
  if (arguments.isPersonal && !isModem && !options.listsModems) {
    return failure("--personal goes with --source=modem");
  }
  if (!arguments.gps.empty()) {
    if (const auto gps = parseGps(arguments.gps); !gps) return tl::unexpected(gps.error());
  }
  options.source.gps = arguments.gps;
  options.source.isPersonal = arguments.isPersonal;
  options.exitsWithParent = arguments.parent.has_value();
  if (arguments.parent > 0) options.parent = arguments.parent;
  return {};
}

}  // namespace

CommandRow serverProgram(const Bundle& bundle, ServerArguments& arguments) {
  arguments.source = sourceKinds().front().name;
  CommandRow program{.name = "kestro-telephonyd",
                     .help = "Streams the log messages of a phone's baseband to Kestro's displays.",
                     .options = {versionOption("kestro-telephonyd", bundle)},
                     .sections = {{.title = "Sources", .text = sourcesText()},
                                  {.text = kPlayingText},
                                  {.title = "Examples", .text = kExamples},
                                  {.text = kPortsText}}};
  for (auto& row : sourceOptions(arguments)) program.options.push_back(std::move(row));
  program.options.push_back(
      portNameOption("--name", "The server's port", arguments.options.portName));
  program.options.push_back(logPriorityOption(arguments.options.logThreshold));
  program.options.push_back({.name = "--exit-with-parent",
                             .value = "PROCESS",
                             .target = &arguments.parent,
                             .impliedValue = "",
                             .isHidden = true});
  program.options.push_back({.name = "--demo-directory",
                             .value = "PATH",
                             .target = &arguments.options.demoDirectory,
                             .isHidden = true});
  return program;
}

std::variant<ServerOptions, OptionsText> parseServerOptions(const Bundle& bundle, int argumentCount,
                                                            const char* const* arguments) {
  ServerArguments given;
  const CommandRow program = serverProgram(bundle, given);
  const auto parsed = parseArguments(program, argumentCount, arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) return *text;
  if (const auto understood = understand(given); !understood) {
    return OptionsText{understood.error().message + "\n", kWrongUsage};
  }
  return given.options;
}

}  // namespace kestro
