// SPDX-License-Identifier: MIT
// Writing a packet from the readings that describe it.
#pragma once

#include <cstddef>
#include <optional>

#include "LogGenerator/Packets/Encode.h"

namespace kestro {

/// A packet that is being written. It is at least as long as the reading's minimum.
class ReadingWriter {
 public:
  /// `reading` must be a constant.
  explicit ReadingWriter(const PacketReading& reading)
      : _reading(reading), _writer(reading.packet) {}
  /// The section must read the packet.
  ReadingWriter(const Section& section, const PacketKind& packet)
      : ReadingWriter(*readingOf(section, packet.code)) {}

  [[nodiscard]] PacketWriter::Fields fields() { return _writer.fields(_reading.fields); }
  /// The fields that another section, which must read the packet, too, takes from it.
  [[nodiscard]] PacketWriter::Fields fieldsOf(const Section& section) {
    return _writer.fields(readingIn(section).fields);
  }

  /// Sets the count of the table of list number `list` and returns the table. Set all counts before
  /// the first record is written.
  const RecordTable& table(std::size_t count, std::size_t list = 0) {
    return counted(_reading.lists[list].table, count);
  }
  /// Likewise the table that another section, which must read the packet, too, takes from it.
  const RecordTable& tableOf(const Section& section, std::size_t count) {
    return counted(readingIn(section).lists.front().table, count);
  }

  [[nodiscard]] PacketWriter& writer() { return _writer; }
  /// As PacketWriter does.
  [[nodiscard]] std::optional<Bytes> finish(Moment time) { return _writer.finish(time); }

 private:
  [[nodiscard]] const PacketReading& readingIn(const Section& section) const {
    return *readingOf(section, _reading.packet.code);
  }
  const RecordTable& counted(const RecordTable& records, std::size_t count) {
    _writer.setCount(records, count);
    return records;
  }

  const PacketReading& _reading;
  PacketWriter _writer;
};

}  // namespace kestro
