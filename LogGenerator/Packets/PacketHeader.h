// SPDX-License-Identifier: MIT
// The framing of a baseband's messages, common to all binary channels: a type byte, then a record
// header of length, log code and time, then the payload.
#pragma once

#include <cstdint>

#include "LogGenerator/Packets/PacketKind.h"
#include "LogGenerator/Packets/PacketView.h"

namespace kestro {

/// The type byte of an ordinary baseband packet and of an extra packet.
inline constexpr std::uint8_t kBasebandLogType = 1;
inline constexpr std::uint8_t kExtraLogType = 0xFF;

/// The first byte of a message that carries a 2-byte prefix in front of its packet.
inline constexpr std::uint8_t kPrefixMark = 0x81;
inline constexpr std::size_t kPrefixSize = 2;

inline constexpr std::size_t kLogTypeOffset = 0;
inline constexpr std::size_t kRecordLengthOffset = 1;  ///< 16 bits: what follows the type byte
inline constexpr std::size_t kLogCodeOffset = 3;       ///< 16 bits
inline constexpr std::size_t kRecordTimeOffset = 5;    ///< 64 bits: µs since 1970 UTC

/// The packet in a message: the message without its prefix.
[[nodiscard]] inline ByteView packetOfMessage(ByteView message) noexcept {
  const bool hasPrefix = message.size() >= kPrefixSize && message[0] == kPrefixMark;
  return hasPrefix ? message.subspan(kPrefixSize) : message;
}

[[nodiscard]] inline std::uint8_t logTypeOf(PacketView packet) noexcept {
  return packet.u8(kLogTypeOffset);
}

[[nodiscard]] constexpr bool isKnownLogType(std::uint8_t type) noexcept {
  return type == kBasebandLogType || type == kExtraLogType;
}

/// The packet's log code, with the offset of extra codes when its type says so.
[[nodiscard]] inline LogCode logCodeOf(PacketView packet) noexcept {
  const LogCode code = packet.u16(kLogCodeOffset);
  return logTypeOf(packet) == kExtraLogType ? code | kExtraCodes : code;
}

}  // namespace kestro
