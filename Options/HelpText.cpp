// SPDX-License-Identifier: MIT
#include "Options/HelpText.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <string_view>
#include <type_traits>

namespace kestro {
namespace {

template <class Value>
std::string textOfDefault(const Value& value) {
  return fmt::format("{}", value);
}

std::string textOfDefault(LogPriority priority) {
  return textOfDefault(static_cast<int>(priority));
}

template <class Value>
std::string textOfDefault(const std::optional<Value>& value) {
  return value ? textOfDefault(*value) : "";
}

std::string textOfDefault(const std::vector<std::string>& values) {
  return fmt::format("{}", fmt::join(values, ", "));
}

/// The value that holds unless another is given; empty when there is none.
std::string defaultText(const OptionRow& row) {
  if (row.impliedValue) return *row.impliedValue;
  return std::visit(
      [](const auto& target) {
        if constexpr (std::is_pointer_v<std::decay_t<decltype(target)>>) {
          return textOfDefault(*target);
        } else {
          return std::string();
        }
      },
      row.target);
}

std::vector<std::string_view> namesOf(const std::vector<HelpRow>& rows) {
  std::vector<std::string_view> names(rows.size());
  std::ranges::transform(rows, names.begin(), &HelpRow::name);
  return names;
}

std::string tableText(const std::vector<HelpRow>& rows) {
  std::size_t width = 0;
  for (const HelpRow& row : rows) width = std::max(width, row.name.size());
  const std::string margin(2 + width + 2, ' ');
  std::string text;
  for (const HelpRow& row : rows) {
    text += fmt::format("  {:<{}}  ", row.name, width);
    for (const char c : row.help) {
      text += c;
      if (c == '\n') text += margin;
    }
    text += '\n';
  }
  return text;
}

std::string sectionText(const HelpSection& section) {
  std::string text = section.title.empty() ? "" : section.title + ":\n";
  text += tableText(section.rows) + section.text;
  while (text.ends_with('\n')) text.pop_back();
  return text;
}

}  // namespace

std::string valueText(const OptionRow& row) {
  if (isFlag(row)) return "";
  if (isPositional(row)) return " ";
  std::string value =
      row.value.empty() ? fmt::format("{}", fmt::join(namesOf(row.choices), "|")) : row.value;
  const std::string otherwise = defaultText(row);
  if (otherwise.empty()) return value;
  if (row.impliedValue) value = fmt::format("[={}]", value);
  return fmt::format("{} (default: {})", value, otherwise);
}

std::string footerText(const CommandRow& command) {
  std::vector<std::string> sections(command.sections.size());
  std::ranges::transform(command.sections, sections.begin(), sectionText);
  return fmt::format("{}", fmt::join(sections, "\n\n"));
}

}  // namespace kestro
