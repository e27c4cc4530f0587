// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/CellRows.h"

#include <string>

#include "CommandLine/Formats/TimeText.h"

namespace kestro {
namespace {

template <class Value>
struct FieldColumn {
  RowColumn column;
  RowField (*field)(const Value& value);
};

RowField none() { return std::monostate(); }
RowField textField(std::string_view text) { return text.empty() ? none() : std::string(text); }
RowField wholeField(const std::optional<std::uint32_t>& number) {
  return number ? RowField(std::int64_t{*number}) : none();
}
RowField realField(const std::optional<double>& number) {
  return number ? RowField(*number) : none();
}
double secondsOf(std::chrono::microseconds duration) {
  return std::chrono::duration<double>(duration).count();
}

using SummaryValue = double (LevelSummary::*)() const noexcept;
RowField levelField(const Cell& cell, SummaryValue value) {
  return cell.level.count() == 0 ? none() : RowField((cell.level.*value)());
}
RowField qualityField(const Cell& cell, SummaryValue value) {
  return cell.quality.count() == 0 ? none() : RowField((cell.quality.*value)());
}

RowField frequencyField(const Cell& cell) {
  const auto kHz = cell.band().downlinkKHz;
  return kHz ? RowField(*kHz / 1000.0) : none();
}

constexpr FieldColumn<Cell> kCellColumns[] = {
    {{"technology", "Technology"},
     [](const Cell& cell) { return textField(nameOfRadio(cell.name.radio)); }},
    {{"cell", "Cell"}, [](const Cell& cell) { return textField(textOf(cell.name)); }},
    {{"cell_identity", ""}, [](const Cell& cell) { return wholeField(cell.name.identity); }},
    {{"base_station", ""}, [](const Cell& cell) { return wholeField(cell.baseStation()); }},
    {{"sector", ""}, [](const Cell& cell) { return wholeField(cell.sector()); }},
    {{"channel", "Channel"}, [](const Cell& cell) { return wholeField(cell.channel); }},
    {{"physical_identity", "Physical"}, [](const Cell& cell) { return wholeField(cell.physical); }},
    {{"band", "Band"}, [](const Cell& cell) { return textField(cell.band().band); }},
    {{"frequency_mhz", "MHz"}, frequencyField},
    {{"area", "Area"}, [](const Cell& cell) { return wholeField(cell.area); }},
    {{"network", "Network"}, [](const Cell& cell) { return textField(cell.network); }},
    {{"level_last", "Level"},
     [](const Cell& cell) { return levelField(cell, &LevelSummary::last); }},
    {{"level_least", "Least"},
     [](const Cell& cell) { return levelField(cell, &LevelSummary::least); }},
    {{"level_median", "Median"},
     [](const Cell& cell) { return levelField(cell, &LevelSummary::median); }},
    {{"level_greatest", "Greatest"},
     [](const Cell& cell) { return levelField(cell, &LevelSummary::greatest); }},
    {{"level_count", ""},
     [](const Cell& cell) { return RowField(static_cast<std::int64_t>(cell.level.count())); }},
    {{"quality_last", "Quality"},
     [](const Cell& cell) { return qualityField(cell, &LevelSummary::last); }},
    {{"quality_least", ""},
     [](const Cell& cell) { return qualityField(cell, &LevelSummary::least); }},
    {{"quality_median", ""},
     [](const Cell& cell) { return qualityField(cell, &LevelSummary::median); }},
    {{"quality_greatest", ""},
     [](const Cell& cell) { return qualityField(cell, &LevelSummary::greatest); }},
    {{"quality_count", ""},
     [](const Cell& cell) { return RowField(static_cast<std::int64_t>(cell.quality.count())); }},
    {{"first_seen", "First seen"},
     [](const Cell& cell) { return RowField(isoTimeText(cell.firstSeen)); }},
    {{"last_seen", ""}, [](const Cell& cell) { return RowField(isoTimeText(cell.lastSeen)); }},
    {{"serving_s", "Serving s"}, [](const Cell& cell) { return RowField(secondsOf(cell.served)); }},
    {{"assumed", ""}, [](const Cell& cell) { return RowField(std::int64_t{cell.isAssumed}); }},
};

bool isAlarmEvent(const Event& event) {
  return event.kind == EventKind::Alarm || event.kind == EventKind::AlarmOver;
}

constexpr FieldColumn<Event> kEventColumns[] = {
    {{"time", "Time"}, [](const Event& event) { return RowField(isoTimeText(event.time)); }},
    {{"event", "Event"}, [](const Event& event) { return textField(nameOfEvent(event.kind)); }},
    {{"technology", "Technology"}, [](const Event& event) { return textField(event.technology); }},
    {{"subject", "What"}, [](const Event& event) { return textField(event.subject); }},
    {{"from", "From"}, [](const Event& event) { return textField(event.from); }},
    {{"to", "To"}, [](const Event& event) { return textField(event.to); }},
    {{"from_level", "Level"}, [](const Event& event) { return realField(event.fromLevel); }},
    {{"to_level", "New level"},
     [](const Event& event) { return isAlarmEvent(event) ? none() : realField(event.toLevel); }},
    {{"value", "Value"},
     [](const Event& event) { return isAlarmEvent(event) ? realField(event.toLevel) : none(); }},
    {{"told_by", "Told by"}, [](const Event& event) { return textField(event.toldBy); }},
    {{"connected_by", "Connected"},
     [](const Event& event) { return textField(event.connectedBy); }},
    {{"duration_s", "Seconds"},
     [](const Event& event) {
       return event.duration ? RowField(secondsOf(*event.duration)) : none();
     }},
    {{"message", "Message"},
     [](const Event& event) { return RowField(static_cast<std::int64_t>(event.message)); }},
};

constexpr RowColumn kInputColumn = {"input", "Input"};

template <std::size_t kCount, class Value>
std::vector<RowColumn> columnsOf(const FieldColumn<Value> (&rows)[kCount]) {
  std::vector<RowColumn> columns;
  for (const auto& row : rows) columns.push_back(row.column);
  columns.push_back(kInputColumn);
  return columns;
}

template <std::size_t kCount, class Value>
std::vector<RowField> fieldsOf(const FieldColumn<Value> (&rows)[kCount], const Value& value,
                               std::string_view input) {
  std::vector<RowField> fields;
  for (const auto& row : rows) fields.push_back(row.field(value));
  fields.push_back(textField(input));
  return fields;
}

}  // namespace

std::span<const RowColumn> cellColumns() {
  static const std::vector<RowColumn> columns = columnsOf(kCellColumns);
  return columns;
}

std::vector<RowField> fieldsOfCell(const Cell& cell, std::string_view input) {
  return fieldsOf(kCellColumns, cell, input);
}

std::span<const RowColumn> eventColumns() {
  static const std::vector<RowColumn> columns = columnsOf(kEventColumns);
  return columns;
}

std::vector<RowField> fieldsOfEvent(const Event& event, std::string_view input) {
  return fieldsOf(kEventColumns, event, input);
}

}  // namespace kestro
