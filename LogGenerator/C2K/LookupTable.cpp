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
  for (auto& [display, key] : targetsOf(name)) key.set(display, value);
}

Value* LookupTable::onlyValue(LookupName& name) const {
  const auto targets = targetsOf(name);
  return targets.size() == 1 ? targets[0].key.toRewrite(targets[0].display) : nullptr;
}

void LookupTable::findTargets(LookupName& name) const {
  name._table = _table;
  name._targets.clear();
  for (const Value& element : _table[name._text.text()].array()) {
    const Dictionary target = element.dictionary();
    const Dictionary display = target[kTargetDictionary].dictionary();
    const Value& key = target[kTargetKey];
    if (display.isNull() || !key.isText()) break;
    name._targets.push_back({display, PlacedKey(key)});
  }
}

}  // namespace kestro
