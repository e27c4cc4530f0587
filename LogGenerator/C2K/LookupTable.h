// SPDX-License-Identifier: MIT
// Where in the display each value belongs.
#pragma once

#include <cstddef>
#include <string_view>

#include "Platform/PropertyList.h"

namespace kestro {

/// A lookup name, and where its entry stood when it was last used.
struct LookupName {
  explicit LookupName(std::string_view name) : text(name) {}

  Value text;
  std::size_t tableHint = 0;
  std::size_t displayHint = 0;
};

/// Lookup names to the places of a display that show them. The table itself is a dictionary that
/// others own, in the generator state: each name has an array of targets, dictionaries of a display
/// dictionary ("dict") and a key in it ("key").
class LookupTable {
 public:
  /// A null handle is a table without names.
  explicit LookupTable(Dictionary table) noexcept : _table(std::move(table)) {}

  /// Appends a target to those of `name`.
  void addTarget(const Value& name, const Value& key, const Dictionary& display);

  /// Sets the value at every target of the name, in order; stops at the first target that has no
  /// display dictionary or no text as its key. A name that the table lacks is passed over.
  void store(LookupName& name, const Value& value) const;

 private:
  [[nodiscard]] Array targetsOf(LookupName& name) const;

  Dictionary _table;
};

}  // namespace kestro
