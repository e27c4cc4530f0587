// SPDX-License-Identifier: MIT
// The columns and modes of drive-test logs, and the reading of their rows.
#include "Sources/DriveTestLog.h"

#include <fmt/format.h>

#include <algorithm>
#include <charconv>
#include <cmath>
#include <istream>
#include <sstream>
#include <utility>

namespace kestro {
namespace {

enum class Content : std::uint8_t { Text, Number, Decibels, Hexadecimal };

struct Column {
  DriveTestColumn column;
  std::string_view name;
  Content content;
  bool isRequired;
};

constexpr std::array<Column, kDriveTestColumnCount> kColumns = {{
    {DriveTestColumn::Timestamp, "Timestamp", Content::Text, true},
    {DriveTestColumn::NetworkMode, "NetworkMode", Content::Text, true},
    {DriveTestColumn::Level, "RSRP", Content::Decibels, true},
    {DriveTestColumn::Quality, "RSRQ", Content::Decibels, false},
    {DriveTestColumn::SignalToNoise, "SNR", Content::Decibels, false},
    {DriveTestColumn::TotalPower, "RSSI", Content::Decibels, false},
    {DriveTestColumn::ChannelQuality, "CQI", Content::Number, false},
    {DriveTestColumn::NeighbourLevel, "NRxRSRP", Content::Decibels, false},
    {DriveTestColumn::NeighbourQuality, "NRxRSRQ", Content::Decibels, false},
    {DriveTestColumn::DownlinkRate, "DL_bitrate", Content::Number, false},
    {DriveTestColumn::UplinkRate, "UL_bitrate", Content::Number, false},
    {DriveTestColumn::CellId, "CellID", Content::Number, false},
    {DriveTestColumn::Cell, "CELLHEX", Content::Hexadecimal, false},
    {DriveTestColumn::Node, "NODEHEX", Content::Hexadecimal, false},
    {DriveTestColumn::Area, "LACHEX", Content::Hexadecimal, false},
    {DriveTestColumn::RawCellId, "RAWCELLID", Content::Number, false},
    {DriveTestColumn::Operator, "Operatorname", Content::Text, false},
    {DriveTestColumn::State, "State", Content::Text, false},
    {DriveTestColumn::Longitude, "Longitude", Content::Number, false},
    {DriveTestColumn::Latitude, "Latitude", Content::Number, false},
    {DriveTestColumn::Speed, "Speed", Content::Number, false},
}};

constexpr bool columnsStandInTheirOrder() {
  for (std::size_t i = 0; i < kColumns.size(); ++i) {
    if (static_cast<std::size_t>(kColumns[i].column) != i || kColumns[i].name.empty()) return false;
  }
  return true;
}
static_assert(columnsStandInTheirOrder());

struct NetworkMode {
  std::string_view name;
  DriveTestFamily family;
};

constexpr std::array kNetworkModes = {
    NetworkMode{"GSM", DriveTestFamily::GSM},      NetworkMode{"GPRS", DriveTestFamily::GSM},
    NetworkMode{"EDGE", DriveTestFamily::GSM},     NetworkMode{"UMTS", DriveTestFamily::UMTS},
    NetworkMode{"HSDPA", DriveTestFamily::UMTS},   NetworkMode{"HSUPA", DriveTestFamily::UMTS},
    NetworkMode{"HSPA", DriveTestFamily::UMTS},    NetworkMode{"HSPA+", DriveTestFamily::UMTS},
    NetworkMode{"DC-HSPA", DriveTestFamily::UMTS}, NetworkMode{"LTE", DriveTestFamily::LTE},
    NetworkMode{"LTE_CA", DriveTestFamily::LTE},   NetworkMode{"5G", DriveTestFamily::LTE},
};

constexpr std::string_view kNotMeasured = "-";
constexpr std::size_t kLongestText = 64;

bool isPrintable(char c) { return c >= ' ' && c <= '~'; }

/// A field as a line of text may show it, whatever it holds.
std::string shown(std::string_view text) {
  std::string result(text.substr(0, std::min(text.size(), kLongestText)));
  std::ranges::replace_if(
      result, [](char c) { return !isPrintable(c); }, '?');
  return result;
}

template <class T>
bool isWhollyParsed(std::string_view text, T& value, auto... format) {
  const auto* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, value, format...);
  return error == std::errc() && stop == end;
}

/// No receiver measures more, either way; an integer holds it.
constexpr double kMostDecibels = 1000;

bool isUsable(std::string_view text, Content content) {
  double number = 0;
  std::uint64_t hexadecimal = 0;
  switch (content) {
    case Content::Number:
      return isWhollyParsed(text, number) && std::isfinite(number);
    case Content::Decibels:
      return isWhollyParsed(text, number) && std::abs(number) <= kMostDecibels;
    case Content::Hexadecimal:
      return isWhollyParsed(text, hexadecimal, 16);
    case Content::Text:
      break;
  }
  return std::ranges::all_of(text, isPrintable);
}

/// Years in which there were logs, or may be.
constexpr int kFirstYear = 1970;
constexpr int kLastYear = 2099;

/// "2019.11.21_15.38.36"
std::optional<std::chrono::sys_seconds> parsedTime(std::string_view text) {
  constexpr std::string_view kForm = "0000.00.00_00.00.00";
  if (text.size() != kForm.size()) return std::nullopt;
  for (std::size_t i = 0; i < kForm.size(); ++i) {
    const bool isDigit = text[i] >= '0' && text[i] <= '9';
    if (kForm[i] == '0' ? !isDigit : text[i] != kForm[i]) return std::nullopt;
  }
  const auto number = [text](std::size_t offset, std::size_t digits) {
    unsigned value = 0;
    for (const char c : text.substr(offset, digits)) value = value * 10 + unsigned(c - '0');
    return value;
  };
  const std::chrono::year_month_day date(std::chrono::year(static_cast<int>(number(0, 4))),
                                         std::chrono::month(number(5, 2)),
                                         std::chrono::day(number(8, 2)));
  const unsigned hours = number(11, 2);
  const unsigned minutes = number(14, 2);
  const unsigned seconds = number(17, 2);
  const bool isYear = int(date.year()) >= kFirstYear && int(date.year()) <= kLastYear;
  if (!isYear || !date.ok() || hours > 23 || minutes > 59 || seconds > 60) return std::nullopt;
  return std::chrono::sys_days(date) + std::chrono::hours(hours) + std::chrono::minutes(minutes) +
         std::chrono::seconds(seconds);
}

constexpr std::array<std::string_view, kDriveTestFamilyCount> kFamilyNames = {"GSM", "UMTS", "LTE"};

constexpr const char* kInUtf16 = "the file is in UTF-16: save it in UTF-8";

/// Whether a text begins with the byte order mark of UTF-16, either way.
bool beginsInUtf16(std::istream& text) { return text.peek() == 0xFF || text.peek() == 0xFE; }

/// Why a first line names none of the columns, where it shows: what it was saved as.
std::string formHint(const std::vector<std::string>& fields) {
  const std::string& first = fields.front();
  if (first.find('\0') != std::string::npos) return fmt::format("; {}", kInUtf16);
  const bool isOneField = fields.size() == 1;
  if (isOneField && first.find(';') != std::string::npos) {
    return "; its columns are separated by semicolons: save it with commas";
  }
  if (isOneField && first.find('\t') != std::string::npos) {
    return "; its columns are separated by tabs: save it with commas";
  }
  return "";
}

}  // namespace

