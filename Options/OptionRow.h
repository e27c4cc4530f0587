// SPDX-License-Identifier: MIT
// An option, a flag or a positional argument as a row: what help, parsing and whatever else is made
// of a program's options reads.
#pragma once

#include <cstdint>
#include <functional>
#include <limits>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "Platform/SystemLog.h"

namespace kestro {

/// A word and what it means; the meaning may have several lines.
struct HelpRow {
  std::string name;
  std::string help;
};

/// The numbers that an option takes, both ends included. What is not a number is in no range.
struct NumberRange {
  double least = 0;
  double most = std::numeric_limits<double>::infinity();
};

/// What is printed instead of running; the exit status is 0.
using Answer = std::function<std::string()>;

/// Takes a value whose form only its owner knows; says what is wrong with it, or nothing.
using ValueReader = std::function<std::string(const std::string& text)>;

/// Where an option's value goes; until the arguments are read it holds the default. A bool makes a
/// flag, which takes no value; a vector an option that may be given several times, or a positional
/// argument that takes all that there are, in their order. (Of these "[a,b]" is two, "./[a,b]"
/// one.)
using OptionTarget =
    std::variant<std::string*, std::vector<std::string>*, bool*, double*, std::uint64_t*,
                 std::optional<int>*, std::optional<std::uint32_t>*, std::optional<std::uint64_t>*,
                 LogPriority*, std::optional<LogPriority>*, Answer, ValueReader>;

/// One row. What the target points to must live until the arguments are read.
struct OptionRow {
  /// "--long" or "-s,--long"; without a hyphen in front it is a positional argument.
  std::string name;
  /// What the help calls the value; empty: the names of the choices.
  std::string value{};
  /// May have several lines.
  std::string help{};
  OptionTarget target{};
  bool isRequired = false;
  /// What the option means when no value follows it, or an empty one; absent: there must be one.
  std::optional<std::string> impliedValue{};
  /// The only values that are taken; empty: any.
  std::vector<HelpRow> choices{};
  /// For numbers.
  std::optional<NumberRange> range{};
  /// What is wrong with a value; an empty text when nothing is. May be empty itself.
  std::function<std::string(const std::string& text)> problem{};
  /// Names of other rows, as they are given after "--": one that must not stand beside this one,
  /// and one that must. Empty: none.
  std::string excludes{};
  std::string needs{};
  /// For programs, not for people: no help tells of it.
  bool isHidden = false;
};

/// Whether the row is a positional argument.
[[nodiscard]] inline bool isPositional(const OptionRow& row) { return !row.name.starts_with('-'); }

/// Whether the row takes no value.
[[nodiscard]] inline bool isFlag(const OptionRow& row) {
  return std::holds_alternative<bool*>(row.target) || std::holds_alternative<Answer>(row.target);
}

}  // namespace kestro
