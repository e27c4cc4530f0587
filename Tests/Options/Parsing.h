// SPDX-License-Identifier: MIT
// Arguments for a program of rows, and what comes of them.
#pragma once

#include <gtest/gtest.h>

#include <initializer_list>
#include <string>
#include <variant>
#include <vector>

#include "Options/ArgumentParser.h"

namespace kestro {

/// A program of these options only.
inline CommandRow programOf(std::vector<OptionRow> options) {
  return {.name = "program", .help = "Does something.", .options = std::move(options)};
}

inline std::variant<const CommandRow*, OptionsText> parse(
    const CommandRow& program, std::initializer_list<const char*> arguments) {
  std::vector<const char*> line{"/anywhere/program"};
  line.insert(line.end(), arguments);
  return parseArguments(program, static_cast<int>(line.size()), line.data());
}

/// The command that the arguments ask for; null, and a failure of the test, when there is none.
inline const CommandRow* chosen(const CommandRow& program,
                                std::initializer_list<const char*> arguments) {
  const auto parsed = parse(program, arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) {
    ADD_FAILURE() << text->text;
    return nullptr;
  }
  return std::get<const CommandRow*>(parsed);
}

/// What is said instead of running.
inline OptionsText said(const CommandRow& program, std::initializer_list<const char*> arguments) {
  const auto parsed = parse(program, arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) return *text;
  ADD_FAILURE() << "accepted";
  return {};
}

/// The first line of what is said of wrong usage.
inline std::string refusal(const CommandRow& program,
                           std::initializer_list<const char*> arguments) {
  const OptionsText text = said(program, arguments);
  EXPECT_EQ(text.exitStatus, kWrongUsage) << text.text;
  return text.text.substr(0, text.text.find('\n'));
}

}  // namespace kestro
