// SPDX-License-Identifier: MIT
// Where a CDMA2000 template shows each value.
#pragma once

#include <map>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/PropertyList.h"

namespace kestro {

/// One place of the display: the names of the sections on the way, joined by "/", and of the entry.
struct DisplayPlace {
  std::string section;
  std::string key;
  /// The keys on the way and of the entry as the template has them: "01;1x".
  std::vector<std::string> path{};
};

/// Lookup names to the places where a template shows them.
class TemplatePlaces {
 public:
  /// A null handle shows nothing.
  explicit TemplatePlaces(const Dictionary& displayTemplate);

  /// In the template's order; empty for a name that it does not show.
  [[nodiscard]] std::span<const DisplayPlace> of(std::string_view lookupName) const;

 private:
  void add(const Dictionary& section, const DisplayPlace& place);

  std::map<std::string, std::vector<DisplayPlace>, std::less<>> _places;
};

}  // namespace kestro
