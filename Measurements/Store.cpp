// SPDX-License-Identifier: MIT
#include "Measurements/Store.h"

#include <fmt/format.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>

#include "Measurements/StoreSchema.h"

namespace kestro {
namespace {

constexpr std::uint8_t kLevelQuantity = 1;
constexpr std::uint8_t kQualityQuantity = 2;

std::int64_t microseconds(Moment time) { return time.time_since_epoch().count(); }

std::optional<double> seconds(const std::optional<std::chrono::microseconds>& duration) {
  if (!duration) return std::nullopt;
  return std::chrono::duration<double>(*duration).count();
}

std::string_view nameOfKind(SeriesKind kind) {
  switch (kind) {
    case SeriesKind::Number:
      return "number";
    case SeriesKind::State:
      return "state";
    case SeriesKind::Text:
      return "text";
  }
  return {};
}

void bindText(Statement& statement, std::string_view text) {
  if (text.empty()) {
    statement.bindNull();
  } else {
    statement.bind(text);
  }
}

void bindSummary(Statement& statement, const LevelSummary& summary) {
  if (summary.count() == 0) {
    for (int i = 0; i < 4; ++i) statement.bindNull();
  } else {
    statement.bind(summary.last()).bind(summary.least());
    statement.bind(summary.median()).bind(summary.greatest());
  }
  statement.bind(static_cast<std::int64_t>(summary.count()));
}

std::optional<std::int64_t> idOf(std::int64_t first, std::optional<CellId> cell) {
  if (!cell) return std::nullopt;
  return first + *cell;
}

bool isAlarm(EventKind kind) { return kind == EventKind::Alarm || kind == EventKind::AlarmOver; }

}  // namespace

struct Store::Statements {
  Statement measurement;
  Statement event;
  Statement position;

