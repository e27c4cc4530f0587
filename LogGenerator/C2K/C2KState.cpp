// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/C2KState.h"

namespace kestro {

const Value& StateKey::in(const Dictionary& dictionary) {
  static const Value null;
  const std::size_t size = dictionary.size();
  if (_hint < size && dictionary.keyAt(_hint) == _key) return dictionary.valueAt(_hint);
  for (_hint = 0; _hint < size; ++_hint) {
    if (dictionary.keyAt(_hint) == _key) return dictionary.valueAt(_hint);
  }
  return null;
}

}  // namespace kestro
