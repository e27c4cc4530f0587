// SPDX-License-Identifier: MIT
// What the help says of rows, apart from names and explanations, which stand in them.
#pragma once

#include <string>

#include "Options/CommandRow.h"

namespace kestro {

/// An option's value as the help shows it behind the name, with the default where there is one:
/// "N (default: 5)". Empty for a flag; a blank for a positional argument, whose name says it.
[[nodiscard]] std::string valueText(const OptionRow& row);

/// What the help says behind a command's options; nothing when it has no sections.
[[nodiscard]] std::string footerText(const CommandRow& command);

}  // namespace kestro
