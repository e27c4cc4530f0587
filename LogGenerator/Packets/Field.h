// SPDX-License-Identifier: MIT
// A packet's layout as data: where a value is read, how it is shown, and under which key.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

#include "LogGenerator/Packets/NumberFormat.h"

namespace kestro {

/// What a place's offset counts from.
enum class Origin : std::uint8_t {
  Here,    ///< the record of a table, or the packet where there is no table
  Packet,  ///< the packet's first byte, also from within a record
  Twin,    ///< the record with the same index in the table's twin
};

/// Bits `firstBit` to `firstBit + bitCount - 1`, counted from the least significant, of the integer
/// of `width` bytes at `offset`. Little-endian and unsigned unless said otherwise.
struct Place {
  std::uint16_t offset = 0;
  std::uint8_t width = 1;
  std::uint8_t firstBit = 0;
  std::uint8_t bitCount = 8;
  Origin origin = Origin::Here;
  bool isSigned = false;
  bool isBigEndian = false;
  bool isShared = false;

  /// Only the bits `first` to `last` of the integer.
  [[nodiscard]] constexpr Place bits(unsigned first, unsigned last) const {
    Place place = *this;
    place.firstBit = static_cast<std::uint8_t>(first);
    place.bitCount = static_cast<std::uint8_t>(last - first + 1);
    return place;
  }
  [[nodiscard]] constexpr Place bit(unsigned number) const { return bits(number, number); }
  /// The most significant byte comes first.
  [[nodiscard]] constexpr Place bigEndian() const {
    Place place = *this;
    place.isBigEndian = true;
    return place;
  }
  [[nodiscard]] constexpr Place ofPacket() const {
    Place place = *this;
    place.origin = Origin::Packet;
    return place;
  }
  [[nodiscard]] constexpr Place ofTwin() const {
    Place place = *this;
    place.origin = Origin::Twin;
    return place;
  }
  /// Declares that another field of the same layout may read the same bits.
  [[nodiscard]] constexpr Place shared() const {
    Place place = *this;
    place.isShared = true;
    return place;
  }

  bool operator==(const Place&) const = default;
};

[[nodiscard]] constexpr Place integerAt(unsigned offset, unsigned width, bool isSigned) {
  return {.offset = static_cast<std::uint16_t>(offset),
          .width = static_cast<std::uint8_t>(width),
          .bitCount = static_cast<std::uint8_t>(8 * width),
          .isSigned = isSigned};
}
[[nodiscard]] constexpr Place u8(unsigned offset) { return integerAt(offset, 1, false); }
[[nodiscard]] constexpr Place u16(unsigned offset) { return integerAt(offset, 2, false); }
[[nodiscard]] constexpr Place u24(unsigned offset) { return integerAt(offset, 3, false); }
[[nodiscard]] constexpr Place u32(unsigned offset) { return integerAt(offset, 4, false); }
[[nodiscard]] constexpr Place s8(unsigned offset) { return integerAt(offset, 1, true); }
[[nodiscard]] constexpr Place s16(unsigned offset) { return integerAt(offset, 2, true); }
[[nodiscard]] constexpr Place s32(unsigned offset) { return integerAt(offset, 4, true); }

/// A value and the text that stands for it.
struct NamedValue {
  std::int64_t value;
  std::string_view text;

  bool operator==(const NamedValue&) const = default;
};

/// The rows of a table of such values, borrowed. Two are equal when their rows are.
struct NamedValues : std::span<const NamedValue> {
  // The check takes the inherited constructors for a written one.
  using std::span<const NamedValue>::span;  // NOLINT(modernize-use-equals-default)

  friend constexpr bool operator==(const NamedValues& left, const NamedValues& right) {
    return std::ranges::equal(left, right);
  }
};

/// A number computed from raw values, and how it is shown.
struct ComputedValue {
  double number;
  const NumberFormat* format;  ///< a constant
  /// Whether there is no such value: the text says so, and the number is another.
  bool isAbsent = false;
};

/// What several raw values make, in the order of the field's places.
using ComputeValue = ComputedValue (*)(std::span<const std::int64_t> raw);

/// The number that several raw values make, in the order of the field's places.
using ComputedNumber = std::int64_t (*)(std::span<const std::int64_t> raw);

/// How a raw value becomes a text. Made by the functions below, never by hand.
struct TextRule {
  enum class Kind : std::uint8_t {
    Hidden,    ///< not shown: a count, or a value that others are computed from
    Integer,   ///< multiplier × raw + addend
    Scaled,    ///< scale × raw + offset, in double precision
    Named,     ///< the text of a table's row
    Computed,  ///< a function of all places' values
    Each,      ///< an array with the text of each place
    Removed,   ///< the key is taken out of the section
    Supplied,  ///< the decoder writes the key, from what an earlier packet said
  };

