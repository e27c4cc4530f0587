// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/TemplatePlaces.h"

#include "LogGenerator/DisplayKeys.h"

namespace kestro {

TemplatePlaces::TemplatePlaces(const Dictionary& displayTemplate) {
  add(displayTemplate, DisplayPlace());
}

std::span<const DisplayPlace> TemplatePlaces::of(std::string_view lookupName) const {
  const auto known = _places.find(lookupName);
  return known == _places.end() ? std::span<const DisplayPlace>() : known->second;
}

void TemplatePlaces::add(const Dictionary& section, const DisplayPlace& place) {
  const bool isSorted = !section[kSortedMarker].isNull();
  for (const auto& [key, value] : section) {
    if (!key.isText()) continue;
    const std::string name(isSorted ? nameInSortedDictionary(key.text()) : key.text());
    DisplayPlace inner = place;
    inner.path.emplace_back(key.text());
    if (value.isDictionary()) {
      if (!inner.section.empty()) inner.section += '/';
      inner.section.append(name);
      add(value.dictionary(), inner);
    } else if (value.isText() && value.text() != kSortedMarker) {
      inner.key = name;
      _places[std::string(value.text())].push_back(std::move(inner));
    }
  }
}

}  // namespace kestro
