// SPDX-License-Identifier: MIT
// Texts of a service as they may be shown.
#pragma once

#include <string>
#include <string_view>

namespace kestro {

/// At most 256 bytes of the text, whole characters, control characters as "?".
[[nodiscard]] std::string shownText(std::string_view text);

/// The text with "*" for its letters and digits but the last four; for all of them where there are
/// no more than four. What separates them stays.
[[nodiscard]] std::string maskedText(std::string_view text);

}  // namespace kestro
