// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/LookupTable.h"

namespace kestro {
namespace {

constexpr std::string_view kTargetKey = "key";
constexpr std::string_view kTargetDictionary = "dict";

/// A target's two parts. Targets made here have them in this order; others are searched.
const Value& keyOf(const Dictionary& target) {
  static const Value name(kTargetKey);
  const bool isFirst = target.size() > 0 && target.keyAt(0) == name;
  return isFirst ? target.valueAt(0) : target[kTargetKey];
}
Dictionary displayOf(const Dictionary& target) {
  static const Value name(kTargetDictionary);
  const bool isSecond = target.size() > 1 && target.keyAt(1) == name;
  return (isSecond ? target.valueAt(1) : target[kTargetDictionary]).dictionary();
}

}  // namespace

void LookupTable::addTarget(const Value& name, const Value& key, const Dictionary& display) {
  const Value* known = _table.find(name);
  Array targets = known == nullptr ? Array() : known->array();
  targets.append(Dictionary{{kTargetKey, key}, {kTargetDictionary, display}});
  if (known == nullptr) _table.set(name, targets);
}

void LookupTable::store(LookupName& name, const Value& value) const {
  for (const Value& element : targetsOf(name)) {
    const Dictionary target = element.dictionary();
    Dictionary display = displayOf(target);
    const Value& key = keyOf(target);
    if (display.isNull() || !key.isText()) return;
    name.displayHint = display.set(key, value, name.displayHint);
  }
}

Array LookupTable::targetsOf(LookupName& name) const {
  const std::size_t size = _table.size();
  if (name.tableHint < size && _table.keyAt(name.tableHint) == name.text) {
    return _table.valueAt(name.tableHint).array();
  }
  for (std::size_t i = 0; i < size; ++i) {
    if (!(_table.keyAt(i) == name.text)) continue;
    name.tableHint = i;
    return _table.valueAt(i).array();
  }
  return Array::null();
}

}  // namespace kestro
