// SPDX-License-Identifier: MIT
#include "Options/ArgumentParser.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <charconv>
#include <cstdio>
#include <optional>
#include <span>
#include <sstream>
#include <stdexcept>
#include <string_view>
#include <system_error>
#include <type_traits>
#include <vector>

#include "Options/HelpText.h"
#include "Options/ValueCheck.h"

namespace kestro {
namespace {

/// The type of the value that a target holds in the end.
template <class Target>
struct Held {
  using Type = Target;
};
template <class Value>
struct Held<std::optional<Value>> {
  using Type = Value;
};

/// The type of the value that is read from a text.
template <class Value>
struct Taken {
  using Type = Value;
};
template <>
struct Taken<LogPriority> {
  using Type = int;
};

std::string rangeText(bool isWhole, const NumberRange& range) {
  const char* number = isWhole ? "a whole number" : "a number";
  if (range.most == NumberRange().most)
    return fmt::format("{} of at least {}", number, range.least);
  return fmt::format("{} from {} to {}", number, range.least, range.most);
}

/// The number in a text; nothing when it is none of that type. (CLI11 reads "-1" as the largest
/// unsigned number.)
template <class Number>
std::optional<Number> numberIn(const std::string& text) {
  if (std::is_unsigned_v<Number> && text.find('-') != std::string::npos) return std::nullopt;
  Number number{};
  if (!CLI::detail::lexical_cast(text, number)) return std::nullopt;
  return number;
}

/// What a row is called where it has a short name, too.
std::string longName(const std::string& name) { return name.substr(name.find(',') + 1); }

/// Whether a text is a whole number that the type cannot hold. (CLI11 reads the largest instead.)
template <class Number>
bool isTooLarge(const std::string& text) {
  Number number{};
  return std::from_chars(text.data(), text.data() + text.size(), number).ec ==
         std::errc::result_out_of_range;
}

/// Looks whether a text is a number in range; "nan" is in none.
template <class Number>
CLI::Validator rangeCheck(const NumberRange& range) {
  return {[range](const std::string& text) {
            const auto number = numberIn<Number>(text);
            if (std::is_integral_v<Number> && isTooLarge<Number>(text)) {
              return text + " is too large";
            }
            const auto value = static_cast<double>(number.value_or(0));
            if (number && value >= range.least && value <= range.most) return std::string();
            return fmt::format("{} is not {}", text, rangeText(std::is_integral_v<Number>, range));
          },
          ""};
}

CLI::Option* declareTarget(CLI::App& app, const OptionRow& row, bool* target) {
  return app.add_flag(row.name, *target, row.help);
}

CLI::Option* declareTarget(CLI::App& app, const OptionRow& row, const Answer& answer) {
  return app
      .add_flag_callback(
          row.name, [answer] { throw CLI::CallForVersion(answer(), 0); }, row.help)
      ->configurable(false);
}

CLI::Option* declareTarget(CLI::App& app, const OptionRow& row, const ValueReader& read) {
  const auto take = [&row, read](const std::string& text) {
    if (const auto problem = read(text); !problem.empty()) {
      throw CLI::ValidationError(longName(row.name), problem);
    }
  };
  return app.add_option_function<std::string>(row.name, take, row.help)
      ->option_text(valueText(row));
}

template <class Target>
CLI::Option* declareTarget(CLI::App& app, const OptionRow& row, Target* target) {
  using Kept = typename Held<Target>::Type;
  using Value = typename Taken<Kept>::Type;
  const auto take = [target, implied = row.impliedValue](const Value& value) {
    if constexpr (std::is_same_v<Value, std::string>) {
      *target = value.empty() && implied ? *implied : value;
    } else {
      *target = static_cast<Kept>(value);
    }
  };
  CLI::Option* option = app.add_option_function<Value>(row.name, take, row.help);
  if constexpr (std::is_arithmetic_v<Value>) {
    if (row.range) option->check(rangeCheck<Value>(*row.range));
  }
  if constexpr (std::is_same_v<Value, std::vector<std::string>>) {
    if (!isPositional(row)) option->expected(1)->allow_extra_args(false)->take_all();
  }
  return option->option_text(valueText(row));
}

CLI::Option* declareOption(CLI::App& app, const OptionRow& row) {
  CLI::Option* option =
      std::visit([&](const auto& target) { return declareTarget(app, row, target); }, row.target);
  option->required(row.isRequired);
  if (row.impliedValue) option->expected(0, 1);
  if (!row.choices.empty()) {
    std::vector<std::string> names(row.choices.size());
    std::ranges::transform(row.choices, names.begin(), &HelpRow::name);
    option->check(CLI::IsMember(names));
  }
  if (row.problem) option->check(CLI::Validator(row.problem, ""));
  if (row.isHidden) option->group("");
  return option;
}

void declareOptions(CLI::App& app, const std::vector<OptionRow>& rows) {
  std::vector<CLI::Option*> options;
  options.reserve(rows.size());
  for (const OptionRow& row : rows) options.push_back(declareOption(app, row));
  for (std::size_t i = 0; i < rows.size(); ++i) {  // once all that they can name are there
    if (!rows[i].excludes.empty()) options[i]->excludes(app.get_option(rows[i].excludes));
    if (!rows[i].needs.empty()) options[i]->needs(app.get_option(rows[i].needs));
  }
}

void declareCommand(CLI::App& app, const CommandRow& command) {
  declareOptions(app, command.options);
  for (const CommandRow& inner : command.commands) {
    declareCommand(*app.add_subcommand(inner.name, inner.help), inner);
  }
  if (!command.commands.empty()) app.require_subcommand(1);
  app.footer(footerText(command));
}

const CommandRow& chosenOf(const CLI::App& app, const CommandRow& command) {
  for (const CommandRow& inner : command.commands) {
    const CLI::App* declared = app.get_subcommand(inner.name);
    if (declared->parsed()) return chosenOf(*declared, inner);
  }
  return command;
}

std::string listOf(const std::vector<CommandRow>& commands) {
  std::vector<std::string_view> names(commands.size());
  std::ranges::transform(commands, names.begin(), &CommandRow::name);
  return fmt::format("{}", fmt::join(names, ", "));
}

/// What is wrong where something that is required is missing: that comes from a word that nobody
/// knows, if there is one.
std::string missingText(const CLI::App& app, const CommandRow& command, const std::string& said) {
  for (const CommandRow& inner : command.commands) {
    const CLI::App* declared = app.get_subcommand(inner.name);
    if (declared->parsed()) return missingText(*declared, inner, said);
  }
  const auto unknown = app.remaining();
  if (command.commands.empty()) {
    return unknown.empty() ? said : fmt::format("'{}' was not expected", unknown.front());
  }
  const std::string known = listOf(command.commands);
  if (unknown.empty()) return fmt::format("{} needs a command: {}", command.name, known);
  const bool isOption = unknown.front().starts_with('-');
  return isOption ? fmt::format("'{}' was not expected", unknown.front())
                  : fmt::format("there is no command '{}'; there are {}", unknown.front(), known);
}

OptionsText wrongUsage(std::string_view line) {
  return {fmt::format("{}\nRun with --help for more information.\n", line), kWrongUsage};
}

}  // namespace

std::variant<const CommandRow*, OptionsText> parseArguments(const CommandRow& program,
                                                            int argumentCount,
                                                            const char* const* arguments) {
  CLI::App app(program.help, program.name);
  declareCommand(app, program);
  const std::span<const char* const> given(arguments, static_cast<std::size_t>(argumentCount));
  if (const auto problem = valueProblem(program, given.subspan(given.empty() ? 0 : 1));
      !problem.empty()) {
    return wrongUsage(problem);
  }
  try {
    app.parse(argumentCount, arguments);
  } catch (const CLI::RequiredError& error) {
    return wrongUsage(missingText(app, program, error.what()));
  } catch (const CLI::ParseError& error) {  // help and the version are such, too, of status 0
    std::ostringstream text;
    const int status = app.exit(error, text, text);
    return OptionsText{text.str(), status == 0 ? 0 : kWrongUsage};
  }
  return &chosenOf(app, program);
}

int tell(const OptionsText& text) {
  std::fputs(text.text.c_str(), text.exitStatus == 0 ? stdout : stderr);
  return text.exitStatus;
}

}  // namespace kestro
