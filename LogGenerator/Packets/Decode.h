// SPDX-License-Identifier: MIT
// The two engines that turn packets into display values by their layouts: one fills a dictionary,
// one builds the rows of a record table.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <span>
#include <vector>

#include "LogGenerator/Packets/PlacedKey.h"
#include "LogGenerator/Packets/Section.h"
#include "LogGenerator/Packets/Texts.h"
#include "LogGenerator/Packets/Walk.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// Knows the values of fields that are not read from the packet (`supplied()`).
class FieldSupplier {
 public:
  virtual ~FieldSupplier() = default;

  /// The value of such a field of the record at `position`; null leaves its key out.
  [[nodiscard]] virtual Value supply(const Field& field, PacketView packet,
                                     const RecordPosition& position) const = 0;
};

/// A field made ready for use: its texts are at hand. The layout must outlive it.
class BoundField {
 public:
  explicit BoundField(const Field& field);

  [[nodiscard]] const Field& field() const noexcept { return *_field; }
  [[nodiscard]] bool isSupplied() const noexcept {
    return _field->text.kind == TextRule::Kind::Supplied;
  }

  /// What the field shows; null when its condition fails and it has no other text, or when it is a
  /// supplied one.
  [[nodiscard]] Value value(PacketView packet, const RecordPosition& position) const {
    Value shown;
    static_cast<void>(write(shown, packet, position, nullptr));
    return shown;
  }

  /// Writes what the field shows over `shown`. False, with `shown` as it was, when that is nothing:
  /// its condition fails and it has no other text, or the supplier (which may be null) has none.
  [[nodiscard, gnu::always_inline]] bool write(Value& shown, PacketView packet,
                                               const RecordPosition& position,
                                               const FieldSupplier* supplier) const {
    if (!_isQuick) return writeOther(shown, packet, position, supplier);
    const std::uint32_t bits =
        packet.word(position.here + _place.offset) >> _place.firstBit & _mask;
    if (bits < TextCache::kSize) [[likely]] {
      shown = _cache->text(bits);
    } else {
      shown = wideText(bits);
    }
    return true;
  }

 private:
  [[nodiscard]] bool writeOther(Value& shown, PacketView packet, const RecordPosition& position,
                                const FieldSupplier* supplier) const;
  [[nodiscard]] bool writeSupplied(Value& shown, PacketView packet, const RecordPosition& position,
                                   const FieldSupplier* supplier) const;
  [[nodiscard]] bool writeOtherwise(Value& shown) const;
  void writeNumber(Value& shown, std::int64_t number) const;
  [[nodiscard]] Value wideText(std::uint32_t bits) const;

  const Field* _field;
  TextCache* _cache;
  std::uint32_t _mask;  ///< of the first place's bits, once they are shifted down
  Place _place;         ///< the first
  /// Whether the texts of the first place's bits are all there is to know, and it is a common one:
  /// of the record, little-endian, under no condition.
  bool _isQuick;
};

/// The shown fields of a layout, ready for use.
class BoundFields {
 public:
  explicit BoundFields(std::span<const Field> fields);
  BoundFields(BoundFields&&) noexcept = default;
  BoundFields& operator=(BoundFields&&) noexcept = default;
  BoundFields(const BoundFields&) = delete;  // _allKeys points into the map
  BoundFields& operator=(const BoundFields&) = delete;
  ~BoundFields() = default;

  [[nodiscard]] std::span<const BoundField> fields() const noexcept { return _fields; }

  /// Writes every field into `dictionary` in the layout's order; keys that are there keep their
  /// place. A null handle is left alone, and so are keys of supplied fields.
  void fill(Dictionary& dictionary, PacketView packet);

  /// Makes `row` a dictionary of the fields that are shown. Rows with the same fields share their
  /// keys. An earlier row that nobody else refers to is written anew in its place. Without a
  /// supplier the keys of supplied fields are left out.
  void makeRow(Value& row, PacketView packet, const RecordPosition& position,
               const FieldSupplier* supplier);

 private:
  using Presence = std::uint64_t;

  /// Writes over the values of a row that shows every field. False when one is not shown this time:
  /// what the row holds is of no more use then.
  bool rewrite(std::span<Value> values, PacketView packet, const RecordPosition& position,
               const FieldSupplier* supplier) const;
  /// Collects the values of the fields that are shown, and says which they are.
  Presence readValues(PacketView packet, const RecordPosition& position,
                      const FieldSupplier* supplier);
  const KeyList& keysOf(Presence present);

  std::vector<BoundField> _fields;
  std::vector<PlacedKey> _keys;  ///< of the fields, in their order
  std::vector<Value> _values;    ///< of the row that is being made
  std::map<Presence, KeyList> _keyLists;
  const KeyList* _allKeys = nullptr;  ///< the list of a row that shows every field
};

/// A record table, ready for use.
class BoundTable {
 public:
  explicit BoundTable(const ListReading& reading)
      : _reading(&reading), _key(reading.key), _fields(reading.table.fields) {}

  [[nodiscard]] const ListReading& reading() const noexcept { return *_reading; }
  /// The reading's key as a value.
  [[nodiscard]] const Value& key() const noexcept { return _key; }

  /// One row (or plain text) for each record that the table keeps, in packet order. The rows of an
  /// earlier packet may be given away for use. Throws ArrayOutOfBoundsException as `recordAt` does.
  [[nodiscard]] std::vector<Value> rows(PacketView packet, std::vector<Value> earlierRows = {},
                                        const FieldSupplier* supplier = nullptr);

  /// Rows that stand in no display, kept for the next packet to write anew.
  std::vector<Value> spareRows;

 private:
  const ListReading* _reading;
  Value _key;
  BoundFields _fields;
};

/// Everything that a section reads from one packet, ready for use.
struct BoundReading {
  explicit BoundReading(const PacketReading& packetReading);

  const PacketReading* reading;
  BoundFields fields;
  std::vector<BoundTable> tables;
};

}  // namespace kestro
