// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/C2KParser.h"

namespace kestro {

std::vector<std::string_view> C2KParser::lookupNames() const {
  std::vector<std::string_view> names;
  for (const Field& field : reading().fields) {
    if (field.text.kind != TextRule::Kind::Hidden) names.push_back(field.key);
  }
  for (const ListReading& list : reading().lists) names.push_back(list.key);
  return names;
}

void C2KParser::parse(PacketView packet, C2KOutput& output) {
  TakenPacket taken{.bytes = packet};
  if (isTaken(_rules, taken)) return take(taken, output);
  logRefusal(_rules, packet, output.log);
}

void C2KParser::explain(PacketView packet, const ExplainVisitor& visit) const {
  TakenPacket taken{.bytes = packet};
  if (isTaken(_rules, taken)) explainTaken(taken, visit);
}

void C2KParser::explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const {
  Explainer(reading().packet.name, packet.bytes, visit).reading(reading());
}

OutlinedReading C2KParser::outline() const {
  OutlinedReading outlined;
  outlined.packetName = reading().packet.name;
  // The least length is one of the requirements, where it is one.
  outlined.requirements = _rules.requirements;
  outlined.packetLength = reading().packet.minimumLength;
  if (!reading().lists.empty()) outlined.requiredRecords = &reading().lists[0].table;
  outlineTaken(outlined.parts);
  return outlined;
}

void C2KParser::outlineTaken(std::vector<OutlinedPart>& parts) const {
  appendReading(reading().packet.name, reading(), parts);
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
