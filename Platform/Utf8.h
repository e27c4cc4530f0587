// SPDX-License-Identifier: MIT
// Which texts a property list may hold.
#pragma once

#include <cstddef>
#include <string_view>

namespace kestro {

/// The length of the longest prefix of `text` that is valid UTF-8 without a NUL: `text.size()` when
/// all of it is. Overlong forms, surrogates and what lies above U+10FFFF are invalid.
[[nodiscard]] std::size_t validTextPrefix(std::string_view text) noexcept;

/// Whether every byte of `text` is an ASCII character other than NUL.
[[nodiscard]] bool isPlainAscii(std::string_view text) noexcept;

}  // namespace kestro
