// SPDX-License-Identifier: MIT
// Values as a snapshot file can hold them.
#pragma once

#include <string>
#include <string_view>

#include "Platform/PropertyList.h"

namespace kestro {

/// `text` with U+FFFD for all that an XML property list cannot hold: every byte that is no UTF-8,
/// NUL, the other control characters but tab and line ends, and U+FFFE and U+FFFF.
[[nodiscard]] std::string storableText(std::string_view text);

/// A copy of `value` that an XML property list can hold. One bad value spoils no others: texts and
/// keys become storable texts; dictionary entries that a display leaves out (a null value, a key
/// that is no text) are left out; any other null, and containers more than 128 levels deep, become
/// the text "(unknown)", as a display shows them. Two keys that become the same are told apart by
/// another U+FFFD. Dates must be of the years 1 to 9999, as those in a message are.
[[nodiscard]] Value storableValue(const Value& value);

}  // namespace kestro
