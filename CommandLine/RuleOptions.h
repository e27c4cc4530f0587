// SPDX-License-Identifier: MIT
// The options of every command that watches rules.
#pragma once

#include <string>
#include <vector>

#include "Measurements/Rule.h"
#include "Options/CommandRow.h"
#include "Platform/Result.h"

namespace kestro {

/// Where the rules stand.
struct RuleOptions {
  std::string file;                ///< empty: none
  std::vector<std::string> texts;  ///< each one rule, or several lines
};

/// What helps say of rules, below the options.
[[nodiscard]] HelpSection rulesHelp();

/// --rules and --rule.
[[nodiscard]] std::vector<OptionRow> ruleRows(RuleOptions& options);

/// All rules, those of the file first. An error says in which line and column, or why the file
/// cannot be read.
[[nodiscard]] Result<std::vector<Rule>> rulesOf(const RuleOptions& options);

}  // namespace kestro
