// SPDX-License-Identifier: MIT
#include "LogGenerator/IFX/IFXMeasurer.h"

#include <algorithm>
#include <utility>

#include "LogGenerator/DisplayKeys.h"
#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "LogGenerator/InternalConsistencyFailure.h"
#include "LogGenerator/Packets/NumberText.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

/// What identifies a cell in a list, where its row has it.
constexpr std::string_view kIdentityKeys[] = {"UARFCN", "PSC", "ARFCN", "BSIC"};

/// Such a value is no number, whatever digits it has: "12" and "1F" are of one series.
constexpr std::string_view kHexadecimal = "(hex)";

Item itemOf(const Dictionary& row, std::uint32_t number) {
  Item item;
  for (const std::string_view key : kIdentityKeys) {
    const Value& value = row[key];
    if (!value.isText()) continue;
    const auto parsed = numberWithUnit(value.text());
    if (!item.text.empty()) item.text += '/';
    item.text += value.text();
    item.parts.push_back({.key = std::string(key),
                          .number = parsed ? static_cast<std::int64_t>(parsed->number) : 0,
                          .text = std::string(value.text())});
  }
  if (item.parts.empty()) item.text = "#" + std::to_string(number);
  return item;
}

}  // namespace

LogCode IFXMeasurer::measure(ByteView message, MeasuredValues& values) {
  const Result<Value> parsed = _coding.parse(message);
  if (!parsed) return 0;
  try {
    _display = GSMLogGenerator::processObject(*parsed);
  } catch (const InternalConsistencyFailure&) {
    return 0;
  }
  const Position root{.place = {.technology = std::string(kTqLogChannelTechnology_IFX)}};
  measureEntries(_display.dictionary(), root, values);
  return 0;
}

void IFXMeasurer::measureEntries(const Dictionary& entries, const Position& position,
                                 MeasuredValues& values) {
  const bool isSorted = !entries[kSortedMarker].isNull();
  for (const auto& [key, value] : entries) {
    if (!key.isText() || key.text() == kSortedMarker) continue;
    const std::string_view name = isSorted ? nameInSortedDictionary(key.text()) : key.text();
    measureEntry(key, name, value, position, values);
  }
}

void IFXMeasurer::measureEntry(const Value& key, std::string_view name, const Value& value,
                               const Position& position, MeasuredValues& values) {
  if (value.isText()) {
    DisplayPath path{.container = position.place.container, .key = std::string(key.text())};
    return measureText(std::move(path), name, value, position, values);
  }
  Position inner = position;
  if (!inner.place.section.empty()) inner.place.section += '/';
  inner.place.section += name;
  if (inner.place.section.size() > SeriesTable::kLongestName) return;
  if (position.item == nullptr) {
    inner.place.container.emplace_back(key.text());
  } else {
    inner.place.container.clear();  // a container within a row is no place that a path can name
  }
  measureEntries(value.dictionary(), inner, values);
  measureRows(value.array(), inner, values);
}

void IFXMeasurer::measureRows(const Array& rows, const Position& position, MeasuredValues& values) {
  std::uint32_t number = 0;
  for (const Value& value : rows) {
    Position row = position;
    row.row = number;
    row.item = _series.item(itemOf(value.dictionary(), number));
    ++number;
    if (row.item == nullptr) continue;
    measureEntries(value.dictionary(), row, values);
    if (!value.isText()) continue;
    // What remains of a row with one value is that value.
    DisplayPath path{.container = row.place.container};
    measureText(std::move(path), "Value", value, row, values);
  }
}

void IFXMeasurer::measureText(DisplayPath path, std::string_view name, const Value& text,
                              const Position& position, MeasuredValues& values) {
  const bool isHexadecimal = name.ends_with(kHexadecimal);
  const auto number = isHexadecimal ? std::nullopt : numberWithUnit(text.text());
  const SeriesGroup* group =
      _series.group({.technology = position.place.technology,
                     .section = position.place.section,
                     .key = std::string(name),
                     .unit = std::string(number ? number->unit : std::string_view()),
                     .kind = number ? SeriesKind::Number : SeriesKind::Text,
                     .path = std::move(path)});
  const Series* series = group == nullptr ? nullptr : _series.series(*group, position.item);
  if (series == nullptr) return;
  values.add({.series = series,
              .number = number ? number->number : 0,
              .text = text.text(),
              .row = position.row});
}

}  // namespace kestro
