// SPDX-License-Identifier: MIT
// Walking a layout over a packet: where each record lies, and the raw values in it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <exception>

#include "LogGenerator/Packets/Field.h"
#include "LogGenerator/Packets/PacketView.h"

namespace kestro {

/// Thrown for a record index at or past the count that the packet carries. The application lets it
/// end the process.
class ArrayOutOfBoundsException : public std::exception {};

/// Where places count from: the packet itself, or a record and its twin.
struct RecordPosition {
  std::size_t here = 0;
  std::size_t twin = 0;
};

/// The offset from the packet's first byte at which a place begins.
[[nodiscard]] inline std::size_t offsetOf(const Place& place, const RecordPosition& position) {
  switch (place.origin) {
    case Origin::Packet:
      return place.offset;
    case Origin::Twin:
      return position.twin + place.offset;
    case Origin::Here:
      break;
  }
  return position.here + place.offset;
}

/// The place's bits, all of them set.
[[nodiscard]] constexpr std::uint32_t maskOf(const Place& place) {
  return 0xFFFFFFFFU >> (32 - place.bitCount);
}

/// The bits of a big-endian place that begins at `offset`. Few places are: it stays out of the way
/// of the others.
[[nodiscard]] std::uint32_t readBigEndianBits(const Place& place, PacketView packet,
                                              std::size_t offset);

/// The place's bits as they stand in the packet, without regard to their sign.
[[nodiscard]] inline std::uint32_t readBits(const Place& place, PacketView packet,
                                            const RecordPosition& position) {
  const std::size_t offset = offsetOf(place, position);
  if (place.isBigEndian) [[unlikely]]
    return readBigEndianBits(place, packet, offset);
  return packet.word(offset) >> place.firstBit & maskOf(place);
}

/// The bits as a number, signed where the place is.
[[nodiscard]] inline std::int64_t numberFromBits(const Place& place, std::uint32_t bits) {
  if (!place.isSigned) return bits;
  const unsigned unused = 32U - place.bitCount;
  return static_cast<std::int32_t>(bits << unused) >> unused;
}

[[nodiscard]] inline std::int64_t readNumber(const Place& place, PacketView packet,
                                             const RecordPosition& position) {
  return numberFromBits(place, readBits(place, packet, position));
}

[[nodiscard]] inline bool holds(const Condition& condition, PacketView packet,
                                const RecordPosition& position) {
  if (condition.isAlways()) return true;
  const std::int64_t number = readNumber(condition.place, packet, position);
  return number >= condition.lowest && number <= condition.highest;
}

/// How many records of the table a packet says that it has.
[[nodiscard]] inline std::size_t recordCount(const RecordTable& table, PacketView packet) {
  return static_cast<std::size_t>(readBits(table.count, packet, {})) + table.countAddend;
}

/// Where the table's record 0 lies.
[[nodiscard]] inline RecordPosition firstRecord(const RecordTable& table, PacketView packet) {
  if (table.perCount == 0 && table.twinPerCount == 0) {
    return {.here = table.base, .twin = table.twinBase};
  }
  const std::size_t counted = readBits(table.counted, packet, {});
  return {.here = table.base + table.perCount * counted,
          .twin = table.twinBase + table.twinPerCount * counted};
}

/// The index from which on a record is an error.
[[nodiscard]] inline std::size_t recordBound(const RecordTable& table, PacketView packet) {
  if (!table.isBounded) return SIZE_MAX;
  return std::size_t{readBits(table.boundsCount, packet, {})} + table.countAddend;
}

/// Where record `index` lies, whether or not the packet reaches that far. Throws
/// ArrayOutOfBoundsException when the table is bounded and the index is not below its bounds count.
[[nodiscard]] RecordPosition recordAt(const RecordTable& table, PacketView packet,
                                      std::size_t index);

/// Calls `visit(index, position)` for every record that the table keeps, in packet order.
template <class Visit>
void forEachRecord(const RecordTable& table, PacketView packet, Visit&& visit) {
  const std::size_t count = recordCount(table, packet);
  const std::size_t bound = recordBound(table, packet);
  if (table.keepsNone && count <= bound) return;
  RecordPosition position = firstRecord(table, packet);
  for (std::size_t index = 0; index < count; ++index) {
    if (index >= bound) throw ArrayOutOfBoundsException();
    if (!table.keepsNone && holds(table.keep, packet, position)) visit(index, position);
    position.here += table.stride;
    position.twin += table.twinStride;
  }
}

}  // namespace kestro
