// SPDX-License-Identifier: MIT
// Measurements, cells and events in a file that databases read: SQLite.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "Measurements/CellTracker.h"
#include "Measurements/Database.h"
#include "Measurements/Event.h"
#include "Measurements/MeasuredMessage.h"
#include "Measurements/Track.h"

namespace kestro {

/// A recording as the store names it.
struct StoredRecording {
  std::string sha256;       ///< of its bytes; a recording with the same one is replaced
  std::string name;         ///< as a person named it
  std::string madeUp = {};  ///< "simulation", "drive-test"; empty for what a baseband has sent
};

/// One run of writing into a store. Nothing of it is seen before `commit`; without that, however
/// the run ends, the file stays as it was.
class Store {
 public:
  /// Opens a store, or makes it. Refuses a file that is none.
  [[nodiscard]] static Result<std::unique_ptr<Store>> open(const std::string& path);
  ~Store();
  Store(const Store&) = delete;
  Store& operator=(const Store&) = delete;

  /// Begins a recording; one after the other. Failures come up at its end.
  void beginRecording();
  /// All values of a message, with the cells that levels and qualities are of.
  void add(const MeasuredMessage& message, std::span<const CellValue> cellValues);
  void add(const Event& event);
  /// Where the drive was; of several places in one second the first is kept.
  void add(Moment time, const Coordinates& place, std::optional<double> speed = std::nullopt);
  /// Ends the recording: its series and cells, all of them seen by `add`. Of the recordings in the
  /// store one with the same SHA-256 goes.
  [[nodiscard]] Result<void> finishRecording(const StoredRecording& recording,
                                             const SeriesTable& series, const Cells& cells);

  /// Makes the indexes, and everything visible.
  [[nodiscard]] Result<void> commit();

 private:
  explicit Store(const std::string& path);
  struct Statements;

  [[nodiscard]] Result<void> begin();
  [[nodiscard]] std::int64_t nextId(const char* sql);
  void addValue(const MeasuredMessage& message, const MeasuredValue& value,
                const CellValue* cellValue);
  void removeRecording(const std::string& sha256);
  void addSeries(const SeriesTable& series);
  void addCells(const Cells& cells);

  std::string _path;
  bool _isNew = false;
  bool _isCommitted = false;
  std::unique_ptr<Database> _database;
  std::unique_ptr<Statements> _statements;
  std::int64_t _recording = 0;
  std::int64_t _firstSeries = 0;
  std::int64_t _firstCell = 0;
  std::vector<std::uint8_t> _quantities;      ///< by a series' number in its recording
  std::vector<const CellValue*> _cellValues;  ///< of the message that is added, by its values
  std::uint64_t _messages = 0;
  std::optional<Moment> _first;
  std::optional<Moment> _last;
  std::optional<std::int64_t> _lastPositionSecond;
};

}  // namespace kestro
