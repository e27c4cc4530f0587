// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Decode.h"

#include <algorithm>
#include <utility>

namespace kestro {

// --- One field -----------------------------------------------------------------------------------

namespace {

bool isCommon(const Place& place) { return place.origin == Origin::Here && !place.isBigEndian; }

}  // namespace

BoundField::BoundField(const Field& field)
    : _field(&field),
      _cache(TextCache::forField(field)),
      _mask(maskOf(field.places[0])),
      _place(field.places[0]),
      _isQuick(_cache != nullptr && field.text.number == nullptr && field.condition.isAlways() &&
               isCommon(_place)) {}

bool BoundField::writeSupplied(Value& shown, PacketView packet, const RecordPosition& position,
                               const FieldSupplier* supplier) const {
  if (supplier == nullptr) return false;
  Value supplied = supplier->supply(*_field, packet, position);
  if (supplied.isNull()) return false;
  shown = std::move(supplied);
  return true;
}

bool BoundField::writeOtherwise(Value& shown) const {
  if (_field->otherwise.empty()) return false;
  shown = Value(_field->otherwise);
  return true;
}

bool BoundField::writeOther(Value& shown, PacketView packet, const RecordPosition& position,
                            const FieldSupplier* supplier) const {
  if (!holds(_field->condition, packet, position)) return writeOtherwise(shown);
  if (_cache != nullptr && _field->text.number == nullptr) {
    const std::uint32_t bits = readBits(_place, packet, position);
    shown = bits < TextCache::kSize ? _cache->text(bits) : wideText(bits);
    return true;
  }
  if (isSupplied()) return writeSupplied(shown, packet, position, supplier);
  std::array<std::int64_t, Field::kMaximumPlaces> raw;
  for (std::size_t i = 0; i < _field->placeCount; ++i) {
    raw[i] = readNumber(_field->places[i], packet, position);
  }
  const std::span<const std::int64_t> numbers(raw.data(), _field->placeCount);
  if (_cache == nullptr) {
    shown = makeText(_field->text, numbers);
  } else {
    writeNumber(shown, _field->text.number(numbers));
  }
  return true;
}

void BoundField::writeNumber(Value& shown, std::int64_t number) const {
  if (number >= INT16_MIN && number <= INT16_MAX) {
    shown = _cache->text(static_cast<std::uint16_t>(number));
    return;
  }
  TextBuffer text;
  writeText(_field->text, number, text);
  shown = text.text();
}

Value BoundField::wideText(std::uint32_t bits) const {
  const std::int64_t number = numberFromBits(_place, bits);
  return makeText(_field->text, {&number, 1});
}

// --- The fields of a layout ----------------------------------------------------------------------

BoundFields::BoundFields(std::span<const Field> fields) {
  for (const Field& field : fields) {
    if (field.text.kind == TextRule::Kind::Hidden) continue;
    _keys.emplace_back(field.key, _fields.size());
    _fields.emplace_back(field);
  }
}

void BoundFields::fill(Dictionary& dictionary, PacketView packet) {
  if (dictionary.isNull()) return;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    const BoundField& field = _fields[i];
    if (field.field().text.kind == TextRule::Kind::Removed) {
      dictionary.remove(_keys[i].key());
      continue;
    }
    Value shown;
    if (!field.write(shown, packet, {}, nullptr)) continue;
    _keys[i].set(dictionary, shown);
  }
}

BoundFields::Presence BoundFields::readValues(PacketView packet, const RecordPosition& position,
                                              const FieldSupplier* supplier) {
  _values.clear();
  Presence present = 0;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    Value shown;
    if (!_fields[i].write(shown, packet, position, supplier)) continue;
    _values.push_back(std::move(shown));
    present |= Presence{1} << i;
  }
  return present;
}

bool BoundFields::rewrite(std::span<Value> values, PacketView packet,
                          const RecordPosition& position, const FieldSupplier* supplier) const {
  for (std::size_t i = 0; i < values.size(); ++i) {
    if (!_fields[i].write(values[i], packet, position, supplier)) return false;
  }
  return true;
}

void BoundFields::makeRow(Value& row, PacketView packet, const RecordPosition& position,
                          const FieldSupplier* supplier) {
  if (_allKeys != nullptr) {
    const std::span<Value> earlier = row.soleRow(*_allKeys);
    if (!earlier.empty() && rewrite(earlier, packet, position, supplier)) return;
  }
  const KeyList& keys = keysOf(readValues(packet, position, supplier));
  const std::span<Value> earlier = row.soleRow(keys);
  if (earlier.empty()) {
    row = Dictionary(keys, std::move(_values));
  } else {
    std::ranges::move(_values, earlier.begin());
  }
}

const KeyList& BoundFields::keysOf(Presence present) {
  const bool isWhole = _values.size() == _fields.size();
  if (isWhole && _allKeys != nullptr) return *_allKeys;
  const auto known = _keyLists.find(present);
  if (known != _keyLists.end()) return known->second;
  std::vector<Value> keys;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    if ((present >> i & 1) != 0) keys.push_back(_keys[i].key());
  }
  const KeyList& list =
      _keyLists.emplace(present, KeyList(std::span<const Value>(keys))).first->second;
  if (isWhole) _allKeys = &list;
  return list;
}

std::vector<Value> BoundTable::rows(PacketView packet, std::vector<Value> earlierRows,
                                    const FieldSupplier* supplier) {
  std::vector<Value> rows = std::move(earlierRows);
  std::size_t size = 0;
  forEachRecord(_reading->table, packet, [&](std::size_t, const RecordPosition& position) {
    if (size == rows.size()) rows.emplace_back();
    Value& row = rows[size++];
    if (_reading->isPlain) {
      row = _fields.fields()[0].value(packet, position);
    } else {
      _fields.makeRow(row, packet, position, supplier);
    }
  });
  rows.resize(size);
  return rows;
}

BoundReading::BoundReading(const PacketReading& packetReading)
    : reading(&packetReading), fields(packetReading.fields) {
  tables.reserve(packetReading.lists.size());
  for (const ListReading& list : packetReading.lists) tables.emplace_back(list);
}

}  // namespace kestro
