// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Walk.h"

namespace kestro {

RecordPosition recordAt(const RecordTable& table, PacketView packet, std::size_t index) {
  if (index >= recordBound(table, packet)) throw ArrayOutOfBoundsException();
  const RecordPosition first = firstRecord(table, packet);
  return {.here = first.here + table.stride * index, .twin = first.twin + table.twinStride * index};
}

}  // namespace kestro
