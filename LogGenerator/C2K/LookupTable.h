// SPDX-License-Identifier: MIT
// Where in the display each value belongs.
#pragma once

#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/PlacedKey.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// A lookup name, and its targets in the table through which it was last stored.
class LookupName {
 public:
  explicit LookupName(std::string_view name) : _text(name) {}

 private:
  friend class LookupTable;
  struct Target {
    Dictionary display;
    PlacedKey key;
  };

  Value _text;
  Dictionary _table = Dictionary::null();
  std::vector<Target> _targets{};
};

/// Lookup names to the places of a display that show them. The table itself is a dictionary that
/// others own, in the generator state: each name has an array of targets, dictionaries of a display
/// dictionary ("dict") and a key in it ("key"). The table is complete before values are stored: a
/// name looks its targets up once in each table.
class LookupTable {
 public:
  /// A null handle is a table without names.
  explicit LookupTable(Dictionary table) noexcept : _table(std::move(table)) {}

  /// Appends a target to those of `name`.
  void addTarget(const Value& name, const Value& key, const Dictionary& display);

  /// Sets the value at every target of the name, in order; stops at the first target that has no
  /// display dictionary or no text as its key. A name that the table lacks is passed over.
  void store(LookupName& name, const Value& value) const;

  /// What the only target of the name shows, to be written over. A null pointer when the name has
  /// several targets or none, or was not stored before. Valid until the next change.
  [[nodiscard]] Value* onlyValue(LookupName& name) const;

 private:
  [[nodiscard]] std::span<LookupName::Target> targetsOf(LookupName& name) const {
    if (!name._table.isSame(_table)) findTargets(name);
    return name._targets;
  }
  void findTargets(LookupName& name) const;

  Dictionary _table;
};

}  // namespace kestro
