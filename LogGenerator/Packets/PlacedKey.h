// SPDX-License-Identifier: MIT
// Keys that are used with every packet.
#pragma once

#include <cstddef>
#include <span>
#include <utility>

#include "Platform/PropertyList.h"

namespace kestro {

/// A key, and where in its dictionary it stood when it was last used: there it is looked for first.
/// Any dictionary will do, with or without the key.
class PlacedKey {
 public:
  /// `place` is where the key may stand.
  explicit PlacedKey(Value key, std::size_t place = 0) noexcept
      : _key(std::move(key)), _place(place) {}

  [[nodiscard]] const Value& key() const noexcept { return _key; }

  /// The value under the key; null when there is none. Valid until the next change.
  [[nodiscard]] const Value& in(const Dictionary& dictionary);
  /// Replaces the value under the key where it stands, or appends the entry.
  void set(Dictionary& dictionary, const Value& value) {
    _place = dictionary.set(_key, value, _place);
  }
  /// The value under the key, to be written over; a null pointer when the key stands somewhere else
  /// than before, or nowhere. Valid until a key comes or goes.
  [[nodiscard]] Value* toRewrite(Dictionary& dictionary) const {
    const std::span<Value> values = dictionary.valuesToRewrite();
    return _place < values.size() && dictionary.keyAt(_place) == _key ? &values[_place] : nullptr;
  }

 private:
  Value _key;
  std::size_t _place;
};

}  // namespace kestro
