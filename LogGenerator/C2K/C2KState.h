// SPDX-License-Identifier: MIT
// The keys of the generator state that belong to the CDMA2000 channel.
#pragma once

#include <cstddef>
#include <string_view>

#include "Platform/PropertyList.h"

namespace kestro {

/// The lookup table of the display.
inline constexpr std::string_view kStateLookup = "Lookup";

// Values that last from one packet to the next.
inline constexpr std::string_view kStateTrafficFER = "TrafficFER";
inline constexpr std::string_view kStateFLDataSeqNum = "FLDataSeqNum";
inline constexpr std::string_view kStateFLDataSent = "FLDataSent";
inline constexpr std::string_view kStateRLDataSeqNum = "RLDataSeqNum";
inline constexpr std::string_view kStateRLDataSent = "RLDataSent";

/// A key that every packet asks for, and where it stood when it was last used.
class StateKey {
 public:
  explicit StateKey(std::string_view key) : _key(key) {}

  /// The value under the key; null when there is none. Valid until the next change.
  [[nodiscard]] const Value& in(const Dictionary& dictionary);
  void set(Dictionary& dictionary, const Value& value) {
    _hint = dictionary.set(_key, value, _hint);
  }

 private:
  Value _key;
  std::size_t _hint = 0;
};

}  // namespace kestro
