// SPDX-License-Identifier: MIT
// The list of log codes as a document.
#pragma once

#include <span>
#include <string>

#include "CommandLine/Formats/CodeList.h"

namespace kestro {

/// The whole document: how to read it, then technology by technology its codes, each with where
/// every key of it is read and how it is shown.
[[nodiscard]] std::string codesMarkdown(std::span<const TechnologyCodes> technologies);

}  // namespace kestro
