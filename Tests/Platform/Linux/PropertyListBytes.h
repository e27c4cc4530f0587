// SPDX-License-Identifier: MIT
// Property lists written out by hand.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"

namespace kestro {

/// The bytes of a literal, NULs and all, without the one at its end.
template <std::size_t Size>
[[nodiscard]] Bytes bytesOf(const char (&literal)[Size]) {
  return Bytes(literal, literal + Size - 1);
}

[[nodiscard]] inline Bytes bytesOf(const std::string& text) { return {text.begin(), text.end()}; }

[[nodiscard]] inline std::string textOf(ByteView bytes) { return {bytes.begin(), bytes.end()}; }

/// `value` in `width` bytes, most significant first.
[[nodiscard]] inline Bytes bigEndian(std::uint64_t value, std::size_t width) {
  Bytes result;
  for (std::size_t i = width; i > 0; --i) {
    const std::size_t shift = 8 * (i - 1);
    result.push_back(static_cast<std::uint8_t>(shift < 64 ? value >> shift : 0));
  }
  return result;
}

/// A binary list: header, objects, offset table, trailer. What a test does not set is in order.
struct BinaryList {
  std::vector<Bytes> objects = {};
  std::uint64_t root = 0;
  std::uint8_t offsetWidth = 2;
  std::uint8_t referenceWidth = 1;

  [[nodiscard]] Bytes bytes() const {
    Bytes result = bytesOf("bplist00");
    Bytes offsets;
    for (const Bytes& object : objects) {
      append(offsets, bigEndian(result.size(), offsetWidth));
      append(result, object);
    }
    const std::size_t offsetTable = result.size();
    append(result, offsets);
    append(result, {0, 0, 0, 0, 0, 0, offsetWidth, referenceWidth});
    append(result, bigEndian(objects.size(), 8));
    append(result, bigEndian(root, 8));
    append(result, bigEndian(offsetTable, 8));
    return result;
  }

  static void append(Bytes& bytes, const Bytes& more) {
    bytes.insert(bytes.end(), more.begin(), more.end());
  }
};

/// A whole XML list around the elements of one value.
[[nodiscard]] inline Bytes xmlList(std::string_view elements) {
  std::string result = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<plist version=\"1.0\">\n";
  result.append(elements).append("\n</plist>\n");
  return bytesOf(result);
}

/// An ASCII text in UTF-16, least significant byte first, behind its byte-order mark.
[[nodiscard]] inline Bytes utf16(std::string_view text) {
  Bytes result = {0xFF, 0xFE};
  for (const char character : text) {
    result.push_back(static_cast<std::uint8_t>(character));
    result.push_back(0);
  }
  return result;
}

/// `text`, `count` times.
[[nodiscard]] inline std::string repeated(std::string_view text, std::size_t count) {
  std::string result;
  result.reserve(text.size() * count);
  for (std::size_t i = 0; i < count; ++i) result += text;
  return result;
}

}  // namespace kestro
