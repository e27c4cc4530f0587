// SPDX-License-Identifier: MIT
// Reads a program's arguments by its rows.
#pragma once

#include <string>
#include <variant>

#include "Options/CommandRow.h"

namespace kestro {

/// Exit statuses that all programs share.
inline constexpr int kWrongUsage = 2;

/// What a program has to say instead of running: a help text, its version, or what is wrong with
/// its command line.
struct OptionsText {
  std::string text;
  /// 0 for help or the version that was asked for, kWrongUsage otherwise.
  int exitStatus = 0;
};

/// Fills the targets of the rows and returns the command that was asked for: `program` itself when
/// it has no commands. Prints nothing. Throws std::runtime_error when the rows themselves are
/// wrong: two of one name, or one that names another which its command does not have.
[[nodiscard]] std::variant<const CommandRow*, OptionsText> parseArguments(
    const CommandRow& program, int argumentCount, const char* const* arguments);
std::variant<const CommandRow*, OptionsText> parseArguments(CommandRow&& program, int,
                                                            const char* const*) = delete;

/// Prints the text, on standard error when it tells of wrong usage; returns the exit status.
[[nodiscard]] int tell(const OptionsText& text);

}  // namespace kestro
