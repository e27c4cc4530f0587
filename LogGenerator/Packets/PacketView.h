// SPDX-License-Identifier: MIT
// The one way in which decoders read a packet's bytes.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "Platform/Bytes.h"

namespace kestro {

/// A packet's bytes, borrowed. Every read is checked: a byte past the end reads as 0, so that
/// counts may be trusted while memory is not. Offsets count from the packet's first byte, its
/// header included.
class PacketView {
 public:
  constexpr PacketView() noexcept = default;
  constexpr explicit PacketView(ByteView bytes) noexcept : _bytes(bytes) {}

  [[nodiscard]] constexpr std::size_t size() const noexcept { return _bytes.size(); }
  [[nodiscard]] constexpr ByteView bytes() const noexcept { return _bytes; }

  /// The unsigned little-endian integer of `width` bytes (1 to 4) at `offset`.
  [[nodiscard]] std::uint32_t read(std::size_t offset, unsigned width) const noexcept {
    return word(offset) & (0xFFFFFFFFU >> (32 - 8 * width));
  }

  /// The four bytes from `offset` on, the first in the low bits.
  [[nodiscard]] std::uint32_t word(std::size_t offset) const noexcept {
    static_assert(std::endian::native == std::endian::little);
    std::uint32_t bytes;
    if (offset < _bytes.size() && _bytes.size() - offset >= sizeof(bytes)) [[likely]] {
      std::memcpy(&bytes, _bytes.data() + offset, sizeof(bytes));
      return bytes;
    }
    return wordNearEnd(offset);
  }

  [[nodiscard]] std::uint8_t u8(std::size_t offset) const noexcept {
    return offset < _bytes.size() ? _bytes[offset] : std::uint8_t{0};
  }
  [[nodiscard]] std::uint16_t u16(std::size_t offset) const noexcept {
    return static_cast<std::uint16_t>(read(offset, 2));
  }
  [[nodiscard]] std::uint32_t u32(std::size_t offset) const noexcept { return read(offset, 4); }

 private:
  [[nodiscard]] std::uint32_t wordNearEnd(std::size_t offset) const noexcept {
    if (offset >= _bytes.size()) return 0;
    const std::size_t left = _bytes.size() - offset;  // at most three
    std::uint32_t bytes = _bytes[offset];
    if (left > 1) bytes |= std::uint32_t{_bytes[offset + 1]} << 8;
    if (left > 2) bytes |= std::uint32_t{_bytes[offset + 2]} << 16;
    return bytes;
  }

  ByteView _bytes;
};

}  // namespace kestro
