// SPDX-License-Identifier: MIT
// The list of log codes as a dissector for Wireshark.
#pragma once

#include <span>
#include <string>

#include "CommandLine/Formats/CodeList.h"
#include "CommandLine/Formats/CodesFormats.h"

namespace kestro {

/// The resources that walk the tables, in the order in which they stand before these.
[[nodiscard]] std::span<const ResourceName> dissectorParts();

/// The tables of these technologies, handed to the walkers.
[[nodiscard]] std::string codesLua(std::span<const TechnologyCodes> technologies);

}  // namespace kestro
