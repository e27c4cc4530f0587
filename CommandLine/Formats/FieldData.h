// SPDX-License-Identifier: MIT
// A field as data for programs: its places as numbers, how it is shown, and when.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

#include "CommandLine/Formats/LayoutText.h"
#include "LogGenerator/Packets/Field.h"

namespace kestro {

/// What stands behind the number, when nothing stands before it: "dBm".
[[nodiscard]] inline std::string_view unitOf(const NumberFormat& format) {
  if (!format.prefix.empty()) return {};
  std::string_view unit = format.suffix;
  if (unit.starts_with(' ')) unit.remove_prefix(1);
  return unit;
}

/// Writes to a JsonWriter or a LuaWriter, as members of the object that has been begun there.
template <class Writer>
class FieldWriter {
 public:
  /// `output` must outlive it.
  explicit FieldWriter(Writer& output) : writer(output) {}

  void place(const Place& place) {
    static constexpr std::string_view kOrigins[] = {"record", "packet", "twin"};
    writer.beginObject();
    number("offset", place.offset);
    number("width", place.width);
    number("firstBit", place.firstBit);
    number("bits", place.bitCount);
    boolean("signed", place.isSigned);
    text("order", place.isBigEndian ? "big" : "little");
    text("origin", kOrigins[static_cast<std::size_t>(place.origin)]);
    writer.endObject();
  }

  // --- Members -----------------------------------------------------------------------------------

  void text(std::string_view key, std::string_view value) {
    writer.key(key);
    writer.text(value);
  }
  void number(std::string_view key, std::uint64_t value) {
    writer.key(key);
    writer.number(value);
  }
  void integer(std::string_view key, std::int64_t value) {
    writer.key(key);
    writer.integer(value);
  }
  void real(std::string_view key, double value) {
    writer.key(key);
    writer.real(value);
  }
  void boolean(std::string_view key, bool value) {
    writer.key(key);
    writer.boolean(value);
  }
  void place(std::string_view key, const Place& value) {
    writer.key(key);
    place(value);
  }
  void places(std::span<const Place> all) {
    writer.key("places");
    writer.beginArray();
    for (const Place& value : all) place(value);
    writer.endArray();
  }
  void condition(std::string_view key, const Condition& condition) {
    if (condition.isAlways()) return;
    writer.key(key);
    writer.beginObject();
    place("place", condition.place);
    integer("lowest", condition.lowest);
    integer("highest", condition.highest);
    writer.endObject();
  }

  // --- How a value is shown ----------------------------------------------------------------------

  void format(const TextRule& rule) {
    text("format", printfText(rule.format));
    if (const std::string_view unit = unitOf(rule.format); !unit.empty()) text("unit", unit);
  }

  void names(const TextRule& rule) {
    writer.key("names");
    writer.beginArray();
    for (const NamedValue& name : rule.names) {
      writer.beginObject();
      integer("value", name.value);
      text("text", name.text);
      writer.endObject();
    }
    writer.endArray();
    if (rule.otherName.empty()) {
      format(rule);
    } else {
      text("otherName", rule.otherName);
    }
  }

  void scaled(const TextRule& rule, double scale, double offset) {
    format(rule);
    real("scale", scale);
    real("offset", offset);
  }

  void kind(const TextRule& rule) {
    using enum TextRule::Kind;
    switch (rule.kind) {
      case Hidden:
        return text("kind", "hidden");
      case Integer:
        text("kind", "integer");
        return scaled(rule, rule.multiplier, rule.addend);
      case Scaled:
        text("kind", "scaled");
        return scaled(rule, rule.scale, rule.offset);
      case Named:
        text("kind", "named");
        return names(rule);
      case Computed:
        return text("kind", "computed");
      case Each:
        return text("kind", "each");
      case Removed:
        return text("kind", "removed");
      case Supplied:
        return text("kind", "supplied");
    }
  }

  void shown(const TextRule& rule) {
    writer.key("shown");
    writer.beginObject();
    kind(rule);
    if (!rule.functionName.empty()) text("function", rule.functionName);
    if (rule.hasAbsentValue) {
      integer("absentValue", rule.absentValue);
      text("absentText", rule.absentText);
    }
    writer.endObject();
  }

  void field(std::string_view key, const Field& field, std::span<const Place> allPlaces) {
    text("key", key);
    places(allPlaces);
    shown(field.text);
    condition("when", field.condition);
    if (!field.otherwise.empty()) text("otherwise", field.otherwise);
  }

  void fields(std::span<const Field> fields) {
    writer.key("fields");
    writer.beginArray();
    for (const Field& known : fields) {
      writer.beginObject();
      field(known.key, known, known.allPlaces());
      writer.endObject();
    }
    writer.endArray();
  }

 protected:
  Writer& writer;
};

}  // namespace kestro
