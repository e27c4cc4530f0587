// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Measure.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>
#include <utility>

#include "LogGenerator/Packets/NumberText.h"
#include "LogGenerator/Packets/Texts.h"

namespace kestro {

void writeShown(const MeasuredValue& value, TextBuffer& text) {
  if (value.text.empty() && value.format != nullptr) {
    text.append(*value.format, value.number);
  } else {
    text.append(value.text);
  }
}

std::string_view unitOf(const NumberFormat& format) {
  if (!format.prefix.empty()) return {};
  std::string_view unit = format.suffix.substr(0, format.suffix.find(" ("));
  for (const std::string_view sign : {" ", "× "}) {
    if (unit.starts_with(sign)) unit.remove_prefix(sign.size());
  }
  return unit;
}

// --- One field -----------------------------------------------------------------------------------

namespace {

constexpr NumberFormat kDecimal = "%d";

/// The unit of a table's names when all of them are numbers of one unit; nothing otherwise.
std::optional<std::string_view> unitOfNames(const NamedValues& names) {
  std::optional<std::string_view> unit;
  for (const NamedValue& name : names) {
    const auto number = numberWithUnit(name.text);
    if (!number || (unit && *unit != number->unit)) return std::nullopt;
    unit = number->unit;
  }
  return unit;
}

std::string_view unitOfRule(const TextRule& rule, std::size_t placeCount) {
  if (rule.kind != TextRule::Kind::Computed) return unitOf(rule.format);
  constexpr std::array<std::int64_t, Field::kMaximumPlaces> kZeros{};
  return unitOf(*rule.computed(std::span(kZeros).first(placeCount)).format);
}

/// An integer conversion shows the low 32 bits.
double shownInteger(const NumberFormat& format, std::int64_t number) {
  const auto word = static_cast<std::uint32_t>(number);
  if (format.conversion == 'd') return static_cast<std::int32_t>(word);
  return word;
}

/// Whether every number that the place can hold is shown as it is.
bool fitsInteger(const TextRule& rule, const Place& place) {
  const std::int64_t highest = (std::int64_t{1} << place.bitCount) - 1;
  const std::int64_t ends[] = {(place.isSigned ? ~highest : 0) * rule.multiplier + rule.addend,
                               highest * rule.multiplier + rule.addend};
  return std::ranges::all_of(ends, [&](std::int64_t end) {
    return shownInteger(rule.format, end) == static_cast<double>(end);
  });
}

bool isQuickRule(const TextRule& rule, const Place& place) {
  if (rule.number != nullptr || rule.hasAbsentValue) return false;
  if (rule.kind == TextRule::Kind::Integer) return fitsInteger(rule, place);
  return rule.kind == TextRule::Kind::Scaled;
}

bool isCommonPlace(const Place& place) {
  return place.origin == Origin::Here && !place.isBigEndian;
}

}  // namespace

MeasuredField::MeasuredField(const Field& field)
    : _field(&field),
      _place(field.places[0]),
      _mask(maskOf(_place)),
      _signBit(_place.isSigned ? 1U << (_place.bitCount - 1) : 0),
      _scale(field.text.kind == TextRule::Kind::Integer ? field.text.multiplier : field.text.scale),
      _offset(field.text.kind == TextRule::Kind::Integer ? field.text.addend : field.text.offset),
      _isQuick(field.placeCount == 1 && field.condition.isAlways() && isCommonPlace(_place) &&
               isQuickRule(field.text, _place)) {
  const auto unit = unitOfNames(field.text.names);
  _isOfNumbers = field.text.kind == TextRule::Kind::Named && unit.has_value();
  if (_isOfNumbers) {
    _unit = *unit;
  } else if (field.text.kind != TextRule::Kind::Named) {
    _unit = unitOfRule(field.text, field.placeCount);
  }
}

SeriesGroup MeasuredField::group(const SectionPlace& place) const {
  const bool isState = _field->text.kind == TextRule::Kind::Named && !_isOfNumbers;
  return {.technology = place.technology,
          .section = place.section,
          .key = std::string(_field->key),
          .unit = std::string(_unit),
          .kind = isState ? SeriesKind::State : SeriesKind::Number,
          .path = {.container = place.container, .key = std::string(_field->key)}};
}

std::optional<std::int64_t> MeasuredField::raw(PacketView packet, const RecordPosition& position,
                                               const NumberSupplier* supplier) const {
  const TextRule& rule = _field->text;
  if (!holds(_field->condition, packet, position)) return std::nullopt;
  if (rule.kind == TextRule::Kind::Supplied) {
    return supplier == nullptr ? std::nullopt : supplier->supply(*_field, packet, position);
  }
  std::int64_t number = readNumber(_place, packet, position);
  if (rule.number != nullptr) {
    std::array<std::int64_t, Field::kMaximumPlaces> numbers;
    for (std::size_t i = 0; i < _field->placeCount; ++i) {
      numbers[i] = readNumber(_field->places[i], packet, position);
    }
    number = rule.number({numbers.data(), _field->placeCount});
  }
  if (rule.hasAbsentValue && number == rule.absentValue) return std::nullopt;
  return number;
}

bool MeasuredField::measureOther(MeasuredValue& value, PacketView packet,
                                 const RecordPosition& position,
                                 const NumberSupplier* supplier) const {
  const TextRule& rule = _field->text;
  if (rule.kind == TextRule::Kind::Computed) return measureComputed(value, packet, position);
  const auto number = raw(packet, position, supplier);
  if (!number) return false;
  value.format = &rule.format;
  switch (rule.kind) {
    case TextRule::Kind::Named:
      return measureName(value, *number);
    case TextRule::Kind::Integer:
      value.number = shownInteger(rule.format, *number * rule.multiplier + rule.addend);
      return true;
    case TextRule::Kind::Scaled:
      value.number = scaledNumber(rule, *number);
      return true;
    default:
      value.format = &kDecimal;
      value.number = static_cast<double>(*number);
      return true;
  }
}

bool MeasuredField::measureComputed(MeasuredValue& value, PacketView packet,
                                    const RecordPosition& position) const {
  if (!holds(_field->condition, packet, position)) return false;
  std::array<std::int64_t, Field::kMaximumPlaces> numbers;
  for (std::size_t i = 0; i < _field->placeCount; ++i) {
    numbers[i] = readNumber(_field->places[i], packet, position);
  }
  const ComputedValue computed = _field->text.computed({numbers.data(), _field->placeCount});
  if (computed.isAbsent || !std::isfinite(computed.number)) return false;
  value.number = computed.number;
  value.format = computed.format;
  return true;
}

bool MeasuredField::measureName(MeasuredValue& value, std::int64_t raw) const {
  const TextRule& rule = _field->text;
  const auto row = std::ranges::find(rule.names, raw, &NamedValue::value);
  const bool isListed = row != rule.names.end();
  // Names of numbers know no other; a table without names says that there is no value.
  if (!isListed && (_isOfNumbers || rule.names.empty())) return false;
  value.number = static_cast<double>(raw);
  if (!isListed) {
    value.text = rule.otherName;
    if (rule.otherName.empty()) value.number = shownInteger(rule.format, raw);
    return true;
  }
  value.text = row->text;
  if (_isOfNumbers) value.number = numberWithUnit(row->text)->number;
  return true;
}

// --- The fields of a layout ----------------------------------------------------------------------

MeasuredFields::MeasuredFields(std::span<const Field> fields, const SectionPlace& place,
                               SeriesTable& series)
    : _table(series) {
  for (const Field& field : fields) {
    const TextRule::Kind kind = field.text.kind;
    if (kind == TextRule::Kind::Hidden || kind == TextRule::Kind::Removed) continue;
    if (kind == TextRule::Kind::Each) {
      addElements(field, place);
    } else {
      _fields.emplace_back(field);
      _groups.push_back(_table.group(_fields.back().group(place)));
    }
  }
}

void MeasuredFields::addElements(const Field& field, const SectionPlace& place) {
  for (std::size_t i = 0; i < field.placeCount; ++i) {
    Field& element = _elements.emplace_back(field);
    element.text = decimal();
    element.places[0] = field.places[i];
    element.placeCount = 1;
    _fields.emplace_back(element);
    SeriesGroup group = _fields.back().group(place);
    group.key += " " + std::to_string(i);
    group.path.element = static_cast<int>(i);
    _groups.push_back(_table.group(std::move(group)));
  }
}

std::vector<const Series*> MeasuredFields::seriesOf(const Item* item) const {
  std::vector<const Series*> series;
  for (const SeriesGroup* group : _groups) {
    series.push_back(group == nullptr ? nullptr : _table.series(*group, item));
  }
  return series;
}

void MeasuredFields::measure(PacketView packet, const RecordPosition& position,
                             std::span<const Series* const> series, std::uint32_t row,
                             const NumberSupplier* supplier, MeasuredValues& values) const {
  const std::size_t before = values.size();
  values.resize(before + _fields.size());
  MeasuredValue* value = values.data() + before;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    value->text = {};
    if (!_fields[i].measure(*value, packet, position, supplier) || series[i] == nullptr) continue;
    value->series = series[i];
    value->row = row;
    ++value;
  }
  values.resize(static_cast<std::size_t>(value - values.data()));
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

}  // namespace

