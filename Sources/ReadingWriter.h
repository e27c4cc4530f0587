// SPDX-License-Identifier: MIT
// Writing a packet from the one reading that describes it.
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
      : _reading(reading), _writer(reading.code, reading.minimumLength) {}
  /// The section must read the code.
  ReadingWriter(const Section& section, LogCode code) : ReadingWriter(*readingOf(section, code)) {}

  [[nodiscard]] PacketWriter::Fields fields() { return _writer.fields(_reading.fields); }
  /// Sets the count of the table of list number `list` and returns the table. Set all counts before
  /// the first record is written.
  const RecordTable& table(std::size_t count, std::size_t list = 0) {
    const RecordTable& records = _reading.lists[list].table;
    _writer.setCount(records, count);
    return records;
  }
  [[nodiscard]] PacketWriter& writer() { return _writer; }
  /// As PacketWriter does.
  [[nodiscard]] std::optional<Bytes> finish(Moment time) { return _writer.finish(time); }

 private:
  const PacketReading& _reading;
  PacketWriter _writer;
};

}  // namespace kestro
