// SPDX-License-Identifier: MIT
// Where every shown value of a packet comes from: bytes, bits, raw value, text.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/Section.h"
#include "LogGenerator/Packets/Walk.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// One place that a value was read from.
struct ExplainedSource {
  std::size_t offset = 0;  ///< of the first byte, from the packet's first
  unsigned width = 0;      ///< bytes
  unsigned firstBit = 0;   ///< within the integer of these bytes
  unsigned bitCount = 0;
  bool isBigEndian = false;
  bool isPastEnd = false;  ///< whether any of its bytes lies past the packet's end
  std::int64_t raw = 0;
  /// For a value of a property list: its key there; the places above are unused.
  std::string listKey{};
  bool isNumber = true;  ///< whether `raw` says something; only values of property lists lack it
};

/// One value of a packet as a section takes it.
struct ExplainedValue {
  std::string_view section;
  std::string_view list{};           ///< the list that the row belongs to, as its table names it
  std::optional<std::size_t> row{};  ///< the record's number
  std::string_view key;
  std::vector<ExplainedSource> sources{};
  /// What is shown; null when the value is not shown. For a list's count that is stored in another
  /// form (one less): the number of records.
  Value text{};
};

using ExplainVisitor = std::function<void(const ExplainedValue& value)>;

/// Visits the values of one packet, layout by layout. Never throws for a packet's contents.
class Explainer {
 public:
  /// `section` names what takes the values. All three must outlive the explainer.
  Explainer(std::string_view section, PacketView packet, const ExplainVisitor& visit)
      : _section(section), _packet(packet), _visit(visit) {}

  /// One place as a source.
  [[nodiscard]] ExplainedSource source(const Place& place, const RecordPosition& position) const;
  /// Every field of a layout at a position, hidden ones included, perhaps as row `row` of `list`.
  void fields(std::span<const Field> fields, const RecordPosition& position,
              std::string_view list = {}, std::optional<std::size_t> row = {}) const;
  /// A table's count, and the fields of its records. Records past a bound end the table.
  void list(const ListReading& list) const;
  /// Everything that a reading describes.
  void reading(const PacketReading& reading) const;

 private:
  std::string_view _section;
  PacketView _packet;
  const ExplainVisitor& _visit;
};

/// Visits every value that `section` reads from the packet by this reading, hidden ones included,
/// in the layout's order. A packet shorter than the reading's minimum yields nothing. Never throws
/// for a packet's contents: records past a bound end the table.
void explainReading(const Section& section, const PacketReading& reading, PacketView packet,
                    const ExplainVisitor& visit);

}  // namespace kestro
