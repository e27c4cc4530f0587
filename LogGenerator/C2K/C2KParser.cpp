// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/C2KParser.h"

namespace kestro {

std::vector<std::string_view> C2KParser::lookupNames() const {
  std::vector<std::string_view> names;
  for (const Field& field : _reading.fields) {
    if (field.text.kind != TextRule::Kind::Hidden) names.push_back(field.key);
  }
  for (const ListReading& list : _reading.lists) names.push_back(list.key);
  return names;
}

bool C2KParser::isLongEnough(PacketView packet, SystemLog& log) const {
  if (isLongEnough(packet)) return true;
  log.log(LogPriority::Error, "Log code 0x{:04x} is {} bytes long but must be at least {} bytes.",
          _reading.packet.code, packet.size(), _reading.packet.minimumLength);
  return false;
}

StoredFields::StoredFields(std::span<const Field> fields) {
  for (const Field& field : fields) {
    if (field.text.kind == TextRule::Kind::Hidden) continue;
    _fields.push_back({BoundField(field), LookupName(field.key)});
  }
}

void StoredFields::store(PacketView packet, const RecordPosition& position,
                         const LookupTable& lookup) {
  for (auto& [field, name] : _fields) {
    Value other;
    Value* shown = lookup.onlyValue(name);
    const bool isElsewhere = shown == nullptr;
    if (isElsewhere) shown = &other;
    if (field.write(*shown, packet, position, nullptr) && isElsewhere) lookup.store(name, other);
  }
}

}  // namespace kestro
