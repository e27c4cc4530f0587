// SPDX-License-Identifier: MIT
// The options of every command that reads INPUTs.
#pragma once

#include <string>
#include <vector>

#include "Options/CommandRow.h"
#include "Sources/Inputs.h"

namespace kestro {

/// What is read, and how much of it.
struct InputOptions {
  std::vector<std::string> inputs;  ///< as they are named
  std::string technology;           ///< as it is named; empty: not given
  InputNarrowing narrowing;         ///< its technology follows from the other one
};

/// What helps say of INPUTs, below the options.
[[nodiscard]] HelpSection inputsHelp();

/// INPUT..., --from, --to, --code and --technology. `options` holds the defaults.
[[nodiscard]] std::vector<OptionRow> inputRows(InputOptions& options);

/// The rows of a command: those of its inputs, then its own.
[[nodiscard]] std::vector<OptionRow> withInputRows(InputOptions& options,
                                                   std::vector<OptionRow> own);

/// The files among the inputs, "-" for standard input: what no output may be.
[[nodiscard]] std::vector<std::string> filesOf(const InputOptions& options);

/// What the options ask for; the names have been checked. `narrowing` of them becomes complete.
[[nodiscard]] std::vector<SourceRequest> requestsOf(const InputOptions& options);
[[nodiscard]] InputNarrowing narrowingOf(const InputOptions& options);

}  // namespace kestro
