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
    if (offset < _bytes.size() && _bytes.size() - offset >= sizeof(std::uint32_t)) {
      std::uint32_t word;
      static_assert(std::endian::native == std::endian::little);
      std::memcpy(&word, _bytes.data() + offset, sizeof(word));
      return width == sizeof(word) ? word : word & ((1U << (8 * width)) - 1);
    }
    return readNearEnd(offset, width);
  }

  [[nodiscard]] std::uint8_t u8(std::size_t offset) const noexcept {
    return offset < _bytes.size() ? _bytes[offset] : std::uint8_t{0};
  }
  [[nodiscard]] std::uint16_t u16(std::size_t offset) const noexcept {
    return static_cast<std::uint16_t>(read(offset, 2));
  }
  [[nodiscard]] std::uint32_t u32(std::size_t offset) const noexcept { return read(offset, 4); }

 private:
  [[nodiscard]] std::uint32_t readNearEnd(std::size_t offset, unsigned width) const noexcept {
    std::uint32_t word = 0;
    for (unsigned i = 0; i < width; ++i) {
      word |= static_cast<std::uint32_t>(u8(offset + i)) << (8 * i);
    }
    return word;
  }

  ByteView _bytes;
};

}  // namespace kestro
