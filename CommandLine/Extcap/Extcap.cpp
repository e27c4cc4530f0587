// SPDX-License-Identifier: MIT
#include "CommandLine/Extcap/Extcap.h"

#include <fmt/format.h>

#include <memory>
#include <string>
#include <variant>

#include "CommandLine/ExitStatus.h"
#include "CommandLine/Extcap/ExtcapCapture.h"
#include "CommandLine/Extcap/ExtcapInterfaces.h"
#include "CommandLine/Output.h"
#include "LogGenerator/LogGenerator.h"
#include "Options/ArgumentParser.h"
#include "Options/ProgramOptions.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

constexpr const char* kExtcapText =
    R"(Wireshark starts this program from its folder for such (`tshark -G folders` names it). It has
the interfaces "Kestro log channel" and "Kestro simulation", and writes what comes there as pcapng.)";

struct ExtcapOptions {
  bool asksForInterfaces = false;
  bool asksForLinkTypes = false;
  bool asksForOptions = false;
  bool captures = false;
  std::string interfaceName;
  std::string pipe;
  std::string captureFilter;
  std::string wiresharkVersion;
  LiveOptions live;
  std::string source{kSimulationSource};
  std::string technology;
};

int refuse(std::string_view reason) {
  complain(reason);
  return kExitNothingDone;
}

int answer(const std::string& text) {
  Output output = Output::standardOutput();
  output.write(text);
  output.flush();
  return output.failureMessage().empty() ? kExitDone : refuse(output.failureMessage());
}

int capture(ExtcapOptions& options) {
  if (options.pipe.empty()) return refuse("--capture needs --fifo: the pipe to write to");
  if (!options.captureFilter.empty()) {
    return refuse("there are no capture filters for log channels; display filters do the same");
  }
  if (options.interfaceName == kSimulationInterface) {
    const bool isSimulation = options.source == kSimulationSource;
    options.live.demoSource = options.source;
    if (isSimulation && !options.technology.empty()) {
      options.live.demoSource += ":" + options.technology;
    }
  }
  return captureForWireshark(options.live, options.pipe);
}

int runChosen(ExtcapOptions& options, const Bundle& bundle) {
  if (options.asksForInterfaces) return answer(interfacesAnswer(bundle.version().value_or("")));
  if (!isExtcapInterface(options.interfaceName)) {
    return refuse(fmt::format("\"{}\" is no interface of Kestro", options.interfaceName));
  }
  if (options.asksForLinkTypes) return answer(linkTypesAnswer());
  if (options.asksForOptions) return answer(optionsAnswer(options.interfaceName));
  if (options.captures) return capture(options);
  // What is left is the question whether a capture filter is right: whatever is answered is wrong.
  return options.captureFilter.empty() ? kExitDone : answer("there are no capture filters\n");
}

/// What Wireshark asks. Its own version, and a filter, come with some of the questions.
std::vector<OptionRow> questionRows(ExtcapOptions& options) {
  return {{.name = "--extcap-interfaces",
           .help = "Tell which interfaces there are",
           .target = &options.asksForInterfaces},
          {.name = "--extcap-interface",
           .value = "NAME",
           .help = "The interface that is meant",
           .target = &options.interfaceName},
          {.name = "--extcap-dlts",
           .help = "Tell the interface's link types",
           .target = &options.asksForLinkTypes},
          {.name = "--extcap-config",
           .help = "Tell the interface's options",
           .target = &options.asksForOptions},
          {.name = "--capture", .help = "Capture from the interface", .target = &options.captures},
          {.name = "--fifo",
           .value = "PIPE",
           .help = "Where to write the capture",
           .target = &options.pipe},
          {.name = "--extcap-capture-filter",
           .value = "FILTER",
           .help = "A capture filter; none is known",
           .target = &options.captureFilter,
           .impliedValue = ""},
          {.name = "--extcap-version",
           .value = "VERSION",
           .help = "Wireshark's version",
           .target = &options.wiresharkVersion,
           .impliedValue = "unknown"}};
}

}  // namespace

CommandRow extcapProgram(const Bundle& bundle) {
  const auto options = std::make_shared<ExtcapOptions>();
  CommandRow program{
      .name = "kestro-extcap",
      .help = "Lets Wireshark capture from a phone's log channel, or from a simulated one.",
      .options = questionRows(*options),
      .sections = {{.text = kExtcapText}},
      .run = [options, &bundle] { return runChosen(*options, bundle); }};
  program.options.push_back(portNameOption("--server-name", "The log channel's telephony server",
                                           options->live.serverName));
  program.options.push_back({.name = "--source",
                             .value = "KIND[:ARGUMENT]",
                             .help = "What the simulation plays: as `kestro-telephonyd --source`",
                             .target = &options->source});
  program.options.push_back({.name = "--technology",
                             .help = "Of the source simulation",
                             .target = &options->technology,
                             .choices = choicesOf(LogGenerator::technologies())});
  program.options.push_back(versionOption("kestro-extcap", bundle));
  return program;
}

int runExtcap(int argumentCount, const char* const* arguments) {
  const auto bundle = createBundle();
  const CommandRow program = extcapProgram(*bundle);
  const auto parsed = parseArguments(program, argumentCount, arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) return tell(*text);
  return std::get<const CommandRow*>(parsed)->run();
}

}  // namespace kestro
