// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Catalogue.h"

#include <algorithm>

namespace kestro {
namespace {

void addKey(std::string_view list, std::string_view key, std::vector<CatalogueKey>& keys) {
  const auto isSame = [&](const CatalogueKey& known) {
    return known.list == list && known.key == key;
  };
  if (std::ranges::none_of(keys, isSame)) keys.push_back({list, key});
}

void addShownKeys(std::span<const Field> fields, std::string_view list,
                  std::vector<CatalogueKey>& keys) {
  for (const Field& field : fields) {
    const bool isShown =
        field.text.kind != TextRule::Kind::Hidden && field.text.kind != TextRule::Kind::Removed;
    if (isShown) addKey(list, field.key, keys);
  }
}

}  // namespace

CatalogueEntry catalogueReading(const Section& section, const PacketReading& reading) {
  CatalogueEntry entry{.code = reading.code,
                       .packetName = reading.packetName,
                       .minimumLength = reading.minimumLength,
                       .section = section.name,
                       .kind = section.kind};
  addShownKeys(reading.fields, {}, entry.keys);
  for (const ListReading& list : reading.lists) {
    if (!list.table.keepsNone && list.use == RowsUse::Shown) {
      addShownKeys(list.table.fields, list.key, entry.keys);
    }
  }
  return entry;
}

CatalogueEntry cataloguePropertyList(const Section& section) {
  const PropertyListReading& reading = *section.propertyList;
  CatalogueEntry entry{.code = reading.code,
                       .packetName = reading.packetName,
                       .minimumLength = kPacketHeaderSize,
                       .section = section.name,
                       .kind = section.kind};
  for (const ListedValue& value : reading.values) addKey({}, value.key, entry.keys);
  return entry;
}

}  // namespace kestro
