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
          _reading.code, packet.size(), _reading.minimumLength);
  return false;
}

StoredFields::StoredFields(std::span<const Field> fields) : _fields(fields) {
  for (const BoundField& field : _fields.fields()) _names.emplace_back(field.field().key);
}

void StoredFields::store(PacketView packet, const RecordPosition& position,
                         const LookupTable& lookup) {
  const std::span<const BoundField> fields = _fields.fields();
  for (std::size_t i = 0; i < fields.size(); ++i) {
    const Value value = fields[i].value(packet, position);
    if (!value.isNull()) lookup.store(_names[i], value);
  }
}

}  // namespace kestro
