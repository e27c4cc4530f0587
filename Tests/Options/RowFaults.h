// SPDX-License-Identifier: MIT
// What is missing in a program's rows for somebody who reads its help.
#pragma once

#include <string>
#include <vector>

#include "Options/CommandRow.h"
#include "Options/HelpText.h"

namespace kestro {

/// One line for each row without an explanation or, where it takes one, a word for its value.
inline std::vector<std::string> rowFaults(const CommandRow& command) {
  std::vector<std::string> faults;
  if (command.help.empty()) faults.push_back(command.name + ": no explanation");
  for (const OptionRow& row : command.options) {
    const std::string name = command.name + " " + row.name;
    if (row.help.empty() && !row.isHidden) faults.push_back(name + ": no explanation");
    if (!isFlag(row) && valueText(row).empty()) faults.push_back(name + ": no word for its value");
  }
  for (const CommandRow& inner : command.commands) {
    for (const std::string& fault : rowFaults(inner)) faults.push_back(command.name + " " + fault);
  }
  return faults;
}

}  // namespace kestro
