// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/MeasuredField.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <span>

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
      _isRead(field.placeCount == 1 && field.condition.isAlways() && field.text.number == nullptr &&
              !field.text.hasAbsentValue),
      _isQuick(field.placeCount == 1 && field.condition.isAlways() && isCommonPlace(_place) &&
               isQuickRule(field.text, _place)) {
  _isOfNumbers = field.text.kind == TextRule::Kind::Named && unitOfNames(field.text.names);
}

DisplayPath pathIn(const SectionPlace& place, std::string_view key) {
  if (place.container.empty()) return {};
  return {.container = place.container,
          .key = std::string(place.rowsAreEntries ? std::string_view() : key),
          .rowsAreEntries = place.rowsAreEntries};
}

SeriesGroup MeasuredField::group(const SectionPlace& place) const {
  const bool isNamed = _field->text.kind == TextRule::Kind::Named;
  const auto unit =
      isNamed ? unitOfNames(_field->text.names) : unitOfRule(_field->text, _field->placeCount);
  return {.technology = place.technology,
          .section = place.section,
          .key = std::string(_field->key),
          .unit = std::string(unit.value_or("")),
          .kind = isNamed && !_isOfNumbers ? SeriesKind::State : SeriesKind::Number,
          .path = pathIn(place, _field->key)};
}

bool MeasuredField::otherRaw(std::int64_t& number, PacketView packet,
                             const RecordPosition& position, const NumberSupplier* supplier) const {
  const TextRule& rule = _field->text;
  if (!holds(_field->condition, packet, position)) return false;
  if (rule.kind == TextRule::Kind::Supplied) {
    const auto supplied =
        supplier == nullptr ? std::nullopt : supplier->supply(*_field, packet, position);
    number = supplied.value_or(0);
    return supplied.has_value();
  }
  number = readNumber(_place, packet, position);
  if (rule.number != nullptr) {
    std::array<std::int64_t, Field::kMaximumPlaces> numbers;
    number = rule.number(rawNumbers(packet, position, numbers));
  }
  return !rule.hasAbsentValue || number != rule.absentValue;
}

std::span<const std::int64_t> MeasuredField::rawNumbers(
    PacketView packet, const RecordPosition& position,
    std::span<std::int64_t, Field::kMaximumPlaces> numbers) const {
  for (std::size_t i = 0; i < _field->placeCount; ++i) {
    numbers[i] = readNumber(_field->places[i], packet, position);
  }
  return numbers.first(_field->placeCount);
}

bool MeasuredField::measureOther(MeasuredValue& value, PacketView packet,
                                 const RecordPosition& position,
                                 const NumberSupplier* supplier) const {
  const TextRule& rule = _field->text;
  if (rule.kind == TextRule::Kind::Computed) return measureComputed(value, packet, position);
  std::int64_t number = 0;
  if (!raw(number, packet, position, supplier)) return false;
  value.format = &rule.format;
  switch (rule.kind) {
    case TextRule::Kind::Named:
      return measureName(value, number);
    case TextRule::Kind::Integer:
      value.number = shownInteger(rule.format, number * rule.multiplier + rule.addend);
      return true;
    case TextRule::Kind::Scaled:
      value.number = scaledNumber(rule, number);
      return true;
    default:
      value.format = &kDecimal;
      value.number = static_cast<double>(number);
      return true;
  }
}

bool MeasuredField::measureComputed(MeasuredValue& value, PacketView packet,
                                    const RecordPosition& position) const {
  if (!holds(_field->condition, packet, position)) return false;
  std::array<std::int64_t, Field::kMaximumPlaces> numbers;
  const ComputedValue computed = _field->text.computed(rawNumbers(packet, position, numbers));
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

}  // namespace kestro
