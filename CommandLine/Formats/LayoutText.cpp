// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/LayoutText.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <utility>
#include <vector>

namespace kestro {
namespace {

/// "0.25x - 140"; empty for the raw value itself.
std::string formulaText(double factor, double addend) {
  if (factor == 1 && addend == 0) return "";
  std::string text = factor == 1 ? "x" : fmt::format("{}x", factor);
  if (addend != 0)
    text += fmt::format(" {} {}", addend < 0 ? '-' : '+', addend < 0 ? -addend : addend);
  return text;
}

std::string formattedText(const std::string& formula, const NumberFormat& format) {
  const std::string number = printfText(format);
  return formula.empty() ? number : formula + " as " + number;
}

/// "0: Idle; 3: Busy"
std::string namesText(const TextRule& rule) {
  std::vector<std::string> names;
  for (const NamedValue& name : rule.names) {
    names.push_back(fmt::format("{}: {}", name.value, name.text));
  }
  return fmt::format("{}", fmt::join(names, "; "));
}

/// "0: Idle; 3: Busy; else Unknown"
std::string namesOrOtherText(const TextRule& rule) {
  const std::string other =
      rule.otherName.empty() ? printfText(rule.format) : std::string(rule.otherName);
  return rule.names.empty() ? other : namesText(rule) + "; else " + other;
}

std::string kindText(const TextRule& rule) {
  switch (rule.kind) {
    case TextRule::Kind::Hidden:
      return "as it is";
    case TextRule::Kind::Integer:
      return formattedText(formulaText(rule.multiplier, rule.addend), rule.format);
    case TextRule::Kind::Scaled:
      return formattedText(formulaText(rule.scale, rule.offset), rule.format);
    case TextRule::Kind::Named:
      return namesOrOtherText(rule);
    case TextRule::Kind::Computed:
      return "computed";
    case TextRule::Kind::Each:
      return "a list of all, each %d";
    case TextRule::Kind::Removed:
      return "taken out of the section";
    case TextRule::Kind::Supplied:
      return "known from another packet";
  }
  return "";
}

std::string conditionText(const Condition& condition, bool inRecord) {
  const std::string place = placeText(condition.place, inRecord);
  if (condition.lowest == condition.highest) {
    return fmt::format("({}) is {}", place, condition.lowest);
  }
  return fmt::format("({}) is {} to {}", place, condition.lowest, condition.highest);
}

std::string requirementText(const Requirement& requirement) {
  switch (requirement.kind) {
    case Requirement::Kind::MinimumLength:
      return "";
    case Requirement::Kind::ExactLength:
      return "exactly that long";
    case Requirement::Kind::HoldsRecords:
      return "long enough for all its records";
    case Requirement::Kind::EndsWithRecords:
      return "ending with the last of its records";
    case Requirement::Kind::Number:
      return "only where " + conditionText(requirement.condition, false);
    case Requirement::Kind::SubPackets:
      return fmt::format("with {} {}",
                         requirement.subPackets.size() == 1 ? "sub-packet" : "sub-packets",
                         fmt::join(requirement.subPackets, " and "));
  }
  return "";
}

bool hasName(const TextRule& rule, std::int64_t value) {
  return std::ranges::find(rule.names, value, &NamedValue::value) != rule.names.end();
}

/// Whether the field is the text of a name, and each value that can come to it has one. Looked at
/// are small unsigned places only.
bool namesEveryValue(const Field& field) {
  const Place& place = field.places[0];
  if (field.text.kind != TextRule::Kind::Named || field.placeCount != 1) return false;
  if (place.isSigned || place.bitCount > 8) return false;
  const bool isOwnCondition = !field.condition.isAlways() && field.condition.place == place;
  const std::int64_t lowest = isOwnCondition ? field.condition.lowest : 0;
  const std::int64_t highest =
      isOwnCondition ? field.condition.highest : (std::int64_t{1} << place.bitCount) - 1;
  for (std::int64_t value = lowest; value <= highest; ++value) {
    if (!hasName(field.text, value)) return false;
  }
  return true;
}

std::string fieldText(const Field& field, bool inRecord) {
  std::string text = namesEveryValue(field) ? namesText(field.text) : ruleText(field.text);
  if (field.condition.isAlways()) return text;
  text += " when " + conditionText(field.condition, inRecord);
  if (!field.otherwise.empty()) text += fmt::format(", else {}", field.otherwise);
  return text;
}

/// "from byte 16 + 6 x (u8 at 27), 9 bytes each"
std::string originText(unsigned base, unsigned perCount, const Place& counted, unsigned stride) {
  std::string text = fmt::format("from byte {}", base);
  if (perCount != 0) text += fmt::format(" + {} x ({})", perCount, placeText(counted, false));
  return text + fmt::format(", {} {} each", stride, stride == 1 ? "byte" : "bytes");
}

/// "Serving of GSM or UMTS"
std::string cellKindText(const CellKind& kind) {
  std::vector<std::string_view> technologies;
  for (const std::string_view technology : kind.technologies) {
    if (!technology.empty()) technologies.push_back(technology);
  }
  return fmt::format("{} of {}", kind.type, fmt::join(technologies, " or "));
}

}  // namespace

std::string logCodeText(LogCode code) { return fmt::format("0x{:04X}", code); }

std::string printfText(const NumberFormat& format) {
  const std::string width = format.width == 0 ? "" : fmt::to_string(format.width);
  const std::string precision =
      format.conversion == 'f' && format.precision != 6 ? fmt::format(".{}", format.precision) : "";
  return fmt::format("{}%{}{}{}{}{}{}", format.prefix, format.plus ? "+" : "",
                     format.zeroPadded ? "0" : "", width, precision, format.conversion,
                     format.suffix == "%" ? "%%" : format.suffix);
}

std::string placeText(const Place& place, bool inRecord) {
  const bool isRelative = inRecord && place.origin != Origin::Packet;
  std::string text = fmt::format("{}{} at {}{}", place.isSigned ? 's' : 'u', 8 * place.width,
                                 isRelative ? "+" : "", place.offset);
  if (inRecord && place.origin == Origin::Twin) text += " of the twin record";
  if (inRecord && place.origin == Origin::Packet) text += " of the packet";
  if (place.isBigEndian) text += ", big-endian";
  if (place.bitCount == 8 * place.width) return text;
  if (place.bitCount == 1) return text + fmt::format(", bit {}", place.firstBit);
  return text + fmt::format(", bits {}-{}", place.firstBit, place.firstBit + place.bitCount - 1);
}

std::vector<std::string> requirementTexts(std::span<const Requirement> requirements) {
  std::vector<std::string> texts;
  for (const Requirement& requirement : requirements) {
    std::string text = requirementText(requirement);
    if (!text.empty()) texts.push_back(std::move(text));
  }
  return texts;
}

std::string ruleText(const TextRule& rule) {
  std::string text = kindText(rule);
  if (rule.number != nullptr) text = "computed, " + text;
  if (rule.hasAbsentValue) {
    text += fmt::format("; {}: {}", rule.absentValue,
                        rule.absentText.empty() ? "nothing" : rule.absentText);
  }
  return text;
}

std::string sourcesText(const CatalogueKey& key) {
  if (key.listed != nullptr) return std::string(key.listed->listKey);
  std::vector<std::string> places;
  for (const Field* field : key.fields) {
    for (const Place& place : field->allPlaces()) {
      std::string text = placeText(place, key.table != nullptr);
      if (places.empty() || places.back() != text) places.push_back(std::move(text));
    }
  }
  return fmt::format("{}", fmt::join(places, "; "));
}

std::string shownText(const CatalogueKey& key) {
  if (key.listed != nullptr) return ruleText(key.listed->text);
  std::vector<std::string> texts;
  for (const Field* field : key.fields) texts.push_back(fieldText(*field, key.table != nullptr));
  return fmt::format("{}", fmt::join(texts, "; or "));
}

std::string tableText(const RecordTable& table) {
  std::string text =
      fmt::format("one for each {}; count: {}", table.name, placeText(table.count, false));
  if (table.countAddend != 0) text += fmt::format(" + {}", table.countAddend);
  text += "; " + originText(table.base, table.perCount, table.counted, table.stride);
  if (table.twinStride != 0) {
    text += "; twins " +
            originText(table.twinBase, table.twinPerCount, table.counted, table.twinStride);
  }
  if (!table.keep.isAlways()) text += "; only where " + conditionText(table.keep, true);
  return text;
}

std::string partText(const PropertyListReading& reading, SectionKind kind) {
  switch (reading.part) {
    case ListedPart::Root:
      return "from the property list's dictionary";
    case ListedPart::Elements:
      return "the property list's array as it is";
    case ListedPart::FirstCell:
      return "from the first " + cellKindText(reading.cells);
    case ListedPart::EachCell:
      if (kind == SectionKind::Dictionary) return "from every " + cellKindText(reading.cells);
      return fmt::format("a row for every {}; without one the list is empty",
                         cellKindText(reading.cells));
  }
  return "";
}

}  // namespace kestro
