// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

SectionDecoder::SectionDecoder(const GeneratorServices& services, const Section& section)
    : Base(services), _section(section), _codes(codesOf(section)) {
  _readings.reserve(section.readings.size());
  for (const PacketReading& reading : section.readings) _readings.emplace_back(reading);
}

void SectionDecoder::updateWithDataLogCode(const Packet& packet, LogCode code) {
  systemLog().write(_section.logPriority, _section.logLine);
  const PacketView view(packet.bytes());
  bool isDescribed = false;
  for (BoundReading& bound : _readings) {
    if (bound.reading->packet.code != code) continue;
    if (view.size() >= bound.reading->packet.minimumLength) {
      apply(bound, view);
      return;
    }
    isDescribed = true;
  }
  if (isDescribed || updateWithOtherPacket(packet, code)) return;
  if (_section.reportsUnknownCodes) reportUnknownCode(code);
}

void SectionDecoder::explainPacket(const Packet& packet, LogCode code,
                                   const ExplainVisitor& visit) const {
  const PacketView view(packet.bytes());
  if (const PacketReading* reading = readingOf(_section, code, view.size())) {
    explainReading(_section, *reading, view, visit);
  } else if (readingOf(_section, code) == nullptr) {
    explainOtherPacket(packet, code, visit);
  }
}

CatalogueEntry SectionDecoder::catalogueCode(LogCode code) const {
  const PacketReading* reading = readingOf(_section, code);
  if (reading != nullptr) return catalogueReading(_section, *reading);
  if (_section.propertyList != nullptr && _section.propertyList->packet.code == code) {
    return cataloguePropertyList(_section);
  }
  CatalogueEntry entry{.code = code, .section = _section.name, .kind = _section.kind};
  catalogueOtherCode(entry);
  return entry;
}

void SectionDecoder::apply(BoundReading& bound, PacketView packet) {
  Dictionary section = sectionDictionary();  // null for a list
  bound.fields.fill(section, packet);
  for (BoundTable& table : bound.tables) {
    if (table.reading().use == RowsUse::Noted) {
      noteRows(table, packet);
    } else if (table.reading().key.empty()) {
      applyToList(table, packet);
    } else {
      applyUnderKey(table, packet, section);
    }
  }
  didRead(*bound.reading, packet);
}

void SectionDecoder::noteRows(BoundTable& table, PacketView packet) {
  std::vector<Value> rows = table.rows(packet, std::move(table.spareRows), this);
  willPublish(table.reading(), packet, rows);
  table.spareRows = std::move(rows);
}

void SectionDecoder::applyToList(BoundTable& table, PacketView packet) {
  Array section = sectionList();
  std::vector<Value> rows = takeElementsOfArray(section);
  if (recordCount(table.reading().table, packet) == 0) return;
  rows = table.rows(packet, std::move(rows), this);
  willPublish(table.reading(), packet, rows);
  // The list is empty already; to replace nothing by nothing would only take the lock again.
  if (rows.empty() || table.reading().use == RowsUse::Dropped) return;
  replaceArrayWith(section, std::move(rows));
}

void SectionDecoder::applyUnderKey(BoundTable& table, PacketView packet, Dictionary& section) {
  const ListReading& reading = table.reading();
  if (reading.keepsOldWhenEmpty && recordCount(reading.table, packet) == 0) return;
  const Value* earlier = section.find(table.key());
  Array list = earlier != nullptr && earlier->isOnlyReference() ? earlier->array() : Array::null();
  std::vector<Value> rows = table.rows(packet, list.take(), this);
  willPublish(reading, packet, rows);
  if (list.isNull()) list = Array();
  list.assign(std::move(rows));
  section.set(table.key(), list);
}

bool SectionDecoder::updateWithOtherPacket(const Packet& /*packet*/, LogCode /*code*/) {
  return false;
}

void SectionDecoder::explainOtherPacket(const Packet& /*packet*/, LogCode /*code*/,
                                        const ExplainVisitor& /*visit*/) const {}

void SectionDecoder::catalogueOtherCode(CatalogueEntry& /*entry*/) const {}

Value SectionDecoder::supply(const Field& /*field*/, PacketView /*packet*/,
                             const RecordPosition& /*position*/) const {
  return {};
}

void SectionDecoder::didRead(const PacketReading& /*reading*/, PacketView /*packet*/) {}

void SectionDecoder::willPublish(const ListReading& /*list*/, PacketView /*packet*/,
                                 std::vector<Value>& /*rows*/) {}

}  // namespace kestro
