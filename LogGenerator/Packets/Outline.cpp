// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Outline.h"

namespace kestro {

OutlinedValue outlinedValue(std::string_view section, std::string_view key, const Field& field,
                            OutlineAnchor anchor) {
  const std::span<const Place> places = field.allPlaces();
  return {.section = section,
          .key = key,
          .field = field,
          .places = {places.begin(), places.end()},
          .anchor = anchor};
}

void appendReading(std::string_view section, const PacketReading& reading,
                   std::vector<OutlinedPart>& parts) {
  for (const Field& field : reading.fields) {
    parts.emplace_back(outlinedValue(section, field.key, field));
  }
  for (const ListReading& list : reading.lists) {
    const std::string_view name = list.key.empty() ? list.table.name : list.key;
    parts.emplace_back(OutlinedTable{.section = section, .list = name, .table = &list.table});
  }
}

Outline outlineSection(const Section& section, LogCode code) {
  Outline outline{.code = code};
  for (const PacketReading& reading : section.readings) {
    if (reading.packet.code != code) continue;
    OutlinedReading& outlined = outline.readings.emplace_back();
    outlined.packetName = reading.packet.name;
    outlined.minimumLength = reading.packet.minimumLength;
    appendReading(section.name, reading, outlined.parts);
  }
  return outline;
}

}  // namespace kestro
