// SPDX-License-Identifier: MIT
// Texts from outside, made safe for a terminal and measured in its cells.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace kestro {

/// `text` as a terminal may show it on one line: control characters become their pictures ("␛") or
/// U+FFFD, as do bytes that are no UTF-8 and characters that only steer the layout (line
/// separators, text direction). What is left moves nothing but the cursor, to the right.
[[nodiscard]] std::string displayText(std::string_view text);

/// How many cells a terminal needs for a text that `displayText` made: 2 for a wide character, 0
/// for a combining one, else 1.
[[nodiscard]] std::size_t textWidth(std::string_view displayText);

/// The text, or its beginning with "…" at the end, in at most `cells` cells; "" for 0 cells.
[[nodiscard]] std::string fitText(std::string_view displayText, std::size_t cells);

/// `text` with U+FFFD for every byte that is no UTF-8; everything else stays.
[[nodiscard]] std::string validUtf8(std::string_view text);

/// Where the valid UTF-8 that `text` begins with ends: its size when all of it is valid.
[[nodiscard]] std::size_t validUtf8Prefix(std::string_view text) noexcept;

/// U+FFFD, which stands for what cannot be shown.
inline constexpr std::string_view kReplacementCharacter = "\xEF\xBF\xBD";

}  // namespace kestro