std::string_view nameOf(DriveTestFamily family) noexcept {
  return kFamilyNames[static_cast<std::size_t>(family)];
}

std::optional<DriveTestFamily> familyOfNetworkMode(std::string_view mode) noexcept {
  const auto* found = std::ranges::find(kNetworkModes, mode, &NetworkMode::name);
  if (found == kNetworkModes.end()) return std::nullopt;
  return found->family;
}

bool isDriveTestLog(ByteView head) {
  std::istringstream line(std::string(head.begin(), std::ranges::find(head, '\n')));
  const auto names = CsvReader(line).next();
  if (!names || !names->has_value()) return false;
  return std::ranges::all_of(kColumns, [&](const Column& column) {
    return !column.isRequired || std::ranges::count((*names)->fields, column.name) > 0;
  });
}

Result<DriveTestLog> DriveTestLog::open(const std::string& path) {
  auto file = RecordedFile::open(path);
  if (!file) return tl::unexpected(file.error());
  return open(*std::move(file));
}

Result<DriveTestLog> DriveTestLog::open(RecordedFile file) {
  DriveTestLog log(std::move(file));
  if (auto read = log.readFirstLine(); !read) {
    return failure(fmt::format("{}: {}", log._path, read.error().message));
  }
  return log;
}

DriveTestLog::DriveTestLog(RecordedFile file)
    : _path(file.path()),
      _file(std::make_unique<RecordedFileStream>(std::move(file))),
      _csv(std::make_unique<CsvReader>(*_file)) {}