MeasuredTable::MeasuredTable(const ListReading& list, const SectionPlace& section,
                             SeriesTable& series)
    : _list(list), _table(series), _fields(list.table.fields, placeOfList(list, section), series) {
  for (const Field& field : list.table.identity) _identity.emplace_back(field);
  _full.series.resize(_fields.fields().size());
}

std::size_t MeasuredTable::IdentityHash::operator()(const Identity& identity) const noexcept {
  std::uint64_t hash = identity.present;
  for (const std::int64_t number : identity.numbers) {
    hash = (hash ^ static_cast<std::uint64_t>(number)) * 0x9E3779B97F4A7C15U;
    hash ^= hash >> 32;
  }
  return hash;
}

void MeasuredTable::measure(PacketView packet, const NumberSupplier* supplier,
                            MeasuredValues& values) {
  const std::size_t before = values.size();
  std::size_t row = 0;
  ++_packet;
  try {
    forEachRecord(_list.table, packet, [&](std::size_t, const RecordPosition& position) {
      const Identity identity = identityOf(row, packet, position, supplier);
      _fields.measure(packet, position, seriesOf(row, identity), static_cast<std::uint32_t>(row),
                      supplier, values);
      ++row;
    });
  } catch (const ArrayOutOfBoundsException&) {
    values.resize(before);
  }
}

