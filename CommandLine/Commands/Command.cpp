// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/Command.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <CLI/CLI.hpp>
#include <cmath>

namespace kestro {
namespace {

constexpr double kMaximumSeconds = 366.0 * 24 * 60 * 60;

/// An empty text when `text` is a number in range; what "nan" is, is out of range too.
std::string checkSeconds(const std::string& text) {
  double seconds = 0;
  const bool isValid =
      CLI::detail::lexical_cast(text, seconds) && seconds >= 0 && seconds <= kMaximumSeconds;
  return isValid ? "" : "'" + text + "' is no number of seconds";
}

}  // namespace

CLI::Option* addSecondsOption(CLI::App& command, const std::string& name, double& seconds,
                              const std::string& description) {
  return command.add_option(name, seconds, description)
      ->check(CLI::Validator(checkSeconds, ""))
      ->option_text(fmt::format("SECONDS (default: {})", seconds));
}

CLI::Option* addFormatOption(CLI::App& command, std::string& format,
                             const std::vector<std::string>& names) {
  format = names.front();
  return command.add_option("--format", format, "What to write; see below")
      ->check(CLI::IsMember(names))
      ->option_text(fmt::format("{} (default: {})", fmt::join(names, "|"), format));
}

std::chrono::microseconds durationOfSeconds(double seconds) {
  return std::chrono::microseconds(std::llround(seconds * 1e6));
}

}  // namespace kestro
