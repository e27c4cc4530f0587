// SPDX-License-Identifier: MIT
// Packets written byte by byte, for tests.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "LogGenerator/Packets/PacketKind.h"
#include "Platform/Bytes.h"

namespace kestro::testing {

// The extra packets, by hand.
inline constexpr LogCode kSimFilesCode = 0xFF0000;
inline constexpr LogCode kCellMonitorCode = 0xFF0001;
inline constexpr LogCode kPacketDataContextsCode = 0xFF0002;

/// A packet that begins with its header and grows with what is written. Offsets count from the
/// first byte, integers are little-endian, and what is not written is 0.
class PacketBytes {
 public:
  explicit PacketBytes(LogCode code) : _code(code), _bytes(kPacketHeaderSize, 0) {
    u8(0, code >= kExtraCodes ? 0xFF : 1).u16(3, code & 0xFFFF);
  }

  PacketBytes& u8(std::size_t offset, unsigned value) { return write(offset, 1, value); }
  PacketBytes& u16(std::size_t offset, unsigned value) { return write(offset, 2, value); }
  PacketBytes& u32(std::size_t offset, std::uint32_t value) { return write(offset, 4, value); }
  PacketBytes& append(ByteView bytes) {
    _bytes.insert(_bytes.end(), bytes.begin(), bytes.end());
    return *this;
  }
  /// Cuts the packet or pads it.
  PacketBytes& length(std::size_t size, std::uint8_t padding = 0) {
    _bytes.resize(size, padding);
    return *this;
  }

  [[nodiscard]] LogCode code() const noexcept { return _code; }
  [[nodiscard]] const Bytes& bytes() const noexcept { return _bytes; }

 private:
  PacketBytes& write(std::size_t offset, unsigned width, std::uint32_t value) {
    _bytes.resize(std::max(_bytes.size(), offset + width), 0);
    for (unsigned i = 0; i < width; ++i) {
      _bytes[offset + i] = static_cast<std::uint8_t>(value >> (8 * i));
    }
    return *this;
  }

  LogCode _code;
  Bytes _bytes;
};

[[nodiscard]] inline PacketBytes packet(LogCode code) { return PacketBytes(code); }

}  // namespace kestro::testing
