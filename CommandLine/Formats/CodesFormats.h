// SPDX-License-Identifier: MIT
// The list of log codes as people and programs read it.
#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "CommandLine/Formats/CodeList.h"

namespace kestro {

/// A resource of the bundle.
struct ResourceName {
  std::string_view name;
  std::string_view extension;
};

/// A format's name on the command line, what the help says of it, and what makes its text.
struct CodesFormat {
  std::string_view name;
  std::string_view help;  ///< one line or several
  std::string (*text)(std::span<const TechnologyCodes> technologies);
  /// Resources, by name and extension, whose contents stand before the text.
  std::span<const ResourceName> preamble{};
};

/// All formats, the default first.
[[nodiscard]] const std::vector<CodesFormat>& codesFormats();

}  // namespace kestro
