// SPDX-License-Identifier: MIT
// What a section takes from a packet, without a packet: the rows of the list of log codes.
#pragma once

#include <functional>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/Section.h"

namespace kestro {

/// One key that a packet may write.
struct CatalogueKey {
  std::string_view list{};  ///< the key of the list that the rows stand under; empty: the section
  std::string_view key;
};

/// What one section takes from one log code.
struct CatalogueEntry {
  LogCode code = 0;
  std::string_view packetName{};  ///< empty when the section reads nothing from the code
  std::size_t minimumLength = 0;
  std::string_view section{};
  SectionKind kind = SectionKind::Dictionary;
  std::vector<CatalogueKey> keys{};  ///< in the layout's order, each once
};

using CatalogueVisitor = std::function<void(const CatalogueEntry& entry)>;

/// The entry of one reading; keys that it takes out of the section are left out.
[[nodiscard]] CatalogueEntry catalogueReading(const Section& section, const PacketReading& reading);

/// The entry of the section's property list, which it must have.
[[nodiscard]] CatalogueEntry cataloguePropertyList(const Section& section);

}  // namespace kestro