Result<void> DriveTestLog::readFirstLine() {
  if (beginsInUtf16(*_file)) return failure(kInUtf16);
  const auto names = _csv->next();
  if (!names) return tl::unexpected(names.error());
  if (_csv->readFailed()) return failure("the file cannot be read");
  if (!names->has_value()) return failure("the file is empty");
  const auto& fields = (*names)->fields;
  _fieldCount = fields.size();
  for (const auto& column : kColumns) {
    const auto found = std::ranges::find(fields, column.name);
    if (found != fields.end()) {
      _fieldOfColumn[static_cast<std::size_t>(column.column)] =
          static_cast<std::size_t>(found - fields.begin());
    } else if (column.isRequired) {
      return failure(fmt::format("no drive-test log: there is no column \"{}\"{}", column.name,
                                 formHint(fields)));
    } else {
      _missingColumns.emplace_back(column.name);
    }
  }
  return {};
}

Result<std::optional<DriveTestRow>> DriveTestLog::next() {
  while (true) {
    const auto record = _csv->next();
    if (_csv->readFailed()) return failure(fmt::format("{}: the file cannot be read", _path));
    if (!record) {
      note(_problems.rows, record.error().message);
      continue;
    }
    if (!record->has_value()) return std::nullopt;
    auto row = rowOf(**record);
    if (row) return std::move(*row);
    note(_problems.rows, fmt::format("line {}: {}", (*record)->line, row.error().message));
  }
}

Result<DriveTestRow> DriveTestLog::rowOf(const CsvRecord& record) {
  if (record.fields.size() != _fieldCount) {
    return failure(fmt::format("{} fields instead of {}", record.fields.size(), _fieldCount));
  }
  const auto field = [&](DriveTestColumn column) -> const std::string& {
    return record.fields[*_fieldOfColumn[static_cast<std::size_t>(column)]];
  };
  const auto time = parsedTime(field(DriveTestColumn::Timestamp));
  if (!time) {
    return failure(fmt::format("\"{}\" is no time", shown(field(DriveTestColumn::Timestamp))));
  }
  const auto& named = field(DriveTestColumn::NetworkMode);
  const auto mode = named == kNotMeasured ? _lastMode : named;
  const auto family = mode ? familyOfNetworkMode(*mode) : std::nullopt;
  if (!family) return failure(fmt::format("\"{}\" is no network mode", shown(named)));

  _lastMode = mode;
  auto& values = _lastValues[static_cast<std::size_t>(*family)];
  auto measured = measuredValues(record);
  for (std::size_t i = 0; i < values.size(); ++i) {
    if (measured[i]) values[i] = std::move(measured[i]);
  }
  values[static_cast<std::size_t>(DriveTestColumn::NetworkMode)] = mode;
  return DriveTestRow{.line = record.line, .time = *time, .family = *family, .values = values};
}

DriveTestLog::Values DriveTestLog::measuredValues(const CsvRecord& record) {
  Values values;
  for (const auto& column : kColumns) {
    const auto index = static_cast<std::size_t>(column.column);
    if (!_fieldOfColumn[index]) continue;
    const auto& text = record.fields[*_fieldOfColumn[index]];
    if (text == kNotMeasured || text.empty()) continue;
    if (text.size() <= kLongestText && isUsable(text, column.content)) {
      values[index] = text;
    } else {
      note(_problems.values,
           fmt::format("line {}: {} cannot be \"{}\"", record.line, column.name, shown(text)));
    }
  }
  return values;
}

void DriveTestLog::note(std::uint64_t& count, std::string problem) {
  ++count;
  if (_problems.first.empty()) _problems.first = std::move(problem);
}

}  // namespace kestro
