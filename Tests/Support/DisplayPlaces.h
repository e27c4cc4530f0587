// SPDX-License-Identifier: MIT
// All texts of a display by their places, and the places of what is measured.
#pragma once

#include <charconv>
#include <cmath>
#include <map>
#include <string>
#include <string_view>

#include "LogGenerator/DisplayKeys.h"
#include "LogGenerator/Packets/Measure.h"
#include "Platform/PropertyList.h"

namespace kestro::testing {

/// "/01;Serving Cell/Serving Cell Info/Cell Identity" or "/02;Neighbors/Detected Cells/0/…": texts.
using Places = std::map<std::string, std::string>;

inline void addPlaces(const Value& object, const std::string& path, Places& places) {
  if (object.isText()) places[path] = object.text();
  for (const auto& [key, value] : object.dictionary()) {
    if (key.text() != kSortedMarker) {
      addPlaces(value, std::string(path).append("/").append(key.text()), places);
    }
  }
  const Array array = object.array();
  for (std::size_t i = 0; i < array.size(); ++i) {
    addPlaces(array[i], path + "/" + std::to_string(i), places);
  }
}

[[nodiscard]] inline Places placesOf(const Value& display) {
  Places places;
  addPlaces(display, {}, places);
  return places;
}

/// Where the display shows the value.
[[nodiscard]] inline std::string placeOf(const MeasuredValue& value) {
  const DisplayPath& path = value.series->group->path;
  std::string place;
  for (const std::string& key : path.container) place.append("/").append(key);
  if (value.row != MeasuredValue::kNoRow) place.append("/").append(std::to_string(value.row));
  if (path.rowsAreEntries) place.append(";").append(value.series->item->parts.at(0).text);
  if (!path.key.empty()) place.append("/").append(path.key);
  if (path.element >= 0) place.append("/").append(std::to_string(path.element));
  return place;
}

struct ShownNumber {
  bool isThere = false;
  double value = 0;
  double lastDigit = 1;  ///< what its last digit counts
  std::string unit{};    ///< what follows the number, without a blank before it
};

/// The number that a text begins with, perhaps behind a remark in brackets.
[[nodiscard]] inline ShownNumber numberIn(std::string_view text) {
  if (text.starts_with('(')) text.remove_prefix(std::min(text.find(") ") + 2, text.size()));
  const bool isHexadecimal = text.starts_with("0x");
  if (isHexadecimal) text.remove_prefix(2);
  if (text.starts_with('+')) text.remove_prefix(1);
  ShownNumber number;
  std::uint32_t whole = 0;
  const char* end = text.data() + text.size();
  const auto parsed =
      isHexadecimal ? std::from_chars(text.data(), end, whole, 16)
                    : std::from_chars(text.data(), end, number.value, std::chars_format::fixed);
  if (isHexadecimal) number.value = whole;
  number.isThere = parsed.ec == std::errc();
  const std::string_view digits(text.data(), parsed.ptr);
  const std::size_t point = digits.find('.');
  if (point != std::string_view::npos) {
    number.lastDigit = std::pow(10.0, -static_cast<double>(digits.size() - point - 1));
  }
  number.unit = text.substr(digits.size());
  for (const std::string_view sign : {" ", "× "}) {
    if (number.unit.starts_with(sign)) number.unit.erase(0, sign.size());
  }
  return number;
}

/// Whether the text shows a number that a message may have brought: not the rate of a call that is
/// over, which is shown once more.
[[nodiscard]] inline bool hasNumber(std::string_view text) {
  return numberIn(text).isThere && !text.ends_with("(old)");
}

}  // namespace kestro::testing
