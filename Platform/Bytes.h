// SPDX-License-Identifier: MIT
// Byte strings, and little-endian integers in them.
#pragma once

#include <concepts>
#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace kestro {

/// Owned bytes.
using Bytes = std::vector<std::uint8_t>;

/// Borrowed bytes: valid as long as whatever owns them is neither changed nor destroyed.
using ByteView = std::span<const std::uint8_t>;

/// The unsigned integer of sizeof(T) bytes that starts at `offset`, least significant byte first.
/// Bytes past the end of `bytes` read as 0; memory outside the view is never touched.
template <std::unsigned_integral T>
[[nodiscard]] constexpr T loadLittleEndian(ByteView bytes, std::size_t offset) noexcept {
  T result = 0;
  for (std::size_t i = 0; i < sizeof(T); ++i) {
    if (offset >= bytes.size() || i >= bytes.size() - offset) break;
    result = static_cast<T>(result | static_cast<T>(static_cast<T>(bytes[offset + i]) << (8 * i)));
  }
  return result;
}

/// Appends `value` to `bytes` as sizeof(T) bytes, least significant byte first.
template <std::unsigned_integral T>
constexpr void appendLittleEndian(Bytes& bytes, T value) {
  for (std::size_t i = 0; i < sizeof(T); ++i) {
    bytes.push_back(static_cast<std::uint8_t>(value >> (8 * i)));
  }
}

/// Overwrites the sizeof(T) bytes at `offset` with `value`, least significant byte first.
/// The bytes must exist.
template <std::unsigned_integral T>
constexpr void storeLittleEndian(std::span<std::uint8_t> bytes, std::size_t offset, T value) {
  for (std::size_t i = 0; i < sizeof(T); ++i) {
    bytes[offset + i] = static_cast<std::uint8_t>(value >> (8 * i));
  }
}

}  // namespace kestro
