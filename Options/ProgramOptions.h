// SPDX-License-Identifier: MIT
// Rows that several programs have.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Options/CommandRow.h"
#include "Platform/Bundle.h"
#include "Platform/SystemLog.h"

namespace kestro {

/// What a live display is told of its server and its log.
struct LiveOptions {
  std::string serverName = "TelephonyServer";  ///< a port's name
  std::string demoSource;                      ///< empty: no demo
  double demoSpeed = 1;                        ///< seconds of its source in one second
  bool demoLoops = false;
  LogPriority logThreshold = LogPriority::Notice;
};

/// --server, --demo, which excludes it, --speed and --loop of the demo, and --log-priority.
/// `options` holds the defaults.
[[nodiscard]] std::vector<OptionRow> liveOptions(LiveOptions& options);

/// The numbers of the priorities that can be asked for.
inline constexpr NumberRange kLogPriorities{static_cast<double>(LogPriority::Error),
                                            static_cast<double>(LogPriority::Debug)};

/// --log-priority: the number of a LogPriority.
[[nodiscard]] OptionRow logPriorityOption(LogPriority& threshold);

/// --speed and --loop of what plays a source.
[[nodiscard]] OptionRow speedOption(double& speed);
[[nodiscard]] OptionRow loopOption(bool& loops);

/// The name of a port.
[[nodiscard]] OptionRow portNameOption(std::string name, std::string help, std::string& portName);

/// --version: the program's name and the bundle's version.
[[nodiscard]] OptionRow versionOption(std::string_view program, const Bundle& bundle);

/// Names without a meaning that must be told, as an option's choices.
template <class Names>
[[nodiscard]] std::vector<HelpRow> choicesOf(const Names& names) {
  std::vector<HelpRow> choices;
  choices.reserve(names.size());
  for (const auto& name : names) choices.push_back({std::string(name), ""});
  return choices;
}

}  // namespace kestro
