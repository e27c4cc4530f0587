// SPDX-License-Identifier: MIT
// Byte strings, and the integers in them: the program reads them all by the functions below.
#pragma once

#include <bit>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <span>
#include <vector>

namespace kestro {

/// Owned bytes.
using Bytes = std::vector<std::uint8_t>;

/// Borrowed bytes: valid as long as whatever owns them is neither changed nor destroyed.
using ByteView = std::span<const std::uint8_t>;

static_assert(std::endian::native == std::endian::little);

namespace detail {

/// The bytes from `offset` on, of which there are fewer than sizeof(T).
template <std::unsigned_integral T>
[[nodiscard]] constexpr T loadNearEnd(ByteView bytes, std::size_t offset) noexcept {
  T result = 0;
  for (unsigned shift = 0; offset < bytes.size(); ++offset, shift += 8) {
    result = static_cast<T>(result | static_cast<T>(static_cast<T>(bytes[offset]) << shift));
  }
  return result;
}

}  // namespace detail

/// The unsigned integer of sizeof(T) bytes that starts at `offset`, least significant byte first.
/// Bytes past the end of `bytes` read as 0; memory outside the view is never touched.
template <std::unsigned_integral T>
[[nodiscard]] inline T loadLittleEndian(ByteView bytes, std::size_t offset) noexcept {
  if (offset < bytes.size() && bytes.size() - offset >= sizeof(T)) [[likely]] {
    T result;
    std::memcpy(&result, bytes.data() + offset, sizeof(T));
    return result;
  }
  return detail::loadNearEnd<T>(bytes, offset);
}

/// Likewise, most significant byte first.
template <std::unsigned_integral T>
[[nodiscard]] inline T loadBigEndian(ByteView bytes, std::size_t offset) noexcept {
  const T swapped = loadLittleEndian<T>(bytes, offset);
  if constexpr (sizeof(T) == 1) return swapped;
  if constexpr (sizeof(T) == 2) return __builtin_bswap16(swapped);
  if constexpr (sizeof(T) == 4) return __builtin_bswap32(swapped);
  if constexpr (sizeof(T) == 8) return __builtin_bswap64(swapped);
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
