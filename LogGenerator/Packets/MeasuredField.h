// SPDX-License-Identifier: MIT
// One value that a message says, and the fields that say it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
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
using MeasuredValues = std::vector<MeasuredValue>;

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

}  // namespace kestro
