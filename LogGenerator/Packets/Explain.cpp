// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Explain.h"

#include <fmt/format.h>

#include "LogGenerator/Packets/Decode.h"
#include "LogGenerator/Packets/Walk.h"

namespace kestro {

ExplainedSource Explainer::source(const Place& place, const RecordPosition& position) const {
  const std::size_t offset = offsetOf(place, position);
  return {.offset = offset,
          .width = place.width,
          .firstBit = place.firstBit,
          .bitCount = place.bitCount,
          .isBigEndian = place.isBigEndian,
          .isPastEnd = offset > _packet.size() || _packet.size() - offset < place.width,
          .raw = readNumber(place, _packet, position)};
}

void Explainer::fields(std::span<const Field> fields, const RecordPosition& position,
                       std::string_view list, std::optional<std::size_t> row) const {
  for (const Field& field : fields) {
    ExplainedValue value{.section = _section, .list = list, .row = row, .key = field.key};
    for (const Place& place : field.allPlaces()) value.sources.push_back(source(place, position));
    if (field.placeCount != 0 && field.text.kind != TextRule::Kind::Hidden) {
      value.text = BoundField(field).value(_packet, position);
    }
    _visit(value);
  }
}

void Explainer::list(const ListReading& list) const {
  const RecordTable& table = list.table;
  const std::string_view name = list.key.empty() ? table.name : list.key;
  ExplainedValue count{.section = _section, .list = name, .key = "count"};
  count.sources = {source(table.count, {})};
  if (table.countAddend != 0) count.text = fmt::format("{}", recordCount(table, _packet));
  _visit(count);
  try {
    forEachRecord(table, _packet, [&](std::size_t index, const RecordPosition& position) {
      fields(table.fields, position, name, index);
    });
  } catch (const ArrayOutOfBoundsException&) {
    // The decoder would end here too; what was read so far stands.
  }
}

void Explainer::reading(const PacketReading& reading) const {
  fields(reading.fields, {});
  for (const ListReading& table : reading.lists) list(table);
}

void explainReading(const Section& section, const PacketReading& reading, PacketView packet,
                    const ExplainVisitor& visit) {
  if (packet.size() < reading.packet.minimumLength) return;
  Explainer(section.name, packet, visit).reading(reading);
}

}  // namespace kestro
