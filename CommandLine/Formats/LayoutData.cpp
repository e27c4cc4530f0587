// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/LayoutData.h"

#include <string_view>

#include "CommandLine/Formats/FieldData.h"

namespace kestro {
namespace {

/// Writes to either of the two writers.
template <class Writer>
class LayoutWriter : private FieldWriter<Writer> {
 public:
  using FieldWriter<Writer>::FieldWriter;

  void takers(std::span<const Outline> outlines) {
    writer.beginArray();
    for (const Outline& outline : outlines) {
      writer.beginArray();
      for (const OutlinedReading& known : outline.readings) reading(known);
      writer.endArray();
    }
    writer.endArray();
  }

 private:
  using FieldWriter<Writer>::writer;
  using FieldWriter<Writer>::boolean;
  using FieldWriter<Writer>::condition;
  using FieldWriter<Writer>::field;
  using FieldWriter<Writer>::fields;
  using FieldWriter<Writer>::number;
  using FieldWriter<Writer>::place;
  using FieldWriter<Writer>::text;

  // --- Parts -------------------------------------------------------------------------------------

  void members(const OutlinedValue& value) {
    text("part", "value");
    text("section", value.section);
    if (value.anchor.here) number("subPacket", *value.anchor.here);
    if (value.anchor.twin) number("twinSubPacket", *value.anchor.twin);
    field(value.key, value.field, value.places);
  }

  /// Where the records lie.
  void extent(const RecordTable& table) {
    place("count", table.count);
    number("countAddend", table.countAddend);
    number("base", table.base);
    number("perCount", table.perCount);
    place("counted", table.counted);
    number("stride", table.stride);
  }

  void members(const OutlinedTable& part) {
    const RecordTable& table = *part.table;
    text("part", "table");
    text("section", part.section);
    text("list", part.list);
    extent(table);
    if (table.isBounded) place("boundsCount", table.boundsCount);
    number("twinBase", table.twinBase);
    number("twinPerCount", table.twinPerCount);
    number("twinStride", table.twinStride);
    condition("keep", table.keep);
    if (table.keepsNone) boolean("keepsNone", true);
    fields(table.fields);
  }

  void members(const OutlinedSizedRecords& part) {
    const SizedRecords& records = *part.records;
    text("part", "sizedRecords");
    text("section", part.section);
    text("list", part.list);
    number("subPacket", part.subPacket);
    place("count", records.count);
    place("valueCount", records.valueCount);
    number("fixedSize", records.fixedSize);
    number("sizePerValue", records.sizePerValue);
    number("shiftPerValue", records.shiftPerValue);
    number("alignment", records.alignment);
    fields(records.fields);
  }

  void part(const OutlinedPart& part) {
    writer.beginObject();
    std::visit([this](const auto& known) { this->members(known); }, part);
    writer.endObject();
  }

  // --- Readings ----------------------------------------------------------------------------------

  void members(const Requirement& requirement, const OutlinedReading& reading) {
    switch (requirement.kind) {
      case Requirement::Kind::MinimumLength:
        text("kind", "minimumLength");
        return number("length", reading.packetLength);
      case Requirement::Kind::ExactLength:
        text("kind", "exactLength");
        return number("length", reading.packetLength);
      case Requirement::Kind::HoldsRecords:
        text("kind", "holdsRecords");
        return extent(*reading.requiredRecords);
      case Requirement::Kind::EndsWithRecords:
        text("kind", "endsWithRecords");
        return extent(*reading.requiredRecords);
      case Requirement::Kind::Number:
        text("kind", "number");
        return condition("condition", requirement.condition);
      case Requirement::Kind::SubPackets:
        text("kind", "subPackets");
        return subPackets(requirement.subPackets);
    }
  }

  void subPackets(std::span<const std::uint8_t> identifiers) {
    writer.key("identifiers");
    writer.beginArray();
    for (const std::uint8_t identifier : identifiers) writer.number(identifier);
    writer.endArray();
  }

  void reading(const OutlinedReading& reading) {
    writer.beginObject();
    number("minimumLength", reading.minimumLength);
    writer.key("requirements");
    writer.beginArray();
    for (const Requirement& requirement : reading.requirements) {
      writer.beginObject();
      members(requirement, reading);
      writer.endObject();
    }
    writer.endArray();
    writer.key("parts");
    writer.beginArray();
    for (const OutlinedPart& known : reading.parts) part(known);
    writer.endArray();
    writer.endObject();
  }
};

}  // namespace

void writeTakers(JsonWriter& writer, std::span<const Outline> takers) {
  LayoutWriter<JsonWriter>(writer).takers(takers);
}

void writeTakers(LuaWriter& writer, std::span<const Outline> takers) {
  LayoutWriter<LuaWriter>(writer).takers(takers);
}

void writePlace(LuaWriter& writer, const Place& place) { FieldWriter(writer).place(place); }

}  // namespace kestro
