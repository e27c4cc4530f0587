// SPDX-License-Identifier: MIT
// What a section takes from a packet, without a packet: the rows of the list of log codes.
#pragma once

#include <functional>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/Requirement.h"
#include "LogGenerator/Packets/Section.h"

namespace kestro {

/// One key that a packet may write, or take out of the section (by a field that is `removed()`).
struct CatalogueKey {
  std::string_view list{};  ///< the key of the list that the rows stand under; empty: the section
  std::string_view key;     ///< empty in a list of plain texts, which have no keys
  /// The fields that write it, several where conditions choose between them; none for a key that no
  /// field of a layout writes. They are constants, like what the pointers below point at.
  std::vector<const Field*> fields{};
  const RecordTable* table = nullptr;   ///< whose records the fields lie in; null: the packet
  const ListedValue* listed = nullptr;  ///< the value of a property list; null: none
  /// Whether the decoder keeps the value for the rows that other packets make: it is not shown.
  bool isKept = false;
};

/// What one section takes from one log code.
struct CatalogueEntry {
  LogCode code = 0;
  std::string_view packetName{};  ///< empty when the section takes nothing from the packet
  /// In bytes. A shorter packet writes `shorterKeys` and nothing else. 0 when any length will do.
  std::size_t minimumLength = 0;
  /// What a packet must have, where that is more than the least length; constants.
  std::span<const Requirement> requirements{};
  std::string_view section{};
  SectionKind kind = SectionKind::Dictionary;
  std::vector<CatalogueKey> keys{};         ///< in the layout's order, each once
  std::vector<CatalogueKey> shorterKeys{};  ///< mostly none
  /// The property list that the section is filled from; null: another kind of packet.
  const PropertyListReading* propertyList = nullptr;
  /// The display's outermost group that the section stands in, under the template's own key
  /// ("01;Network"); empty: none. Valid as long as the generator.
  std::string_view group{};
};

using CatalogueVisitor = std::function<void(const CatalogueEntry& entry)>;

/// The key `name` with the fields that write it, hidden ones apart.
[[nodiscard]] CatalogueKey catalogueKey(std::string_view name, std::span<const Field> fields);

/// The keys of the fields, each once, hidden ones apart: the packet's own, or the rows of a table's
/// records.
[[nodiscard]] std::vector<CatalogueKey> catalogueFields(std::span<const Field> fields,
                                                        std::string_view list = {},
                                                        const RecordTable* table = nullptr);

/// The entry of one of the section's readings, the first of its code. A reading of the same code
/// for shorter packets gives its `shorterKeys`.
[[nodiscard]] CatalogueEntry catalogueReading(const Section& section, const PacketReading& reading);

/// The entry of the section's property list, which it must have.
[[nodiscard]] CatalogueEntry cataloguePropertyList(const Section& section);

}  // namespace kestro
