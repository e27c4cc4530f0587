// SPDX-License-Identifier: MIT
// How a display dictionary says in which order its entries are shown.
#pragma once

#include <string_view>

namespace kestro {

/// The key, and the value, of the entry that makes a dictionary show its keys in ascending byte
/// order. The entry itself is never shown.
inline constexpr std::string_view kSortedMarker = "_sorted";

/// Parts the piece of a key that orders it from its name, as in "01;Serving Cell".
inline constexpr char kNameSeparator = ';';

/// The name under which a sorted dictionary shows a key: the second piece of exactly two, else the
/// whole key.
[[nodiscard]] constexpr std::string_view nameInSortedDictionary(std::string_view key) noexcept {
  const std::size_t separator = key.find(kNameSeparator);
  if (separator == std::string_view::npos) return key;
  const std::string_view second = key.substr(separator + 1);
  return second.find(kNameSeparator) == std::string_view::npos ? second : key;
}

}  // namespace kestro
