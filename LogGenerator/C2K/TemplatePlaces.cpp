// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/TemplatePlaces.h"

#include "LogGenerator/DisplayKeys.h"

namespace kestro {

TemplatePlaces::TemplatePlaces(const Dictionary& displayTemplate) { add(displayTemplate, {}); }

std::span<const DisplayPlace> TemplatePlaces::of(std::string_view lookupName) const {
  const auto known = _places.find(lookupName);
  return known == _places.end() ? std::span<const DisplayPlace>() : known->second;
}

void TemplatePlaces::add(const Dictionary& section, const std::string& path) {
  const bool isSorted = !section[kSortedMarker].isNull();
  for (const auto& [key, value] : section) {
    if (!key.isText()) continue;
    const std::string name(isSorted ? nameInSortedDictionary(key.text()) : key.text());
    if (value.isDictionary()) {
      std::string inner = path;
      if (!inner.empty()) inner += '/';
      add(value.dictionary(), inner.append(name));
    } else if (value.isText() && value.text() != kSortedMarker) {
      _places[std::string(value.text())].push_back({path, name});
    }
  }
}

}  // namespace kestro
