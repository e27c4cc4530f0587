// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Catalogue.h"

#include <algorithm>
#include <iterator>

namespace kestro {
namespace {

bool isListed(const Field& field) { return field.text.kind != TextRule::Kind::Hidden; }

/// The keys of a list's rows; none when no record makes a row.
std::vector<CatalogueKey> keysOfRows(const ListReading& list) {
  if (list.table.keepsNone || list.use == RowsUse::Dropped) return {};
  std::vector<CatalogueKey> keys = catalogueFields(list.table.fields, list.key, &list.table);
  for (CatalogueKey& key : keys) {
    key.isKept = list.use == RowsUse::Noted;
    if (list.isPlain) key.key = {};
  }
  return keys;
}

std::vector<CatalogueKey> keysOfReading(const PacketReading& reading) {
  std::vector<CatalogueKey> keys = catalogueFields(reading.fields);
  for (const ListReading& list : reading.lists) {
    std::ranges::copy(keysOfRows(list), std::back_inserter(keys));
  }
  return keys;
}

}  // namespace

CatalogueKey catalogueKey(std::string_view name, std::span<const Field> fields) {
  CatalogueKey key{.key = name};
  for (const Field& field : fields) {
    if (field.key == name && isListed(field)) key.fields.push_back(&field);
  }
  return key;
}

std::vector<CatalogueKey> catalogueFields(std::span<const Field> fields, std::string_view list,
                                          const RecordTable* table) {
  std::vector<CatalogueKey> keys;
  for (const Field& field : fields) {
    const bool isKnown = std::ranges::find(keys, field.key, &CatalogueKey::key) != keys.end();
    if (isKnown || !isListed(field)) continue;
    CatalogueKey& key = keys.emplace_back(catalogueKey(field.key, fields));
    key.list = list;
    key.table = table;
  }
  return keys;
}

CatalogueEntry catalogueReading(const Section& section, const PacketReading& reading) {
  CatalogueEntry entry{.code = reading.packet.code, .section = section.name, .kind = section.kind};
  if (reading.isEmpty()) return entry;
  entry.packetName = reading.packet.name;
  entry.minimumLength = reading.packet.minimumLength;
  entry.keys = keysOfReading(reading);
  for (const PacketReading& other : section.readings) {
    const bool isShorter = other.packet.minimumLength < reading.packet.minimumLength;
    if (other.packet.code == reading.packet.code && isShorter) {
      entry.shorterKeys = keysOfReading(other);
    }
  }
  return entry;
}

CatalogueEntry cataloguePropertyList(const Section& section) {
  const PropertyListReading& reading = *section.propertyList;
  CatalogueEntry entry{.code = reading.packet.code,
                       .packetName = reading.packet.name,
                       .minimumLength = reading.packet.minimumLength,
                       .section = section.name,
                       .kind = section.kind,
                       .propertyList = &reading};
  for (const ListedValue& value : reading.values) {
    entry.keys.push_back({.key = value.key, .listed = &value});
  }
  return entry;
}

}  // namespace kestro
