// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/CellMonitor.h"

#include <algorithm>
#include <string>
#include <utility>

#include "LogGenerator/Packets/Texts.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {
namespace {

constexpr std::int64_t kComparedWithAbsent = 0xFFFF;

bool isText(const Value& value, std::string_view text) {
  return value.isText() && value.text() == text;
}

/// A cell's value as it is explained: its list key stands for the bytes, a value that is no number
/// has no text.
ExplainedValue explainValue(const Section& section, const ListedValue& value,
                            const Dictionary& cell) {
  ExplainedValue explained{.section = section.name, .key = value.key};
  ExplainedSource source{.listKey = std::string(value.listKey), .isNumber = false};
  if (const auto number = cellNumber(cell, value.listKey)) {
    source.raw = *number;
    source.isNumber = true;
    explained.text = cellText(value, *number);
  }
  explained.sources.push_back(std::move(source));
  return explained;
}

}  // namespace

Array readCellArray(const Packet& packet, const PropertyListCoding& coding, SystemLog& log) {
  const Result<Value>& root = packet.propertyList(coding);
  if (!root) {
    log.write(LogPriority::Error, "Cell Info Array data could not be constructed");
    return Array::null();
  }
  return root->array();
}

bool isCellOfKind(const Dictionary& cell, const CellKind& kind) {
  const Value& technology = cell[kTqCellMonitorCellRadioAccessTechnology];
  const bool isOfTechnology =
      std::ranges::any_of(kind.technologies, [&](std::string_view candidate) {
        return !candidate.empty() && isText(technology, candidate);
      });
  return isOfTechnology && isText(cell[kTqCellMonitorCellType], kind.type);
}

std::vector<Dictionary> chosenCells(const PropertyListReading& reading, const Array& list) {
  std::vector<Dictionary> chosen;
  for (const Value& element : list) {
    const Dictionary cell = element.dictionary();
    if (cell.isNull() || !isCellOfKind(cell, reading.cells)) continue;
    chosen.push_back(cell);
    if (reading.part == ListedPart::FirstCell) break;
  }
  return chosen;
}

std::optional<std::int32_t> cellNumber(const Dictionary& cell, std::string_view key) {
  const Value& value = cell[key];
  if (!value.isInteger()) return std::nullopt;
  return static_cast<std::int32_t>(value.integerBits());
}

bool isNotMeasured(const ListedValue& value, std::int32_t number) {
  return value.text.hasAbsentValue && (number & kComparedWithAbsent) == value.text.absentValue;
}

Value cellText(const ListedValue& value, std::int32_t number) {
  const std::int64_t raw = isNotMeasured(value, number) ? value.text.absentValue : number;
  return makeText(value.text, {&raw, 1});
}

void writeCellValues(const Dictionary& cell, std::span<const ListedValue> values,
                     Dictionary& target, SystemLog& log) {
  for (const ListedValue& value : values) {
    if (const auto number = cellNumber(cell, value.listKey)) {
      target.set(value.key, cellText(value, *number));
    } else if (!value.failureLine.empty()) {
      log.write(LogPriority::Error, value.failureLine);
    }
  }
}

bool CellMonitorDecoder::updateWithOtherPacket(const Packet& packet, LogCode code) {
  const PropertyListReading& reading = *section().propertyList;
  if (code != reading.packet.code) return false;
  const Array list = readCellArray(packet, services().propertyListCoding, systemLog());
  if (section().kind == SectionKind::List) {
    Array rows = sectionList();
    clearElementsInArray(rows);
  }
  if (!list.isNull()) {
    showCells(reading, list);
  } else if (!reading.missingListLine.empty()) {
    systemLog().write(LogPriority::Error, reading.missingListLine);
  }
  return true;
}

void CellMonitorDecoder::explainOtherPacket(const Packet& packet, LogCode code,
                                            const ExplainVisitor& visit) const {
  const PropertyListReading& reading = *section().propertyList;
  if (code != reading.packet.code) return;
  const Result<Value>& root = packet.propertyList(services().propertyListCoding);
  if (!root) return;
  std::size_t row = 0;
  for (const Dictionary& cell : chosenCells(reading, root->array())) {
    for (const ListedValue& value : reading.values) {
      ExplainedValue explained = explainValue(section(), value, cell);
      if (section().kind == SectionKind::List) explained.row = row;
      visit(explained);
    }
    ++row;
  }
}

void CellMonitorDecoder::showCells(const PropertyListReading& reading, const Array& list) {
  Dictionary target = sectionDictionary();
  std::vector<Value> rows;
  for (const Dictionary& cell : chosenCells(reading, list)) {
    if (section().kind == SectionKind::List) {
      target = Dictionary();
      rows.emplace_back(target);
    }
    writeCellValues(cell, reading.values, target, systemLog());
  }
  if (section().kind == SectionKind::Dictionary) return;
  Array section = sectionList();
  replaceArrayWith(section, std::move(rows));
}

}  // namespace kestro