  Kind kind = Kind::Hidden;
  NumberFormat format = "%d";
  std::int32_t multiplier = 1;
  std::int32_t addend = 0;
  double scale = 1;
  double offset = 0;
  NamedValues names{};
  std::string_view otherName{};  ///< for values outside `names`; empty: `format` shows them
  ComputeValue computed = nullptr;
  ComputedNumber number = nullptr;
  /// What readers of packets in other languages call their own `computed` or `number`.
  std::string_view functionName{};
  bool hasAbsentValue = false;
  std::int64_t absentValue = 0;
  std::string_view absentText{};

  bool operator==(const TextRule&) const = default;

  /// Shows what `function` makes of all the field's places, as if it were the raw value. `name` is
  /// the function's.
  [[nodiscard]] constexpr TextRule of(ComputedNumber function, std::string_view name = {}) const {
    TextRule rule = *this;
    rule.number = function;
    rule.functionName = name;
    return rule;
  }

  /// The raw value that means that there is nothing to show but `text`.
  [[nodiscard]] constexpr TextRule absentAt(std::int64_t value, std::string_view text) const {
    TextRule rule = *this;
    rule.hasAbsentValue = true;
    rule.absentValue = value;
    rule.absentText = text;
    return rule;
  }
};

/// Not shown.
[[nodiscard]] constexpr TextRule hidden() { return {}; }

/// The whole number multiplier × raw + addend.
[[nodiscard]] constexpr TextRule decimal(NumberFormat format = "%d", std::int32_t addend = 0,
                                         std::int32_t multiplier = 1) {
  return {.kind = TextRule::Kind::Integer,
          .format = format,
          .multiplier = multiplier,
          .addend = addend};
}

/// The real number scale × raw + offset.
[[nodiscard]] constexpr TextRule scaled(NumberFormat format, double offset, double scale) {
  return {.kind = TextRule::Kind::Scaled, .format = format, .scale = scale, .offset = offset};
}

/// The text that a table gives to the value, `other` for values that it does not list.
[[nodiscard]] constexpr TextRule named(NamedValues names, std::string_view other) {
  return {.kind = TextRule::Kind::Named, .names = names, .otherName = other};
}

/// Like `named`, showing values that the table does not list through a format.
[[nodiscard]] constexpr TextRule namedElse(NamedValues names, NumberFormat other) {
  return {.kind = TextRule::Kind::Named, .format = other, .names = names};
}

/// What `function` makes of all the field's places. `name` is the function's.
[[nodiscard]] constexpr TextRule computed(ComputeValue function, std::string_view name = {}) {
  return {.kind = TextRule::Kind::Computed, .computed = function, .functionName = name};
}

/// An array: each place as a decimal number.
[[nodiscard]] constexpr TextRule eachDecimal() { return {.kind = TextRule::Kind::Each}; }

/// The key leaves the section.
[[nodiscard]] constexpr TextRule removed() { return {.kind = TextRule::Kind::Removed}; }

/// Not read from this packet: the decoder knows it, or leaves the key out.
[[nodiscard]] constexpr TextRule supplied() { return {.kind = TextRule::Kind::Supplied}; }

/// Holds when a place's value lies between two bounds, both included. Always holds by default.
struct Condition {
  Place place{};
  std::int64_t lowest = 0;
  std::int64_t highest = -1;

  [[nodiscard]] constexpr bool isAlways() const { return lowest > highest; }
};

/// `lowest` must not exceed `highest`; in a table the compiler says so.
[[nodiscard]] constexpr Condition between(Place place, std::int64_t lowest, std::int64_t highest) {
  if (lowest > highest) throw "a range without values";
  return {place, lowest, highest};
}
[[nodiscard]] constexpr Condition equals(Place place, std::int64_t value) {
  return {place, value, value};
}

/// In which packets a field is shown, and what stands in its place in the others.
struct When {
  Condition condition{};
  std::string_view otherwise{};  ///< empty: the key is left out

  /// Shown as `text` where the condition fails.
  [[nodiscard]] constexpr When elseText(std::string_view text) const { return {condition, text}; }
};

/// Shown only where the condition holds.
[[nodiscard]] constexpr When when(Condition condition) { return {condition}; }

/// One value of a packet: its key, where it is read, how it is shown, and perhaps when:
/// `{"Band", u8(6), decimal(), when(kIsGeran)}`.
struct Field {
  static constexpr std::size_t kMaximumPlaces = 6;

  std::string_view key;
  std::array<Place, kMaximumPlaces> places{};
  std::uint8_t placeCount = 1;
  TextRule text{};
  Condition condition{};
  std::string_view otherwise{};  ///< the text when the condition fails; empty: the key is left out

  constexpr Field(std::string_view fieldKey, Place place, TextRule rule, When shown = {})
      : key(fieldKey),
        places{place},
        text(rule),
        condition(shown.condition),
        otherwise(shown.otherwise) {}
  /// A value computed from several places.
  template <std::size_t Count>
  constexpr Field(std::string_view fieldKey, const Place (&fieldPlaces)[Count], TextRule rule,
                  When shown = {})
      : key(fieldKey),
        placeCount(Count),
        text(rule),
        condition(shown.condition),
        otherwise(shown.otherwise) {
    static_assert(Count <= kMaximumPlaces);
    for (std::size_t i = 0; i < Count; ++i) places[i] = fieldPlaces[i];
  }
  /// A key that leaves the section, or that the decoder writes.
  constexpr Field(std::string_view fieldKey, TextRule rule)
      : key(fieldKey), placeCount(0), text(rule) {}

