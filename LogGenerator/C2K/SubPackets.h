// SPDX-License-Identifier: MIT
// Packets that are made of sub-packets, each with an identifier and its own size.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "LogGenerator/Packets/Field.h"
#include "LogGenerator/Packets/PacketView.h"

namespace kestro {

inline constexpr Place kSubPacketCount = u8(14);
inline constexpr std::size_t kFirstSubPacket = 17;

// In each sub-packet.
inline constexpr Place kSubPacketId = u8(0);
inline constexpr Place kSubPacketSize = u16(2);  ///< these fields included

/// How far past the packet's end a sub-packet may reach, less one.
inline constexpr std::size_t kSubPacketOverrun = 17;

/// Where a sub-packet was found, or which one before it made the search end.
struct SubPacketSearch {
  std::optional<std::size_t> start{};  ///< from the packet's first byte
  bool endedAtBadSize = false;
  std::size_t badIndex = 0;
  std::uint16_t badSize = 0;
};

/// Looks for the first sub-packet with this identifier, and stops at one that reaches too far past
/// the packet's end. Takes at most as many steps as a packet can have sub-packets, 255, whatever
/// their sizes.
[[nodiscard]] SubPacketSearch searchSubPacket(PacketView packet, std::uint8_t id);

}  // namespace kestro