  explicit Statements(Database& database)
      : measurement(database, "INSERT INTO measurement VALUES (?, ?, ?, ?, ?, ?, ?, ?)"),
        event(database,
              "INSERT INTO event VALUES (NULL, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)"),
        position(database, "INSERT OR IGNORE INTO position VALUES (?, ?, ?, ?, ?)") {}
};

Store::Store(const std::string& path) : _path(path) {
  std::error_code ignored;
  _isNew = !std::filesystem::exists(path, ignored);
  _database = std::make_unique<Database>(path);
}

Store::~Store() {
  if (!_isCommitted) _database->execute("ROLLBACK");
  _statements.reset();
  _database.reset();
  if (_isNew && !_isCommitted) std::remove(_path.c_str());
}

Result<std::unique_ptr<Store>> Store::open(const std::string& path) {
  std::unique_ptr<Store> store(new Store(path));
  if (auto begun = store->begin(); !begun) return tl::unexpected(begun.error());
  return store;
}

Result<void> Store::begin() {
  _database->execute("BEGIN IMMEDIATE");
  const auto pragma = [&](const char* sql) { return Statement(*_database, sql).number(); };
  const auto application = pragma("PRAGMA application_id");
  const auto version = pragma("PRAGMA user_version");
  const auto tables = pragma("SELECT count(*) FROM sqlite_schema");
  if (auto state = _database->state(); !state) return state;
  if (tables == 0) {
    _database->execute(kStoreTables);
    _database->execute(kStoreViews);
    _database->execute(fmt::format("PRAGMA application_id = {}; PRAGMA user_version = {}",
                                   kStoreApplication, kStoreVersion)
                           .c_str());
  } else if (application != kStoreApplication) {
    return failure(fmt::format("{}: not a store of measurements", _path));
  } else if (version != kStoreVersion) {
    return failure(fmt::format("{}: a store of version {}, this program writes version {}", _path,
                               *version, kStoreVersion));
  }
  _database->execute(kDropStoreIndexes);
  _statements = std::make_unique<Statements>(*_database);
  return _database->state();
}

std::int64_t Store::nextId(const char* sql) {
  return Statement(*_database, sql).number().value_or(0) + 1;
}

void Store::beginRecording() {
  _recording = nextId("SELECT max(id) FROM recording");
  _firstSeries = nextId("SELECT max(id) FROM series");
  _firstCell = nextId("SELECT max(id) FROM cell");
  _quantities.clear();
  _messages = 0;
  _first = _last = std::nullopt;
  _lastPositionSecond = std::nullopt;
}

void Store::add(const MeasuredMessage& message, std::span<const CellValue> cellValues) {
  ++_messages;
  _first = std::min(_first.value_or(message.time), message.time);
  _last = std::max(_last.value_or(message.time), message.time);
  const auto& values = message.measured.values;
  _cellValues.assign(values.size(), nullptr);
  for (const CellValue& value : cellValues) _cellValues[value.at] = &value;
  for (std::size_t i = 0; i < values.size(); ++i) addValue(message, values[i], _cellValues[i]);
}

void Store::addValue(const MeasuredMessage& message, const MeasuredValue& value,
                     const CellValue* cellValue) {
  const std::uint32_t series = value.series->id;
  if (series >= _quantities.size()) _quantities.resize(series + 1);
  Statement& row = _statements->measurement;
  row.bind(_firstSeries + series).bind(microseconds(message.time));
  if (value.hasNumber()) {
    row.bind(value.number);
  } else {
    row.bindNull();
  }
  TextBuffer shown;
  if (value.series->group->kind == SeriesKind::Number) {
    row.bindNull();
  } else {
    writeShown(value, shown);
    row.bind(shown.text());
  }
  row.bind(static_cast<std::int64_t>(message.number));
  if (cellValue == nullptr) {
    row.bindNull().bindNull().bindNull();
  } else {
    _quantities[series] = cellValue->isQuality ? kQualityQuantity : kLevelQuantity;
    row.bind(_firstCell + cellValue->cell);
    row.bind(std::int64_t{cellValue->isServing}).bind(std::int64_t{cellValue->isAssumed});
  }
  row.run();
}

void Store::add(const Event& event) {
  Statement& row = _statements->event;
  row.bind(_recording).bind(microseconds(event.time)).bind(nameOfEvent(event.kind));
  row.bind(std::string_view(event.technology));
  bindText(row, event.subject);
  bindText(row, event.from);
  bindText(row, event.to);
  row.bind(idOf(_firstCell, event.fromCell)).bind(idOf(_firstCell, event.toCell));
  row.bind(event.fromLevel);
  row.bind(isAlarm(event.kind) ? std::nullopt : event.toLevel);
  row.bind(isAlarm(event.kind) ? event.toLevel : std::nullopt);
  bindText(row, event.toldBy);
  bindText(row, event.connectedBy);
  row.bind(seconds(event.duration)).bind(static_cast<std::int64_t>(event.message)).run();
}

void Store::add(Moment time, const Coordinates& place, std::optional<double> speed) {
  const std::int64_t second =
      std::chrono::floor<std::chrono::seconds>(time).time_since_epoch().count();
  if (_lastPositionSecond == second) return;
  _lastPositionSecond = second;
  _statements->position.bind(_recording)
      .bind(microseconds(time))
      .bind(place.latitude)
      .bind(place.longitude)
      .bind(speed)
      .run();
}

Result<void> Store::finishRecording(const StoredRecording& recording, const SeriesTable& series,
                                    const Cells& cells) {
  removeRecording(recording.sha256);
  Statement row(*_database, "INSERT INTO recording VALUES (?, ?, ?, ?, ?, ?, ?)");
  row.bind(_recording).bind(std::string_view(recording.sha256));
  row.bind(std::string_view(recording.name));
  bindText(row, recording.madeUp);
  row.bind(static_cast<std::int64_t>(_messages));
  row.bind(_first ? std::optional(microseconds(*_first)) : std::nullopt);
  row.bind(_last ? std::optional(microseconds(*_last)) : std::nullopt).run();
  addSeries(series);
  addCells(cells);
  return _database->state();
}

void Store::removeRecording(const std::string& sha256) {
  const auto old = Statement(*_database, "SELECT id FROM recording WHERE sha256 = ?")
                       .bind(std::string_view(sha256))
                       .number();
  if (!old) return;
  constexpr const char* kDeleteValues =
      "DELETE FROM measurement WHERE series IN (SELECT id FROM series WHERE recording = ?)";
  for (const char* sql :
       {kDeleteValues, "DELETE FROM series WHERE recording = ?",
        "DELETE FROM cell WHERE recording = ?", "DELETE FROM event WHERE recording = ?",
        "DELETE FROM position WHERE recording = ?", "DELETE FROM recording WHERE id = ?"}) {
    Statement(*_database, sql).bind(*old).run();
  }
}

void Store::addSeries(const SeriesTable& series) {
  constexpr std::string_view kQuantityNames[] = {"", "level", "quality"};
  Statement row(*_database, "INSERT INTO series VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?)");
  for (const Series& one : series.all()) {
    const SeriesGroup& group = *one.group;
    row.bind(_firstSeries + one.id).bind(_recording).bind(std::string_view(group.technology));
    row.bind(std::string_view(group.section)).bind(std::string_view(group.key));
    bindText(row, one.itemText());
    bindText(row, group.unit);
    row.bind(nameOfKind(group.kind));
    bindText(row, kQuantityNames[one.id < _quantities.size() ? _quantities[one.id] : 0]);
    row.run();
  }
}

void Store::addCells(const Cells& cells) {
  Statement row(*_database,
                "INSERT INTO cell VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, "
                "?, ?, ?, ?, ?, ?, ?, ?)");
  std::int64_t id = _firstCell;
  for (const Cell& cell : cells.all()) {
    const std::string name = textOf(cell.name);
    const ChannelBand band = cell.band();
    row.bind(id++).bind(_recording).bind(nameOfRadio(cell.name.radio)).bind(std::string_view(name));
    row.bind(cell.name.identity).bind(cell.baseStation()).bind(cell.sector());
    row.bind(cell.channel).bind(cell.physical);
    bindText(row, band.band);
    row.bind(band.downlinkKHz ? std::optional(*band.downlinkKHz / 1000.0) : std::nullopt);
    row.bind(cell.area);
    bindText(row, cell.network);
    bindSummary(row, cell.level);
    bindSummary(row, cell.quality);
    row.bind(microseconds(cell.firstSeen)).bind(microseconds(cell.lastSeen));
    row.bind(std::chrono::duration<double>(cell.served).count());
    row.bind(std::int64_t{cell.isAssumed}).run();
  }
}

Result<void> Store::commit() {
  _statements.reset();
  _database->execute(kMakeStoreIndexes);
  _database->execute("COMMIT");
  auto state = _database->state();
  _isCommitted = state.has_value();
  return state;
}

}  // namespace kestro
