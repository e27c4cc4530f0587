// SPDX-License-Identifier: MIT
// What `explain` visits in the packets of a log code, without a packet: for readers of packets in
// other languages, which are made from it.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string_view>
#include <variant>
#include <vector>

#include "LogGenerator/Packets/Requirement.h"
#include "LogGenerator/Packets/Section.h"

namespace kestro {

/// The sub-packets, by identifier, that places of Origin::Here and Origin::Twin count from; absent:
/// the packet. The reading requires those that are named.
struct OutlineAnchor {
  std::optional<std::uint8_t> here{};
  std::optional<std::uint8_t> twin{};
};

/// One value, hidden ones included, as `ExplainedValue` names it.
struct OutlinedValue {
  std::string_view section;
  std::string_view key;
  Field field;  ///< how it is shown, and when
  /// Where it is read, in `explain`'s order: the field's places, or more than a field can have.
  std::vector<Place> places;
  OutlineAnchor anchor{};
};

/// A table's count, and the fields of its records.
struct OutlinedTable {
  std::string_view section;
  std::string_view list;
  const RecordTable* table;  ///< a constant
};

/// Records of a sub-packet that are as long as it says: `fixedSize` bytes and `sizePerValue` more
/// for each of its values, filled up to a multiple of `alignment`. Places of the fields count from
/// the record; those of Origin::Packet from the sub-packet, and those of Origin::Twin from
/// `shiftPerValue` bytes for each value behind the record's beginning.
struct SizedRecords {
  Place count;       ///< in the sub-packet: how many records
  Place valueCount;  ///< in the sub-packet: how many values each of them has
  std::size_t fixedSize;
  std::size_t sizePerValue;
  std::size_t shiftPerValue;
  std::size_t alignment;
  std::span<const Field> fields;
};

struct OutlinedSizedRecords {
  std::string_view section;
  std::string_view list;
  const SizedRecords* records;  ///< a constant
  std::uint8_t subPacket;       ///< its identifier
};

using OutlinedPart = std::variant<OutlinedValue, OutlinedTable, OutlinedSizedRecords>;

/// One reading of a code's packets.
struct OutlinedReading {
  std::string_view packetName{};
  std::size_t minimumLength = 0;  ///< in bytes; of several readings the first that has it counts
  /// What a packet must have besides; constants. Those about a length mean `packetLength`, those
  /// about records `requiredRecords`.
  std::span<const Requirement> requirements{};
  std::size_t packetLength = 0;
  const RecordTable* requiredRecords = nullptr;
  std::vector<OutlinedPart> parts{};  ///< in `explain`'s order
};

/// What one taker of a code's packets, a section or a parser, reads from them.
struct Outline {
  LogCode code = 0;
  std::vector<OutlinedReading> readings{};  ///< none for a property list
};

using OutlineVisitor = std::function<void(const Outline& outline)>;

/// The field under a key, perhaps another than its own.
[[nodiscard]] OutlinedValue outlinedValue(std::string_view section, std::string_view key,
                                          const Field& field, OutlineAnchor anchor = {});

/// Appends a reading's fields, then its tables, all under its own keys.
void appendReading(std::string_view section, const PacketReading& reading,
                   std::vector<OutlinedPart>& parts);

/// The section's readings of one code.
[[nodiscard]] Outline outlineSection(const Section& section, LogCode code);

}  // namespace kestro
