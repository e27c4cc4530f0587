// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/ListMeasurer.h"

#include <algorithm>
#include <string>

#include "LogGenerator/DisplayKeys.h"

namespace kestro {
namespace {

/// The cell's number as the section shows it; nothing when there is none, or none was measured.
std::optional<double> shownNumber(const ListedValue& value, const Dictionary& cell) {
  const auto number = cellNumber(cell, value.listKey);
  if (!number || isNotMeasured(value, *number)) return std::nullopt;
  const std::int64_t shown = std::int64_t{*number} * value.text.multiplier + value.text.addend;
  return static_cast<std::int32_t>(static_cast<std::uint32_t>(shown));
}

}  // namespace

ListMeasurer::ListMeasurer(const Section& section, const SectionPlace& place, SeriesTable& series)
    : _section(section), _reading(*section.propertyList), _place(place), _series(series) {
  const bool isOfTexts = _reading.part == ListedPart::Root || _reading.part == ListedPart::Elements;
  for (const ListedValue& value : _reading.values) {
    _groups.push_back(_series.group(
        {.technology = place.technology,
         .section = place.section,
         .key = std::string(value.key),
         .unit = std::string(isOfTexts ? std::string_view() : unitOf(value.text.format)),
         .kind = isOfTexts ? SeriesKind::Text : SeriesKind::Number,
         .path = pathIn(place, value.key)}));
  }
}

void ListMeasurer::measure(const Result<Value>& root, MeasuredValues& values) {
  if (!root) return;
  switch (_reading.part) {
    case ListedPart::Root:
      return measureFiles(root->dictionary(), values);
    case ListedPart::Elements:
      return measureElements(root->array(), values);
    case ListedPart::FirstCell:
    case ListedPart::EachCell:
      return measureCells(root->array(), values);
  }
}

void ListMeasurer::measureCells(const Array& list, MeasuredValues& values) {
  const std::vector<Dictionary> cells = chosenCells(_reading, list);
  if (!isList()) return measureLast(cells, values);
  for (std::uint32_t row = 0; row < cells.size(); ++row) {
    const Item* item = itemOf(cells[row], row);
    for (std::size_t i = 0; i < _groups.size() && item != nullptr; ++i) {
      measureNumber(i, cells[row], item, row, values);
    }
  }
}

void ListMeasurer::measureLast(const std::vector<Dictionary>& cells, MeasuredValues& values) {
  for (std::size_t i = 0; i < _groups.size(); ++i) {
    const auto last = std::find_if(cells.rbegin(), cells.rend(), [&](const Dictionary& cell) {
      return cellNumber(cell, _reading.values[i].listKey).has_value();
    });
    if (last != cells.rend()) measureNumber(i, *last, nullptr, MeasuredValue::kNoRow, values);
  }
}

void ListMeasurer::measureNumber(std::size_t index, const Dictionary& cell, const Item* item,
                                 std::uint32_t row, MeasuredValues& values) {
  const ListedValue& value = _reading.values[index];
  const auto number = shownNumber(value, cell);
  if (!number || _groups[index] == nullptr) return;
  const Series* series = _series.series(*_groups[index], item);
  if (series == nullptr) return;
  values.add({.series = series, .number = *number, .format = &value.text.format, .row = row});
}

const Item* ListMeasurer::itemOf(const Dictionary& cell, std::size_t row) {
  Item item;
  for (const std::string_view key : _reading.identity) {
    const auto value = std::ranges::find(_reading.values, key, &ListedValue::key);
    const auto number = shownNumber(*value, cell);
    if (!number) continue;
    const auto whole = static_cast<std::int64_t>(*number);
    if (!item.text.empty()) item.text += '/';
    item.text += std::to_string(whole);
    item.parts.push_back({.key = std::string(key), .number = whole, .text = std::to_string(whole)});
  }
  if (item.parts.empty()) item.text = "#" + std::to_string(row);
  return _series.item(std::move(item));
}

void ListMeasurer::measureFiles(const Dictionary& files, MeasuredValues& values) {
  for (std::size_t i = 0; i < _groups.size(); ++i) {
    const Value& value = files[_reading.values[i].listKey];
    if (!value.isText() || _groups[i] == nullptr) continue;
    const Series* series = _series.series(*_groups[i], nullptr);
    if (series != nullptr) values.add({.series = series, .text = value.text()});
  }
}

void ListMeasurer::measureElements(const Array& elements, MeasuredValues& values) {
  std::uint32_t row = 0;
  for (const Value& element : elements) {
    const Item* item = _series.item({.text = "#" + std::to_string(row)});
    for (const auto& [key, value] : element.dictionary()) {
      if (item == nullptr || !key.isText() || !value.isText()) continue;
      if (key.text() == kSortedMarker) continue;  // it is never shown
      const Series* series = textSeries(key.text(), item);
      if (series != nullptr) {
        values.add({.series = series, .text = value.text(), .row = row});
      }
    }
    ++row;
  }
}

const Series* ListMeasurer::textSeries(std::string_view key, const Item* item) {
  const SeriesGroup* group = _series.group({.technology = _place.technology,
                                            .section = _place.section,
                                            .key = std::string(key),
                                            .kind = SeriesKind::Text,
                                            .path = pathIn(_place, key)});
  return group == nullptr ? nullptr : _series.series(*group, item);
}

}  // namespace kestro
