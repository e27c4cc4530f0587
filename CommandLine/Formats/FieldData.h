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
  /// `writer` must outlive it.
  explicit FieldWriter(Writer& writer) : _writer(writer) {}

  void place(const Place& place) {
    static constexpr std::string_view kOrigins[] = {"record", "packet", "twin"};
    _writer.beginObject();
    number("offset", place.offset);
    number("width", place.width);
    number("firstBit", place.firstBit);
    number("bits", place.bitCount);
    boolean("signed", place.isSigned);
    text("order", place.isBigEndian ? "big" : "little");
    text("origin", kOrigins[static_cast<std::size_t>(place.origin)]);
    _writer.endObject();
  }

  // --- Members -----------------------------------------------------------------------------------

  void text(std::string_view key, std::string_view value) {
    _writer.key(key);
    _writer.text(value);
  }
  void number(std::string_view key, std::uint64_t value) {
    _writer.key(key);
    _writer.number(value);
  }
  void integer(std::string_view key, std::int64_t value) {
    _writer.key(key);
    _writer.integer(value);
  }
  void real(std::string_view key, double value) {
    _writer.key(key);
    _writer.real(value);
  }
  void boolean(std::string_view key, bool value) {
    _writer.key(key);
    _writer.boolean(value);
  }
  void place(std::string_view key, const Place& value) {
    _writer.key(key);
    place(value);
  }
  void places(std::span<const Place> all) {
    _writer.key("places");
    _writer.beginArray();
    for (const Place& value : all) place(value);
    _writer.endArray();
  }
  void condition(std::string_view key, const Condition& condition) {
    if (condition.isAlways()) return;
    _writer.key(key);
    _writer.beginObject();
    place("place", condition.place);
    integer("lowest", condition.lowest);
    integer("highest", condition.highest);
    _writer.endObject();
  }

  // --- How a value is shown ----------------------------------------------------------------------

  void format(const TextRule& rule) {
    text("format", printfText(rule.format));
    if (const std::string_view unit = unitOf(rule.format); !unit.empty()) text("unit", unit);
  }

  void names(const TextRule& rule) {
    _writer.key("names");
    _writer.beginArray();
    for (const NamedValue& name : rule.names) {
      _writer.beginObject();
      integer("value", name.value);
      text("text", name.text);
      _writer.endObject();
    }
    _writer.endArray();
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
    _writer.key("shown");
    _writer.beginObject();
    kind(rule);
    if (!rule.functionName.empty()) text("function", rule.functionName);
    if (rule.hasAbsentValue) {
      integer("absentValue", rule.absentValue);
      text("absentText", rule.absentText);
    }
    _writer.endObject();
  }

  void field(std::string_view key, const Field& field, std::span<const Place> allPlaces) {
    text("key", key);
    places(allPlaces);
    shown(field.text);
    condition("when", field.condition);
    if (!field.otherwise.empty()) text("otherwise", field.otherwise);
  }

  void fields(std::span<const Field> fields) {
    _writer.key("fields");
    _writer.beginArray();
    for (const Field& known : fields) {
      _writer.beginObject();
      field(known.key, known, known.allPlaces());
      _writer.endObject();
    }
    _writer.endArray();
  }

 protected:
  Writer& _writer;
};

}  // namespace kestro
