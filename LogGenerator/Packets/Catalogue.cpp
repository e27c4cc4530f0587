// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Catalogue.h"

#include <algorithm>
#include <iterator>

namespace kestro {
namespace {

bool isShown(const Field& field) {
  return field.text.kind != TextRule::Kind::Hidden && field.text.kind != TextRule::Kind::Removed;
}

}  // namespace

CatalogueKey catalogueKey(std::string_view name, std::span<const Field> fields) {
  CatalogueKey key{.key = name};
  for (const Field& field : fields) {
    if (field.key == name && isShown(field)) key.fields.push_back(&field);
  }
  return key;
}

std::vector<CatalogueKey> catalogueFields(std::span<const Field> fields, std::string_view list,
                                          const RecordTable* table) {
  std::vector<CatalogueKey> keys;
  for (const Field& field : fields) {
    const bool isKnown = std::ranges::find(keys, field.key, &CatalogueKey::key) != keys.end();
    if (isKnown || !isShown(field)) continue;
    CatalogueKey& key = keys.emplace_back(catalogueKey(field.key, fields));
    key.list = list;
    key.table = table;
  }
  return keys;
}

CatalogueEntry catalogueReading(const Section& section, const PacketReading& reading) {
  CatalogueEntry entry{.code = reading.code,
                       .packetName = reading.packetName,
                       .minimumLength = reading.minimumLength,
                       .section = section.name,
                       .kind = section.kind,
                       .keys = catalogueFields(reading.fields)};
  for (const ListReading& list : reading.lists) {
    if (list.use == RowsUse::Noted) entry.isNoted = true;
    if (list.table.keepsNone || list.use != RowsUse::Shown) continue;
    std::ranges::copy(catalogueFields(list.table.fields, list.key, &list.table),
                      std::back_inserter(entry.keys));
  }
  return entry;
}

CatalogueEntry cataloguePropertyList(const Section& section) {
  const PropertyListReading& reading = *section.propertyList;
  CatalogueEntry entry{.code = reading.code,
                       .packetName = reading.packetName,
                       .minimumLength = kPacketHeaderSize,
                       .section = section.name,
                       .kind = section.kind,
                       .propertyList = &reading};
  for (const ListedValue& value : reading.values) {
    entry.keys.push_back({.key = value.key, .listed = &value});
  }
  return entry;
}

}  // namespace kestro