MeasuredTable::Identity MeasuredTable::identityOf(std::size_t row, PacketView packet,
                                                  const RecordPosition& position,
                                                  const NumberSupplier* supplier) const {
  Identity identity;
  std::size_t count = 0;
  for (std::size_t i = 0; i < _identity.size() && count < identity.numbers.size(); ++i) {
    const auto number = _identity[i].raw(packet, position, supplier);
    if (!number) continue;
    identity.numbers[count++] = *number;
    identity.present |= 1U << i;
  }
  if (count == 0) identity.numbers[0] = static_cast<std::int64_t>(row);
  return identity;
}

const std::vector<const Series*>& MeasuredTable::seriesOf(std::size_t row,
                                                          const Identity& identity) {
  KnownRow& known = knownRow(row, identity);
  if (&known == &_full) return known.series;
  if (std::exchange(known.packet, _packet) != _packet) {
    known.count = 1;
    return known.series;
  }
  const std::size_t other = known.count++ - 1;
  if (other == known.others.size()) {
    const Item* item = _table.item(itemOf(identity, known.count));
    if (item == nullptr) return _full.series;
    known.others.push_back({.series = _fields.seriesOf(item)});
  }
  return known.others[other].series;
}

MeasuredTable::KnownRow& MeasuredTable::knownRow(std::size_t row, const Identity& identity) {
  if (row < _lastRows.size() && _lastRows[row].identity == identity) return *_lastRows[row].row;
  auto known = _rows.find(identity);
  if (known == _rows.end()) {
    const Item* item = _table.item(itemOf(identity, 1));
    if (item == nullptr) return _full;
    known = _rows.emplace(identity, KnownRow{.series = _fields.seriesOf(item)}).first;
  }
  if (row == _lastRows.size()) _lastRows.emplace_back();
  if (row < _lastRows.size()) _lastRows[row] = {identity, &known->second};
  return known->second;
}

Item MeasuredTable::itemOf(const Identity& identity, std::size_t occurrence) const {
  Item item;
  for (std::size_t i = 0; i < _identity.size(); ++i) {
    if ((identity.present >> i & 1) == 0) continue;
    const Field& field = _list.table.identity[i];
    const std::int64_t number = identity.numbers[item.parts.size()];
    TextBuffer text;
    writeText(field.text, number, text);
    if (!item.text.empty()) item.text += '/';
    item.text += text.text();
    item.parts.push_back(
        {.key = std::string(field.key), .number = number, .text = std::string(text.text())});
  }
  if (item.parts.empty()) item.text = "#" + std::to_string(identity.numbers[0]);
  if (occurrence > 1) item.text += " #" + std::to_string(occurrence);
  return item;
}

// --- A packet ------------------------------------------------------------------------------------

MeasuredReading::MeasuredReading(const PacketReading& reading, const SectionPlace& section,
                                 SeriesTable& series)
    : _packet(reading.packet),
      _fields(reading.fields, section, series),
      _series(_fields.seriesOf(nullptr)) {
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
