// SPDX-License-Identifier: MIT
// What the commands of kestro-cli have in common: rows, and what becomes of their values.
#pragma once

#include <chrono>
#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "CommandLine/ExitStatus.h"
#include "LogGenerator/Packets/PacketKind.h"
#include "Options/CommandRow.h"
#include "Platform/SystemLog.h"

namespace kestro {

/// How `decode` and `explain` tell of a recording's messages.
inline constexpr const char* kTimesAndNumbers =
    "Times are the recording's, in UTC. Messages are numbered from 1, counting every record of "
    "all\n"
    "inputs, before anything is narrowed.";

/// Says on standard error why nothing was done; that exit status.
[[nodiscard]] ExitStatus nothingDone(std::string_view why);

/// An option that takes seconds, with fractions, from 0 to a year; `seconds` holds the default.
[[nodiscard]] OptionRow secondsOption(std::string name, std::string help, double& seconds);

/// Numbers of messages, both ends included.
struct MessageNumbers {
  std::uint64_t first = 1;
  std::uint64_t last = std::numeric_limits<std::uint64_t>::max();

  [[nodiscard]] bool contains(std::uint64_t number) const noexcept {
    return number >= first && number <= last;
  }
};

/// --message, which takes a number or two with a hyphen between them: "12", "3-7".
[[nodiscard]] OptionRow messageOption(std::optional<MessageNumbers>& numbers);

/// --code, which takes a log code in hexadecimal, with or without 0x.
[[nodiscard]] OptionRow codeOption(std::optional<LogCode>& code);

/// --log-priority of commands that work on recordings: by default they show no line of the log.
[[nodiscard]] OptionRow shownLogOption(std::optional<LogPriority>& shown);

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
