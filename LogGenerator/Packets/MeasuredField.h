// SPDX-License-Identifier: MIT
// One value that a message says, and the fields that say it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/Field.h"
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
  std::uint32_t row = kNoRow;            ///< its list's row, counted from 0 as the display does

  [[nodiscard]] bool hasNumber() const noexcept { return series->group->kind != SeriesKind::Text; }
};

/// The values of a message. Their memory is kept for the next one's.
class MeasuredValues {
 public:
  [[nodiscard]] std::span<const MeasuredValue> all() const noexcept {
    return {_values.data(), _size};
  }
  [[nodiscard]] std::size_t size() const noexcept { return _size; }
  void add(const MeasuredValue& value) {
    *reserve(1) = value;
    ++_size;
  }
  /// Room for so many values behind the last one, which may hold anything. Valid until the next
  /// change.
  [[nodiscard]] MeasuredValue* reserve(std::size_t count) {
    if (_values.size() - _size < count) _values.resize(2 * (_size + count));
    return _values.data() + _size;
  }
  /// Takes `count` of the values that were written into the room, the first ones.
  void take(std::size_t count) noexcept { _size += count; }
  /// Keeps the first `size` values, of which there must be so many.
  void cut(std::size_t size) noexcept { _size = size; }

 private:
  std::vector<MeasuredValue> _values;
  std::size_t _size = 0;
};

/// Appends what the display shows of the value: "-88.50 dBm".
void writeShown(const MeasuredValue& value, TextBuffer& text);

/// The unit that a format names: what follows its number, without blanks, a multiplication sign and
/// remarks in brackets. Empty: none.
[[nodiscard]] std::string_view unitOf(const NumberFormat& format);

/// The names of a section's series, and where the display shows it.
struct SectionPlace {
  std::string technology;
  std::string section{};
  std::vector<std::string> container{};  ///< as in DisplayPath
  bool rowsAreEntries = false;           ///< as in DisplayPath
};

/// Where the display shows a key of the section.
[[nodiscard]] DisplayPath pathIn(const SectionPlace& place, std::string_view key);

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

  /// Writes what the packet says: number, text and format; `value` has no text before. False, with
  /// `value` of no use, when it says nothing: its condition fails, it says that the value is
  /// absent, or it is no number.
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

  /// Reads the raw value that the rule shows into `number`; false where the packet has none.
  [[nodiscard]] bool raw(std::int64_t& number, PacketView packet, const RecordPosition& position,
                         const NumberSupplier* supplier) const {
    if (!_isRead) return otherRaw(number, packet, position, supplier);
    number = readNumber(_place, packet, position);
    return true;
  }
  /// Whether what it reads may be negative.
  [[nodiscard]] bool isSigned() const noexcept { return _place.isSigned; }

 private:
  [[nodiscard]] bool otherRaw(std::int64_t& number, PacketView packet,
                              const RecordPosition& position, const NumberSupplier* supplier) const;
  [[nodiscard]] bool measureOther(MeasuredValue& value, PacketView packet,
                                  const RecordPosition& position,
                                  const NumberSupplier* supplier) const;
  /// The values of all places, in their order.
  [[nodiscard]] std::span<const std::int64_t> rawNumbers(
      PacketView packet, const RecordPosition& position,
      std::span<std::int64_t, Field::kMaximumPlaces> numbers) const;
  [[nodiscard]] bool measureComputed(MeasuredValue& value, PacketView packet,
                                     const RecordPosition& position) const;
  [[nodiscard]] bool measureName(MeasuredValue& value, std::int64_t raw) const;

  const Field* _field;
  Place _place;  ///< the first
  std::uint32_t _mask;
  std::uint32_t _signBit;  ///< the highest of a signed place; else 0
  double _scale;
  double _offset;
  bool _isRead;       ///< the first place alone is the raw value, in every packet
  bool _isQuick;      ///< the number follows from the first place's bits alone, as in BoundField
  bool _isOfNumbers;  ///< all names are numbers of one unit
};

}  // namespace kestro
