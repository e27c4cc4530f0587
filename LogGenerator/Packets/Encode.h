// SPDX-License-Identifier: MIT
// Writing packets through the tables that decode them.
#pragma once

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <optional>
#include <span>
#include <string_view>

#include "LogGenerator/Packets/Section.h"
#include "LogGenerator/Packets/Walk.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// The raw value for which a rule shows the number nearest to `number` (rules of whole or scaled
/// numbers), and the one for which it shows `text` (a table's row, or the absent value); absent
/// when there is none.
[[nodiscard]] std::optional<std::int64_t> rawForNumber(const TextRule& rule, double number);
[[nodiscard]] std::optional<std::int64_t> rawForText(const TextRule& rule, std::string_view text);

/// Composes one packet. Whatever is not set stays 0. A key that the layout does not have, or a
/// value that its bits cannot carry, spoils the packet: `finish` then yields nothing.
class PacketWriter {
 public:
  /// A packet of its kind's least length; it grows with what is written.
  explicit PacketWriter(const PacketKind& packet)
      : PacketWriter(packet.code, packet.minimumLength) {}
  /// A packet of at least `length` bytes, header included.
  PacketWriter(LogCode code, std::size_t length);

  /// Writes fields of one layout, of the packet or of a record.
  class Fields {
   public:
    /// The raw values of the key's places, in the field's order.
    Fields& raw(std::string_view key, std::initializer_list<std::int64_t> values);
    Fields& raw(std::string_view key, std::span<const std::int64_t> values);
    Fields& raw(std::string_view key, std::int64_t value) { return raw(key, {value}); }
    /// The number as it is to be shown, to the nearest that the packet can carry.
    Fields& number(std::string_view key, double value);
    /// The text as it is to be shown: a name of the rule's table, or its text for an absent value.
    Fields& text(std::string_view key, std::string_view value);

   private:
    friend class PacketWriter;
    Fields(PacketWriter& writer, std::span<const Field> fields, const RecordPosition& position)
        : _writer(writer), _fields(fields), _position(position) {}
    [[nodiscard]] const Field* find(std::string_view key);
    Fields& put(std::string_view key, const std::optional<std::int64_t>& value);

    PacketWriter& _writer;
    std::span<const Field> _fields;
    RecordPosition _position;
  };

  [[nodiscard]] Fields fields(std::span<const Field> fields) { return {*this, fields, {}}; }
  /// The fields of a layout that counts from somewhere else, a sub-packet for instance.
  [[nodiscard]] Fields fieldsAt(std::span<const Field> fields, const RecordPosition& position) {
    return {*this, fields, position};
  }

  /// Sets how many records a table has. Do it for all tables of a packet before writing records:
  /// their places depend on the counts.
  void setCount(const RecordTable& table, std::size_t count);
  /// The fields of record `index`, which must be below the count. In a spoilt packet, whose count
  /// may be missing, any index will do.
  [[nodiscard]] Fields record(const RecordTable& table, std::size_t index);

  /// Writes a value that no layout names.
  void put(const Place& place, const RecordPosition& position, std::int64_t value);

  /// Appends bytes at the end, for payloads that are no layout.
  void append(ByteView bytes);

  /// The packet with its header: the log type, the length of what follows the type byte, the log
  /// code and the time in µs since 1970 UTC. Absent when something could not be carried.
  [[nodiscard]] std::optional<Bytes> finish(Moment time);

 private:
  LogCode _code;
  Bytes _bytes;
  bool _isSpoilt = false;
};

}  // namespace kestro
