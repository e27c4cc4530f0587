// SPDX-License-Identifier: MIT
// What a packet is: its code, its name and its least length, said once for each packet. Decoders
// and the sources that send packets refer to the same constant.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace kestro {

/// A log code: 16 bits, or for an extra packet 16 bits plus 0xFF0000.
using LogCode = std::uint32_t;

inline constexpr LogCode kExtraCodes = 0xFF0000;

/// The bytes at the start of every packet, before its payload.
inline constexpr std::size_t kPacketHeaderSize = 13;

/// One packet of a technology. Its constant stands in the header of the packet's decoder.
struct PacketKind {
  LogCode code = 0;
  std::string_view name{};        ///< what the packet is, for people; empty: nobody knows
  std::size_t minimumLength = 0;  ///< bytes, header included; 0: whatever has a header will do
};

}  // namespace kestro
