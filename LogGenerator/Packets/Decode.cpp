// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Decode.h"

#include <array>
#include <utility>

namespace kestro {
namespace {

Value otherValue(const BoundField& field, PacketView packet, const RecordPosition& position,
                 const FieldSupplier* supplier) {
  if (!field.isSupplied()) return field.value(packet, position);
  return supplier == nullptr ? Value() : supplier->supply(field.field(), packet, position);
}

}  // namespace

Value BoundField::makeValue(PacketView packet, const RecordPosition& position) const {
  if (!holds(_field->condition, packet, position)) {
    return _field->otherwise.empty() ? Value() : Value(_field->otherwise);
  }
  std::array<std::int64_t, Field::kMaximumPlaces> raw;
  for (std::size_t i = 0; i < _field->placeCount; ++i) {
    raw[i] = readNumber(_field->places[i], packet, position);
  }
  const std::span<const std::int64_t> numbers(raw.data(), _field->placeCount);
  if (_field->text.number != nullptr) return showNumber(_field->text.number(numbers));
  if (_cache == nullptr) return makeText(_field->text, numbers);
  const std::uint32_t bits = readBits(_place, packet, position);
  return bits < TextCache::kSize ? _cache->text(bits) : makeText(_field->text, numbers);
}

Value BoundField::showNumber(std::int64_t number) const {
  const bool isKept = number >= INT16_MIN && number <= INT16_MAX;
  if (isKept) return _cache->text(static_cast<std::uint16_t>(number));
  TextBuffer text;
  writeText(_field->text, number, text);
  return text.text();
}

BoundFields::BoundFields(std::span<const Field> fields) {
  for (const Field& field : fields) {
    if (field.text.kind != TextRule::Kind::Hidden) _fields.emplace_back(field);
  }
  _hints.resize(_fields.size());
  for (std::size_t i = 0; i < _hints.size(); ++i) _hints[i] = i;
}

void BoundFields::fill(Dictionary& dictionary, PacketView packet) {
  if (dictionary.isNull()) return;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    const BoundField& field = _fields[i];
    if (const Value* kept = field.keptText(packet, {})) {
      _hints[i] = dictionary.set(field.key(), *kept, _hints[i]);
      continue;
    }
    if (field.isSupplied()) continue;
    if (field.field().text.kind == TextRule::Kind::Removed) {
      dictionary.remove(field.key());
      continue;
    }
    const Value value = field.value(packet, {});
    if (!value.isNull()) _hints[i] = dictionary.set(field.key(), value, _hints[i]);
  }
}

BoundFields::Presence BoundFields::readValues(PacketView packet, const RecordPosition& position,
                                              const FieldSupplier* supplier) {
  _values.clear();
  Presence present = 0;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    const BoundField& field = _fields[i];
    if (const Value* kept = field.keptText(packet, position)) {
      _values.push_back(*kept);
    } else {
      Value value = otherValue(field, packet, position, supplier);
      if (value.isNull()) continue;
      _values.push_back(std::move(value));
    }
    present |= Presence{1} << i;
  }
  return present;
}

bool BoundFields::rewrite(std::span<Value> values, PacketView packet,
                          const RecordPosition& position, const FieldSupplier* supplier) const {
  for (std::size_t i = 0; i < values.size(); ++i) {
    const BoundField& field = _fields[i];
    if (const Value* kept = field.keptText(packet, position)) {
      values[i] = *kept;
      continue;
    }
    Value value = otherValue(field, packet, position, supplier);
    if (value.isNull()) return false;
    values[i] = std::move(value);
  }
  return true;
}

void BoundFields::makeRow(Value& row, PacketView packet, const RecordPosition& position,
                          const FieldSupplier* supplier) {
  if (_allKeys != nullptr && row.isOnlyReference()) {
    Dictionary earlier = row.dictionary();
    if (earlier.hasKeyList(*_allKeys) &&
        rewrite(earlier.valuesToRewrite(), packet, position, supplier)) {
      return;
    }
  }
  const KeyList& keys = keysOf(readValues(packet, position, supplier));
  if (row.isOnlyReference()) {
    Dictionary earlier = row.dictionary();
    if (earlier.hasKeyList(keys)) {
      earlier.swapValues(_values);
      return;
    }
  }
  row = Dictionary(keys, std::move(_values));
}

const KeyList& BoundFields::keysOf(Presence present) {
  const bool isWhole = _values.size() == _fields.size();
  if (isWhole && _allKeys != nullptr) return *_allKeys;
  const auto known = _keyLists.find(present);
  if (known != _keyLists.end()) return known->second;
  std::vector<Value> keys;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    if ((present >> i & 1) != 0) keys.push_back(_fields[i].key());
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
