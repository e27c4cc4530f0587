// SPDX-License-Identifier: MIT
// Options that several programs have, declared once. What CLI11 refuses of them is wrong usage.
#pragma once

#include <string>

#include "Platform/Bundle.h"
#include "Platform/SystemLog.h"

namespace CLI {
class App;
}  // namespace CLI

namespace kestro {

/// What a live display is told of its server and its log.
struct LiveOptions {
  std::string serverName = "TelephonyServer";  ///< a port's name
  std::string demoSource;                      ///< empty: no demo
  LogPriority logThreshold = LogPriority::Notice;
};

/// Declares --server, --demo, which excludes it, and --log-priority. `options`, which holds the
/// defaults, must live until the arguments are parsed.
void addLiveOptions(CLI::App& program, LiveOptions& options);

/// Declares --log-priority: the number of a LogPriority; `threshold` as above.
void addLogPriorityOption(CLI::App& program, LogPriority& threshold);

/// Declares --version, which prints the program's name and the bundle's version and asks to end
/// with 0. `bundle` must live until the arguments are parsed.
void addVersionOption(CLI::App& program, const Bundle& bundle);

/// What is wrong with a port's name that somebody typed; empty when nothing is.
[[nodiscard]] std::string portNameProblem(const std::string& name);

}  // namespace kestro
