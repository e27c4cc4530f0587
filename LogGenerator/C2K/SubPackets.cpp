// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/SubPackets.h"

#include "LogGenerator/Packets/Walk.h"

namespace kestro {

SubPacketSearch searchSubPacket(PacketView packet, std::uint8_t id) {
  const std::size_t count = readBits(kSubPacketCount, packet, {});
  std::size_t start = kFirstSubPacket;
  for (std::size_t index = 0; index < count; ++index) {
    const RecordPosition position{.here = start};
    const std::size_t size = readBits(kSubPacketSize, packet, position);
    const std::size_t next = start + size;
    if (next >= packet.size() + kSubPacketOverrun) {
      return {
          .endedAtBadSize = true, .badIndex = index, .badSize = static_cast<std::uint16_t>(size)};
    }
    if (readBits(kSubPacketId, packet, position) == id) return {.start = start};
    start = next;
  }
  return {};
}

}  // namespace kestro
