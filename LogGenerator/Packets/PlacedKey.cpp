// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/PlacedKey.h"

namespace kestro {

const Value& PlacedKey::in(const Dictionary& dictionary) {
  static const Value null;
  const std::size_t size = dictionary.size();
  if (_place < size && dictionary.keyAt(_place) == _key) return dictionary.valueAt(_place);
  for (_place = 0; _place < size; ++_place) {
    if (dictionary.keyAt(_place) == _key) return dictionary.valueAt(_place);
  }
  return null;
}

}  // namespace kestro
