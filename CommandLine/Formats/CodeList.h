// SPDX-License-Identifier: MIT
// Every log code of a technology, in the order in which people look for it.
#pragma once

#include <cstddef>
#include <memory>
#include <string_view>
#include <vector>

#include "LogGenerator/LogGenerator.h"

namespace kestro {

/// One log code and the sections that take its packets.
struct ListedCode {
  LogCode code;
  std::string_view name;                ///< what the packet is; empty when nobody knows
  std::size_t minimumLength;            ///< the least that a section asks for
  std::vector<CatalogueEntry> entries;  ///< section by section, as the packet is handed out
  std::vector<Outline> takers{};        ///< what is read, taker by taker, as a packet is explained
};

/// Codes whose sections stand in one group of the display.
struct CodeFamily {
  std::string_view group;         ///< the template's own key; empty: none
  std::string_view name;          ///< as people read it
  std::vector<ListedCode> codes;  ///< by ascending code
};

/// The log codes of one technology; none for channels whose messages are no packets.
struct TechnologyCodes {
  std::unique_ptr<LogGenerator> generator;  ///< owns the names
  std::string_view technology;
  std::vector<CodeFamily> families;  ///< in the display's order, extra packets last
};

/// The group of packets that do not come from the baseband.
inline constexpr std::string_view kExtraPacketsFamily = "Extra Packets";

/// Every code that the generator's sections take, by ascending code.
[[nodiscard]] std::vector<ListedCode> listCodes(const LogGenerator& generator);

/// The codes of a technology that a generator speaks. A code belongs to the group of the first
/// section that takes a key from it.
[[nodiscard]] TechnologyCodes codesOfTechnology(const GeneratorServices& services,
                                                std::string_view technology);

}  // namespace kestro
