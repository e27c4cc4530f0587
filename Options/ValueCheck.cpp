// SPDX-License-Identifier: MIT
#include "Options/ValueCheck.h"

#include <fmt/format.h>

#include <algorithm>
#include <cctype>
#include <string_view>

namespace kestro {
namespace {

constexpr std::string_view kEndOfOptions = "--";

/// Whether the row goes by this name; it may have two, as in "-o,--output".
bool isNamed(const OptionRow& row, std::string_view name) {
  std::string_view names = row.name;
  while (!names.empty()) {
    const auto comma = std::min(names.find(','), names.size());
    if (names.substr(0, comma) == name) return true;
    names.remove_prefix(std::min(comma + 1, names.size()));
  }
  return false;
}

/// An option, not a value: "-" is standard input or output, and "-5" a number.
bool looksLikeOption(std::string_view argument) {
  return argument.size() > 1 && argument[0] == '-' && argument[1] != '.' &&
         std::isdigit(static_cast<unsigned char>(argument[1])) == 0;
}

std::string valueIsMissing(std::string_view name, const OptionRow& row) {
  return fmt::format("{}: a value is missing{}", name,
                     row.value.empty() ? "" : fmt::format(" ({})", row.value));
}

/// What is wrong with one option, given what stands behind it.
std::string problemOf(const OptionRow& row, std::string_view argument, const char* next) {
  const auto equals = argument.find('=');
  const std::string_view name = argument.substr(0, equals);
  if (isFlag(row)) {
    return equals == std::string_view::npos ? "" : fmt::format("{} takes no value", name);
  }
  if (row.impliedValue) return "";
  if (equals != std::string_view::npos) {
    return equals + 1 < argument.size() ? "" : fmt::format("{}: the value is empty", name);
  }
  return next == nullptr || looksLikeOption(next) ? valueIsMissing(name, row) : "";
}

}  // namespace

std::string valueProblem(const CommandRow& program, std::span<const char* const> arguments) {
  const CommandRow* command = &program;
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    const std::string_view argument = arguments[i];
    if (argument == kEndOfOptions) break;
    const auto inner = std::ranges::find(command->commands, argument, &CommandRow::name);
    if (inner != command->commands.end()) {
      command = &*inner;
      continue;
    }
    const std::string_view name = argument.substr(0, argument.find('='));
    const auto row = std::ranges::find_if(
        command->options, [name](const OptionRow& each) { return isNamed(each, name); });
    if (row == command->options.end() || isPositional(*row)) continue;
    const char* next = i + 1 < arguments.size() ? arguments[i + 1] : nullptr;
    if (auto problem = problemOf(*row, argument, next); !problem.empty()) return problem;
    const bool takesNext = !isFlag(*row) && !row->impliedValue && name == argument;
    if (takesNext) ++i;
  }
  return "";
}

}  // namespace kestro
