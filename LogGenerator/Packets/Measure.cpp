// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Measure.h"

#include <string>
#include <utility>

namespace kestro {

// --- The fields of a layout ----------------------------------------------------------------------

namespace {

/// One of an array's elements as a field of its own.
Field elementOf(const Field& array, int index) {
  Field element = array;
  element.text = decimal();
  element.places[0] = array.places[static_cast<std::size_t>(index)];
  element.placeCount = 1;
  return element;
}

}  // namespace

MeasuredFields::MeasuredFields(std::span<const Field> fields, const SectionPlace& place,
                               SeriesTable& series, const Naming& naming) {
  const auto add = [&](const Field& field, int element) {
    SeriesGroup group = _fields.emplace_back(field).group(place);
    if (element >= 0) group.key += " " + std::to_string(element);
    group.path.element = element;
    if (naming) naming(group);
    _groups.push_back(series.group(std::move(group)));
  };
  for (const Field& field : fields) {
    const TextRule::Kind kind = field.text.kind;
    if (kind == TextRule::Kind::Hidden || kind == TextRule::Kind::Removed) continue;
    if (kind != TextRule::Kind::Each) {
      add(field, -1);
      continue;
    }
    for (int i = 0; i < field.placeCount; ++i) add(_elements.emplace_back(elementOf(field, i)), i);
  }
}

void MeasuredFields::measure(PacketView packet, const RecordPosition& position,
                             std::span<const Series* const> series, std::uint32_t row,
                             const NumberSupplier* supplier, MeasuredValues& values) const {
  MeasuredValue* const first = values.reserve(_fields.size());
  MeasuredValue* value = first;
  // What is written might be what is read, for all the compiler knows: it is asked for once.
  const RecordPosition here = position;
  const Series* const* of = series.data();
  for (const MeasuredField *field = _fields.data(), *end = field + _fields.size(); field != end;
       ++field, ++of) {
    value->text = {};
    if (!field->measure(*value, packet, here, supplier) || *of == nullptr) continue;
    value->series = *of;
    value->row = row;
    ++value;
  }
  values.take(static_cast<std::size_t>(value - first));
}

// --- Records -------------------------------------------------------------------------------------

namespace {

SectionPlace placeOfList(const ListReading& list, const SectionPlace& section) {
  SectionPlace place = section;
  if (list.key.empty()) return place;
  place.section.append("/").append(list.key);
  if (!place.container.empty()) place.container.emplace_back(list.key);
  return place;
}

/// A record that is shown as a plain text has no key.
MeasuredFields::Naming namingOf(const ListReading& list) {
  if (!list.isPlain) return {};
  return [](SeriesGroup& group) { group.path.key.clear(); };
}

}  // namespace

MeasuredTable::MeasuredTable(const ListReading& list, const SectionPlace& section,
                             SeriesTable& series)
    : _table(list.table),
      _rowsAreEntries(section.rowsAreEntries),
      _fields(list.table.fields, placeOfList(list, section), series, namingOf(list)),
      _rows(list.table.identity, _fields.groups(), series) {}

void MeasuredTable::measure(PacketView packet, const NumberSupplier* supplier,
                            MeasuredValues& values) {
  const std::size_t before = values.size();
  std::uint32_t row = 0;
  _rows.beginPacket();
  try {
    forEachRecord(_table, packet, [&](std::size_t index, const RecordPosition& position) {
      if (_rowsAreEntries) row = static_cast<std::uint32_t>(index);
      const RowIdentity identity = _rows.identityOf(row, packet, position, supplier);
      _fields.measure(packet, position, _rows.of(row, identity), row, supplier, values);
      ++row;
    });
  } catch (const ArrayOutOfBoundsException&) {
    values.cut(before);
  }
}

// --- A packet ------------------------------------------------------------------------------------

namespace {

std::vector<const Series*> seriesOf(std::span<const SeriesGroup* const> groups,
                                    SeriesTable& table) {
  std::vector<const Series*> series;
  for (const SeriesGroup* group : groups) {
    series.push_back(group == nullptr ? nullptr : table.series(*group, nullptr));
  }
  return series;
}

}  // namespace

MeasuredReading::MeasuredReading(const PacketReading& reading, const SectionPlace& section,
                                 SeriesTable& series)
    : _packet(reading.packet),
      _fields(reading.fields, section, series),
      _series(seriesOf(_fields.groups(), series)) {
  for (const ListReading& list : reading.lists) {
    if (list.use == RowsUse::Shown && !list.table.keepsNone) {
      _tables.emplace_back(list, section, series);
    }
  }
}

void MeasuredReading::measure(PacketView packet, const NumberSupplier* supplier,
                              MeasuredValues& values) {
  _fields.measure(packet, {}, _series, MeasuredValue::kNoRow, supplier, values);
  for (MeasuredTable& table : _tables) table.measure(packet, supplier, values);
}

}  // namespace kestro
