// SPDX-License-Identifier: MIT
// A program's command line as rows: itself, its commands and theirs, each with its options. Every
// command has -h,--help besides, which no row names.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "Options/OptionRow.h"

namespace kestro {

/// A part of what the help says behind the options.
struct HelpSection {
  std::string title{};          ///< empty: none
  std::vector<HelpRow> rows{};  ///< as a table of two columns
  std::string text{};           ///< below the rows; lines as they are printed
};

/// A program, a command or a command's command.
struct CommandRow {
  std::string name;
  std::string help{};                ///< one line
  std::vector<OptionRow> options{};  ///< in the order of the help
  /// When there are some, one of them must be given.
  std::vector<CommandRow> commands{};
  std::vector<HelpSection> sections{};
  /// Does what was asked for and returns the exit status; empty for what others start, or where a
  /// command of this one runs.
  std::function<int()> run{};
};

}  // namespace kestro
