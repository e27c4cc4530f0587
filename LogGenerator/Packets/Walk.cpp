// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Walk.h"

namespace kestro {

std::uint32_t readBigEndianBits(const Place& place, PacketView packet, std::size_t offset) {
  const std::uint32_t word = packet.bigEndianWord(offset) >> (8 * (4 - place.width));
  return word >> place.firstBit & maskOf(place);
}

RecordPosition recordAt(const RecordTable& table, PacketView packet, std::size_t index) {
  if (index >= recordBound(table, packet)) throw ArrayOutOfBoundsException();
  const RecordPosition first = firstRecord(table, packet);
  return {.here = first.here + table.stride * index, .twin = first.twin + table.twinStride * index};
}

}  // namespace kestro
