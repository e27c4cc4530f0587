// SPDX-License-Identifier: MIT
#include "Options/ProgramOptions.h"

#include <fmt/format.h>

#include <CLI/CLI.hpp>

#include "Platform/DemoServer.h"
#include "Platform/PortName.h"

namespace kestro {

void addLiveOptions(CLI::App& program, LiveOptions& options) {
  auto* server = program.add_option("--server", options.serverName, "The telephony server's port")
                     ->check(CLI::Validator(portNameProblem, ""))
                     ->option_text(fmt::format("NAME (default: {})", options.serverName));
  program
      .add_option_function<std::string>(
          "--demo",
          [&options](const std::string& source) {
            options.demoSource = source.empty() ? kDefaultDemoSource : source;
          },
          "Start a telephony server of one's own with this source; `kestro-telephonyd --help` "
          "lists them")
      ->expected(0, 1)
      ->excludes(server)
      ->option_text(fmt::format("[=SOURCE] (default: {})", kDefaultDemoSource));
  addLogPriorityOption(program, options.logThreshold);
}

void addLogPriorityOption(CLI::App& program, LogPriority& threshold) {
  program
      .add_option_function<int>(
          "--log-priority",
          [&threshold](int priority) { threshold = static_cast<LogPriority>(priority); },
          "The system log gets lines up to this priority: 3 errors, 4 warnings, 5 notices, "
          "7 everything")
      ->check(
          CLI::Range(static_cast<int>(LogPriority::Error), static_cast<int>(LogPriority::Debug)))
      ->option_text(fmt::format("N (default: {})", static_cast<int>(threshold)));
}

void addVersionOption(CLI::App& program, const Bundle& bundle) {
  program.set_version_flag("--version", [&program, &bundle] {
    return fmt::format("{} {}", program.get_name(),
                       bundle.version().value_or("of unknown version"));
  });
}

std::string portNameProblem(const std::string& name) {
  if (isPortName(name)) return "";
  return fmt::format("'{}' is no port name (1 to 64 letters, digits, '.', '-', '_')", name);
}

}  // namespace kestro
