// SPDX-License-Identifier: MIT
// What the parts of kestro-cli have in common.
#pragma once

#include <chrono>
#include <functional>
#include <string>
#include <vector>

namespace CLI {
class App;
class Option;
}  // namespace CLI

namespace kestro {

/// One command of the program. Each has a file pair with a function that declares it; the list in
/// CommandLine.cpp names them.
struct Command {
  CLI::App* declaration;     ///< name, options and help; the program owns it
  std::function<int()> run;  ///< does it with the options that were parsed; returns an ExitStatus
};

/// Declares an option that takes seconds, with fractions, from 0 to a year; `seconds` holds the
/// default.
CLI::Option* addSecondsOption(CLI::App& command, const std::string& name, double& seconds,
                              const std::string& description);

/// Declares --format, which takes one of the names; the first is the default.
CLI::Option* addFormatOption(CLI::App& command, std::string& format,
                             const std::vector<std::string>& names);

/// The names in a list of formats.
template <class Formats>
[[nodiscard]] std::vector<std::string> formatNames(const Formats& formats) {
  std::vector<std::string> names;
  names.reserve(formats.size());
  for (const auto& format : formats) names.emplace_back(format.name);
  return names;
}

/// Seconds as a duration, to the microsecond.
[[nodiscard]] std::chrono::microseconds durationOfSeconds(double seconds);

}  // namespace kestro
