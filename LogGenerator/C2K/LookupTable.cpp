// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/LookupTable.h"

namespace kestro {
namespace {

constexpr std::string_view kTargetKey = "key";
constexpr std::string_view kTargetDictionary = "dict";

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
    Dictionary display = target[kTargetDictionary].dictionary();
    const Value& key = target[kTargetKey];
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
