// SPDX-License-Identifier: MIT
#include "Platform/Utf8.h"

#include <algorithm>
#include <cstdint>
#include <cstring>

namespace kestro {
namespace {

/// The length of the longest prefix of eight-byte words without a NUL or a byte above 127.
std::size_t plainPrefix(std::string_view text) noexcept {
  constexpr std::uint64_t kOnes = 0x0101010101010101;
  constexpr std::uint64_t kTops = 0x8080808080808080;
  std::size_t at = 0;
  for (std::uint64_t word = 0; text.size() - at >= sizeof(word); at += sizeof(word)) {
    std::memcpy(&word, text.data() + at, sizeof(word));
    const bool holdsZero = ((word - kOnes) & ~word & kTops) != 0;
    if (holdsZero || (word & kTops) != 0) break;
  }
  return at;
}

/// What the first byte of a character says: how many bytes follow, and the range of the first of
/// those (the others are 0x80 to 0xBF).
struct Lead {
  std::size_t following;
  std::uint8_t low;
  std::uint8_t high;
};

/// For a first byte above 127; `following` is 0 when no character starts so.
constexpr Lead leadOf(std::uint8_t byte) noexcept {
  if (byte >= 0xC2 && byte <= 0xDF) return {1, 0x80, 0xBF};
  if (byte == 0xE0) return {2, 0xA0, 0xBF};
  if (byte == 0xED) return {2, 0x80, 0x9F};
  if (byte >= 0xE1 && byte <= 0xEF) return {2, 0x80, 0xBF};
  if (byte == 0xF0) return {3, 0x90, 0xBF};
  if (byte >= 0xF1 && byte <= 0xF3) return {3, 0x80, 0xBF};
  if (byte == 0xF4) return {3, 0x80, 0x8F};
  return {0, 0, 0};
}

/// The size of the valid character at the start of `text`, which is not empty; 0 when there is
/// none.
std::size_t characterSize(std::string_view text) noexcept {
  const auto byteAt = [text](std::size_t i) { return static_cast<std::uint8_t>(text[i]); };
  if (byteAt(0) < 0x80) return byteAt(0) == 0 ? 0 : 1;
  const Lead lead = leadOf(byteAt(0));
  if (lead.following == 0 || text.size() <= lead.following) return 0;
  if (byteAt(1) < lead.low || byteAt(1) > lead.high) return 0;
  for (std::size_t i = 2; i <= lead.following; ++i) {
    if ((byteAt(i) & 0xC0) != 0x80) return 0;
  }
  return 1 + lead.following;
}

}  // namespace

bool isPlainAscii(std::string_view text) noexcept {
  text.remove_prefix(plainPrefix(text));
  return std::ranges::all_of(text, [](char byte) { return static_cast<signed char>(byte) > 0; });
}

std::size_t validTextPrefix(std::string_view text) noexcept {
  std::size_t at = 0;
  while (at < text.size()) {
    at += plainPrefix(text.substr(at));
    // Up to a word's worth one by one: the next plain word may start after a few other characters.
    for (std::size_t i = 0; i < sizeof(std::uint64_t) && at < text.size(); ++i) {
      const std::size_t size = characterSize(text.substr(at));
      if (size == 0) return at;
      at += size;
    }
  }
  return at;
}

}  // namespace kestro
