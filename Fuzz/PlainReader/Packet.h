// SPDX-License-Identifier: MIT
// A packet read by hand: integers at byte offsets, and texts through printf.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "Platform/Bytes.h"

namespace kestro::plain {

/// A packet's bytes, borrowed. Bytes past its end read as 0, so that what a count places there is
/// defined. Offsets count from the packet's first byte; integers are little-endian.
class Packet {
 public:
  explicit Packet(ByteView bytes) : _bytes(bytes) {}

  [[nodiscard]] std::size_t size() const { return _bytes.size(); }

  [[nodiscard]] int byte(std::size_t offset) const {
    return offset < _bytes.size() ? _bytes[offset] : 0;
  }
  [[nodiscard]] int signedByte(std::size_t offset) const {
    return byte(offset) < 128 ? byte(offset) : byte(offset) - 256;
  }
  [[nodiscard]] int half(std::size_t offset) const { return byte(offset) + 256 * byte(offset + 1); }
  [[nodiscard]] int signedHalf(std::size_t offset) const {
    return half(offset) < 32768 ? half(offset) : half(offset) - 65536;
  }
  [[nodiscard]] std::uint32_t word(std::size_t offset) const {
    return static_cast<std::uint32_t>(half(offset)) +
           65536U * static_cast<std::uint32_t>(half(offset + 2));
  }
  /// The word as "%d" shows it: negative from 2^31 on.
  [[nodiscard]] std::int32_t signedWord(std::size_t offset) const {
    return static_cast<std::int32_t>(word(offset));
  }

  /// What follows the header, where extra packets carry a property list.
  [[nodiscard]] ByteView payload() const {
    return _bytes.size() < 13 ? ByteView() : _bytes.subspan(13);
  }

 private:
  ByteView _bytes;
};

/// What printf prints, of at most 511 bytes.
[[gnu::format(printf, 1, 2)]] std::string text(const char* format, ...);

}  // namespace kestro::plain
