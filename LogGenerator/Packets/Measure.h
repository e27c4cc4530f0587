// SPDX-License-Identifier: MIT
// What a packet says as typed values, straight from its bytes: no texts are made, nothing is
// displayed, and nothing is shared, so that several threads can measure several recordings.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/Packets/Section.h"
#include "LogGenerator/Packets/Series.h"
#include "LogGenerator/Packets/Walk.h"

namespace kestro {

/// One value that a message says.
struct MeasuredValue {
  static constexpr std::uint32_t kNoRow = UINT32_MAX;

  const Series* series = nullptr;  ///< never null
  double number = 0;               ///< finite: a number's, or what a state stands for; else unused
  /// What is shown of a state, of a text, or of a number that has a name ("20 MHz"). Empty where
  /// `format` shows the number. Valid until the next message.
  std::string_view text{};
  const NumberFormat* format = nullptr;  ///< null where `text` is all; a constant
  std::uint32_t row = kNoRow;            ///< the row of its list, counted as the display has them

  [[nodiscard]] bool hasNumber() const noexcept { return series->group->kind != SeriesKind::Text; }
};
using MeasuredValues = std::vector<MeasuredValue>;

/// Appends what the display shows of the value: "-88.50 dBm".
void writeShown(const MeasuredValue& value, TextBuffer& text);

/// The unit that a format names: what follows its number, without blanks, a multiplication sign and
/// remarks in brackets. Empty: none.
[[nodiscard]] std::string_view unitOf(const NumberFormat& format);

/// The names of a section's series, and where the display shows it.
struct SectionPlace {
  std::string technology;
  std::string section;
  std::vector<std::string> container{};  ///< as in DisplayPath
};

/// Knows the values of fields that are not read from the packet (`supplied()`).
class NumberSupplier {
 public:
  virtual ~NumberSupplier() = default;

  /// The number of such a field of the record at `position`; nothing when it is not known.
  [[nodiscard]] virtual std::optional<std::int64_t> supply(
      const Field& field, PacketView packet, const RecordPosition& position) const = 0;
};

/// A field made ready for measuring. The layout must outlive it.
class MeasuredField {
 public:
  explicit MeasuredField(const Field& field);

  /// What the series of the field's values have in common.
  [[nodiscard]] SeriesGroup group(const SectionPlace& place) const;

  /// Writes what the packet says: number, text and format. False, with `value` of no use, when it
  /// says nothing: its condition fails, it says that the value is absent, or it is no number.
  [[nodiscard, gnu::always_inline]] bool measure(MeasuredValue& value, PacketView packet,
                                                 const RecordPosition& position,
                                                 const NumberSupplier* supplier) const {
    if (!_isQuick) return measureOther(value, packet, position, supplier);
    const std::uint32_t bits =
        packet.word(position.here + _place.offset) >> _place.firstBit & _mask;
    const auto raw = static_cast<std::int64_t>(bits ^ _signBit) - _signBit;
    value.number = static_cast<double>(raw) * _scale + _offset;
    value.format = &_field->text.format;
    return true;
  }

  /// The raw value that the rule shows; nothing where the packet has none.
  [[nodiscard]] std::optional<std::int64_t> raw(PacketView packet, const RecordPosition& position,
                                                const NumberSupplier* supplier) const;

 private:
  [[nodiscard]] bool measureOther(MeasuredValue& value, PacketView packet,
                                  const RecordPosition& position,
                                  const NumberSupplier* supplier) const;
  [[nodiscard]] bool measureComputed(MeasuredValue& value, PacketView packet,
                                     const RecordPosition& position) const;
  [[nodiscard]] bool measureName(MeasuredValue& value, std::int64_t raw) const;

  const Field* _field;
  Place _place;  ///< the first
  std::uint32_t _mask;
  std::uint32_t _signBit;  ///< the highest of a signed place; else 0
  double _scale;
  double _offset;
  bool _isQuick;      ///< the number follows from the first place's bits alone, as in BoundField
  bool _isOfNumbers;  ///< all names are numbers of one unit
  std::string_view _unit;
};

/// The measured fields of a layout. An array's elements are fields of their own.
class MeasuredFields {
 public:
  /// `place.section` already names the list that the fields are the rows of.
  MeasuredFields(std::span<const Field> fields, const SectionPlace& place, SeriesTable& series);

  [[nodiscard]] std::span<const MeasuredField> fields() const noexcept { return _fields; }
  /// In the order of the fields; null for one that is not measured.
  [[nodiscard]] std::span<const SeriesGroup* const> groups() const noexcept { return _groups; }
  [[nodiscard]] std::vector<const Series*> seriesOf(const Item* item) const;

  /// Appends what the packet says under these series, which `seriesOf` gave.
  void measure(PacketView packet, const RecordPosition& position,
               std::span<const Series* const> series, std::uint32_t row,
               const NumberSupplier* supplier, MeasuredValues& values) const;

 private:
  void addElements(const Field& field, const SectionPlace& place);

  SeriesTable& _table;
  std::deque<Field> _elements;  ///< of arrays, each as a field
  std::vector<MeasuredField> _fields;
  std::vector<const SeriesGroup*> _groups;
};

/// A record table made ready for measuring.
class MeasuredTable {
 public:
  MeasuredTable(const ListReading& list, const SectionPlace& section, SeriesTable& series);

  /// Appends what the rows of the packet say. Nothing when a record lies past the table's bound.
  void measure(PacketView packet, const NumberSupplier* supplier, MeasuredValues& values);

 private:
  /// The raw values of the fields that identify a record, those that it has.
  struct Identity {
    std::array<std::int64_t, RecordTable::kMaximumIdentity> numbers{};
    std::uint32_t present = 0;
    bool operator==(const Identity&) const = default;
  };
  struct IdentityHash {
    std::size_t operator()(const Identity& identity) const noexcept;
  };
  /// The series of one record; and of the second, third … that looks the same in one packet.
  struct KnownRow {
    std::vector<const Series*> series;
    std::vector<KnownRow> others{};
    std::uint64_t packet = 0;  ///< the number of the last packet that had it
    std::size_t count = 0;     ///< how often that one had it
  };
  struct LastRow {
    Identity identity;
    KnownRow* row;
  };

  [[nodiscard]] Identity identityOf(std::size_t row, PacketView packet,
                                    const RecordPosition& position,
                                    const NumberSupplier* supplier) const;
  [[nodiscard]] const std::vector<const Series*>& seriesOf(std::size_t row,
                                                           const Identity& identity);
  [[nodiscard]] KnownRow& knownRow(std::size_t row, const Identity& identity);
  [[nodiscard]] Item itemOf(const Identity& identity, std::size_t occurrence) const;

  const ListReading& _list;
  SeriesTable& _table;
  MeasuredFields _fields;
  std::vector<MeasuredField> _identity;
  std::unordered_map<Identity, KnownRow, IdentityHash> _rows;
  std::vector<LastRow> _lastRows;  ///< by their position
  KnownRow _full;                  ///< the series of all rows for which there is no more room
  std::uint64_t _packet = 0;
};

/// Everything that a section reads from one packet, made ready for measuring.
class MeasuredReading {
 public:
  MeasuredReading(const PacketReading& reading, const SectionPlace& section, SeriesTable& series);

  [[nodiscard]] const PacketKind& packet() const noexcept { return _packet; }
  void measure(PacketView packet, const NumberSupplier* supplier, MeasuredValues& values);

 private:
  const PacketKind& _packet;
  MeasuredFields _fields;
  std::vector<const Series*> _series;  ///< of the fields
  std::deque<MeasuredTable> _tables;
};

}  // namespace kestro
