// SPDX-License-Identifier: MIT
// What the commands of kestro-cli have in common: rows, and what becomes of their values.
#pragma once

#include <chrono>
#include <string>
#include <vector>

#include "Options/CommandRow.h"

namespace kestro {

/// How `decode` and `explain` tell of a recording's messages.
inline constexpr const char* kTimesAndNumbers =
    "Times are the capture's, in UTC. Messages are numbered from 1, counting every record.";

/// An option that takes seconds, with fractions, from 0 to a year; `seconds` holds the default.
[[nodiscard]] OptionRow secondsOption(std::string name, std::string help, double& seconds);

/// A recorded capture, which must be given.
[[nodiscard]] OptionRow captureArgument(std::string& path);

/// The names and explanations in a list of formats.
template <class Formats>
[[nodiscard]] std::vector<HelpRow> formatRows(const Formats& formats) {
  std::vector<HelpRow> rows;
  rows.reserve(formats.size());
  for (const auto& format : formats) {
    rows.push_back({std::string(format.name), std::string(format.help)});
  }
  return rows;
}

/// --format, which takes one of these names; the first is the default.
[[nodiscard]] OptionRow formatOption(std::string& format, std::vector<HelpRow> formats);

/// Seconds as a duration, to the microsecond.
[[nodiscard]] std::chrono::microseconds durationOfSeconds(double seconds);

}  // namespace kestro