  [[nodiscard]] constexpr std::span<const Place> allPlaces() const {
    return {places.data(), placeCount};
  }
};

/// The field with this key, the first of several; there must be one: in a table the compiler says
/// so.
[[nodiscard]] constexpr Field fieldNamed(std::span<const Field> fields, std::string_view key) {
  const auto field = std::ranges::find(fields, key, &Field::key);
  if (field == fields.end()) throw "no field of this key";
  return *field;
}

/// The same field of the packet, for its records.
[[nodiscard]] constexpr Field packetFieldNamed(std::span<const Field> fields,
                                               std::string_view key) {
  Field field = fieldNamed(fields, key);
  for (Place& place : field.places) place = place.ofPacket();
  return field;
}

/// The fields with these keys.
template <class... Keys>
[[nodiscard]] constexpr std::array<Field, sizeof...(Keys)> fieldsNamed(
    std::span<const Field> fields, Keys... keys) {
  return {fieldNamed(fields, keys)...};
}

/// A repeated record. Record i starts at base + perCount × (value of `counted`) + stride × i.
struct RecordTable {
  std::string_view name;      ///< what one record is, for people
  Place count;                ///< how many records are read
  unsigned countAddend = 0;   ///< added to the count
  Place boundsCount = count;  ///< the count that an index is checked against
  bool isBounded = true;      ///< whether an index past the count is an error
  unsigned base = 0;
  unsigned perCount = 0;
  Place counted = count;
  unsigned stride = 0;
  std::span<const Field> fields{};
  Condition keep{};        ///< records for which it fails make no row
  bool keepsNone = false;  ///< no record makes a row
  unsigned twinBase = 0;   ///< the twin table, placed by the same rule
  unsigned twinPerCount = 0;
  unsigned twinStride = 0;
  /// What tells a record from the others of its list, in packet after packet: a channel and a
  /// cell's number there. At most `kMaximumIdentity` of the fields may be there at once, whatever
  /// their conditions. Empty: nothing but its position does.
  std::span<const Field> identity{};

  static constexpr std::size_t kMaximumIdentity = 4;
};

/// Whether two places read a common bit from the same origin. Places of different byte order are
/// compared by whole bytes.
[[nodiscard]] constexpr bool overlap(const Place& left, const Place& right) {
  if (left.origin != right.origin) return false;
  const auto first = [](const Place& p) {
    return 8U * p.offset + (p.isBigEndian ? 0U : p.firstBit);
  };
  const auto end = [](const Place& p) {
    return 8U * p.offset + (p.isBigEndian ? 8U * p.width : unsigned{p.firstBit} + p.bitCount);
  };
  return first(left) < end(right) && first(right) < end(left);
}

/// Whether two conditions test the same place and can never hold together.
[[nodiscard]] constexpr bool excludeEachOther(const Condition& left, const Condition& right) {
  if (left.isAlways() || right.isAlways() || left.place != right.place) return false;
  return left.highest < right.lowest || right.highest < left.lowest;
}

/// Whether no two fields of a layout read the same bits, save where one place of the two is
/// declared shared or where the fields never stand in one packet together. For static_assert beside
/// each layout.
[[nodiscard]] constexpr bool placesAreDisjoint(std::span<const Field> fields) {
  for (std::size_t i = 0; i < fields.size(); ++i) {
    for (std::size_t j = i + 1; j < fields.size(); ++j) {
      if (excludeEachOther(fields[i].condition, fields[j].condition)) continue;
      for (const Place& left : fields[i].allPlaces()) {
        for (const Place& right : fields[j].allPlaces()) {
          if (!left.isShared && !right.isShared && overlap(left, right)) return false;
        }
      }
    }
  }
  return true;
}

/// Whether every place lies within its integer, and every field has a key.
[[nodiscard]] constexpr bool placesAreSound(std::span<const Field> fields) {
  for (const Field& field : fields) {
    if (field.key.empty()) return false;
    for (const Place& place : field.allPlaces()) {
      if (place.width < 1 || place.width > 4 || place.bitCount < 1) return false;
      if (place.firstBit + place.bitCount > 8 * place.width) return false;
    }
  }
  return true;
}

/// The most fields of a layout: the engines keep one bit for each.
inline constexpr std::size_t kMaximumFields = 64;

/// What static_assert checks of every layout.
[[nodiscard]] constexpr bool isLayout(std::span<const Field> fields) {
  return fields.size() <= kMaximumFields && placesAreSound(fields) && placesAreDisjoint(fields);
}

}  // namespace kestro
