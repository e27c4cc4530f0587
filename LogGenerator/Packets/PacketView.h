// SPDX-License-Identifier: MIT
// How decoders read a packet's bytes.
#pragma once

#include <cstddef>
#include <cstdint>

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
    return loadLittleEndian<std::uint32_t>(_bytes, offset);
  }
  /// The four bytes from `offset` on, the first in the high bits.
  [[nodiscard]] std::uint32_t bigEndianWord(std::size_t offset) const noexcept {
    return loadBigEndian<std::uint32_t>(_bytes, offset);
  }

  [[nodiscard]] std::uint8_t u8(std::size_t offset) const noexcept {
    return offset < _bytes.size() ? _bytes[offset] : std::uint8_t{0};
  }
  [[nodiscard]] std::uint16_t u16(std::size_t offset) const noexcept {
    return static_cast<std::uint16_t>(read(offset, 2));
  }
  [[nodiscard]] std::uint32_t u32(std::size_t offset) const noexcept { return read(offset, 4); }

 private:
  ByteView _bytes;
};

}  // namespace kestro
