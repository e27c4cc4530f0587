// SPDX-License-Identifier: MIT
// Which texts are names of message ports.
#pragma once

#include <algorithm>
#include <cstddef>
#include <string_view>

namespace kestro {

inline constexpr std::size_t kMaximumPortNameLength = 64;

/// Whether `name` is 1 to 64 letters (A-Z, a-z), digits, '.', '-' or '_', and not "." or "..".
[[nodiscard]] constexpr bool isPortName(std::string_view name) noexcept {
  const auto isAllowed = [](char c) {
    return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') || c == '.' ||
           c == '-' || c == '_';
  };
  return !name.empty() && name.size() <= kMaximumPortNameLength && name != "." && name != ".." &&
         std::ranges::all_of(name, isAllowed);
}

}  // namespace kestro
