// SPDX-License-Identifier: MIT
// What every harness is made of.
#pragma once

#include <fmt/format.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include "Platform/Bytes.h"

namespace kestro::fuzz {

/// The harness: each of them defines it. A promise that does not hold ends the process.
void tryInput(ByteView bytes);

/// Ends the process unless the promise holds.
inline void require(bool holds, std::string_view promise) {
  if (holds) return;
  fmt::print(stderr, "broken promise: {}\n", promise);
  std::abort();
}

/// Takes an input apart from its front. Beyond its end bytes are 0 and pieces empty.
class Input {
 public:
  explicit Input(ByteView bytes) : _rest(bytes) {}

  [[nodiscard]] bool isAtEnd() const noexcept { return _rest.empty(); }

  [[nodiscard]] std::uint8_t byte() {
    const ByteView piece = bytes(1);
    return piece.empty() ? std::uint8_t{0} : piece.front();
  }
  [[nodiscard]] std::uint16_t number16() {
    const unsigned low = byte();
    return static_cast<std::uint16_t>(low | unsigned{byte()} << 8);
  }
  /// At most `count` bytes.
  [[nodiscard]] ByteView bytes(std::size_t count) {
    const ByteView piece = _rest.first(std::min(count, _rest.size()));
    _rest = _rest.subspan(piece.size());
    return piece;
  }
  [[nodiscard]] ByteView rest() { return bytes(_rest.size()); }

 private:
  ByteView _rest;
};

}  // namespace kestro::fuzz
