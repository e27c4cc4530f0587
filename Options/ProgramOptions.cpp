// SPDX-License-Identifier: MIT
#include "Options/ProgramOptions.h"

#include <fmt/format.h>

#include <utility>

#include "Platform/DemoServer.h"
#include "Platform/PortName.h"

namespace kestro {
namespace {

constexpr double kSlowestPlayback = 0.001;
constexpr double kFastestPlayback = 1e6;

std::string portNameProblem(const std::string& name) {
  if (isPortName(name)) return "";
  return fmt::format("'{}' is no port name (1 to 64 letters, digits, '.', '-', '_')", name);
}

}  // namespace

std::vector<OptionRow> liveOptions(LiveOptions& options) {
  OptionRow speed = speedOption(options.demoSpeed);
  OptionRow loop = loopOption(options.demoLoops);
  speed.needs = loop.needs = "--demo";
  return {
      portNameOption("--server", "The telephony server's port", options.serverName),
      {.name = "--demo",
       .value = "SOURCE",
       .help = "Start a telephony server of one's own with this source; `kestro-telephonyd --help` "
               "lists them",
       .target = &options.demoSource,
       .impliedValue = kDefaultDemoSource,
       .excludes = "--server"},
      std::move(speed),
      std::move(loop),
      logPriorityOption(options.logThreshold),
  };
}

OptionRow speedOption(double& speed) {
  return {.name = "--speed",
          .value = "X",
          .help = "Seconds of the source in one second",
          .target = &speed,
          .range = NumberRange{kSlowestPlayback, kFastestPlayback}};
}

OptionRow loopOption(bool& loops) {
  return {.name = "--loop", .help = "Begin again when the source has ended", .target = &loops};
}

OptionRow logPriorityOption(LogPriority& threshold) {
  return {.name = "--log-priority",
          .value = "N",
          .help =
              "The system log gets lines up to this priority: 3 errors, 4 warnings, 5 notices, "
              "7 everything",
          .target = &threshold,
          .range = kLogPriorities};
}

OptionRow portNameOption(std::string name, std::string help, std::string& portName) {
  return {.name = std::move(name),
          .value = "NAME",
          .help = std::move(help),
          .target = &portName,
          .problem = portNameProblem};
}

OptionRow versionOption(std::string_view program, const Bundle& bundle) {
  return {.name = "--version",
          .help = "Display program version information and exit",
          .target = [program = std::string(program), &bundle] {
            return fmt::format("{} {}", program, bundle.version().value_or("of unknown version"));
          }};
}

}  // namespace kestro
