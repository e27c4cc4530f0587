// SPDX-License-Identifier: MIT
#include "CommandLine/RuleOptions.h"

#include <fmt/format.h>

#include "CommandLine/Input.h"

namespace kestro {
namespace {

constexpr std::size_t kLongestRuleFile = std::size_t{1} << 20U;

constexpr const char* kRulesText =
    R"(SERIES OP NUMBER [UNIT] [for N [s]], one a line: "Measured RSRP < -110 dBm for 4 s". SERIES is a key
as the display has it, of every section that has it, or Section/Key; a name that holds an operator or
a "#" stands in quotes. OP is one of < <= > >= == !=. Each row of a list is watched by itself. An
alarm begins when the rule has been broken for N seconds of the messages' own time, and is over with
the first value that keeps it. What follows a "#" is a comment.)";

std::string ruleProblem(const std::string& text) {
  const auto rules = parseRules(text, "rule");
  return rules ? "" : rules.error().message;
}

}  // namespace

HelpSection rulesHelp() { return {.title = "Rules", .text = kRulesText}; }

std::vector<OptionRow> ruleRows(RuleOptions& options) {
  return {{.name = "--rules",
           .value = "FILE",
           .help = "Tell when a rule in this file is broken, and when it is kept again",
           .target = &options.file},
          {.name = "--rule",
           .value = "TEXT",
           .help = "The same for this rule; may be given several times",
           .target = &options.texts,
           .problem = ruleProblem}};
}

Result<std::vector<Rule>> rulesOf(const RuleOptions& options) {
  std::vector<Rule> rules;
  if (!options.file.empty()) {
    const auto bytes = readFile(options.file, kLongestRuleFile);
    if (!bytes) return tl::unexpected(bytes.error());
    auto parsed =
        parseRules({reinterpret_cast<const char*>(bytes->data()), bytes->size()}, options.file);
    if (!parsed) return parsed;
    rules = *std::move(parsed);
  }
  for (const std::string& rule : options.texts) {
    auto parsed = parseRules(rule, "rule");
    if (!parsed) return parsed;
    rules.insert(rules.end(), parsed->begin(), parsed->end());
  }
  if (rules.size() > kMaximumRules) {
    return failure(fmt::format("more than {} rules", kMaximumRules));
  }
  return rules;
}

}  // namespace kestro
