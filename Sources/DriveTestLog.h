// SPDX-License-Identifier: MIT
// Drive-test logs as phone apps write them: one row of measurements about once a second.
#pragma once

#include <array>
#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Result.h"
#include "Recordings/RecordedFile.h"
#include "Sources/CsvReader.h"
#include "Sources/RecordedFileStream.h"

namespace kestro {

/// What a row of a log can hold. The columns are found by the names in the log's first line, in any
/// order; DriveTestLog.cpp names them.
enum class DriveTestColumn : std::uint8_t {
  Timestamp,
  NetworkMode,
  Level,    ///< RSRP; RSCP in UMTS modes, the received level in GSM modes (dBm)
  Quality,  ///< RSRQ; Ec/N0 in UMTS modes (dB)
  SignalToNoise,
  TotalPower,  ///< RSSI (dBm)
  ChannelQuality,
  NeighbourLevel,
  NeighbourQuality,
  DownlinkRate,  ///< kbit/s
  UplinkRate,
  CellId,
  Cell,  ///< hexadecimal, as Node and Area are
  Node,
  Area,
  RawCellId,
  Operator,
  State,
  Longitude,
  Latitude,
  Speed,  ///< km/h
};
inline constexpr std::size_t kDriveTestColumnCount = 21;

/// The technology that a row's network mode belongs to.
enum class DriveTestFamily : std::uint8_t { GSM, UMTS, LTE };
inline constexpr std::size_t kDriveTestFamilyCount = 3;

/// What people call the family: "GSM", "UMTS", "LTE".
[[nodiscard]] std::string_view nameOf(DriveTestFamily family) noexcept;

/// The family of a network mode as the logs name it ("HSPA+"); absent for an unknown name. 5G
/// counts as LTE: it is anchored there.
[[nodiscard]] std::optional<DriveTestFamily> familyOfNetworkMode(std::string_view mode) noexcept;

/// One usable row.
struct DriveTestRow {
  std::uint64_t line = 0;
  /// The row's second, in the log's own time zone.
  std::chrono::sys_seconds time;
  DriveTestFamily family = DriveTestFamily::LTE;
  std::array<std::optional<std::string>, kDriveTestColumnCount> values;

  /// The column's text as the log has it; absent when there is none and never was one in a row of
  /// this family.
  [[nodiscard]] const std::optional<std::string>& text(DriveTestColumn column) const {
    return values[static_cast<std::size_t>(column)];
  }
};

/// What could not be used, and why the first of it could not.
struct DriveTestProblems {
  std::uint64_t rows = 0;
  std::uint64_t values = 0;
  std::string first;
};

/// Whether what begins with `head` is a drive-test log: the first line has the required columns
/// (time, network mode, level). `head` need not reach to that line's end.
[[nodiscard]] bool isDriveTestLog(ByteView head);

/// As many bytes as `isDriveTestLog` looks at.
inline constexpr std::size_t kDriveTestHeadSize = 4096;

/// A log that is being read from its beginning to its end, in constant memory.
class DriveTestLog {
 public:
  /// Opens a log ("-" is standard input) and reads its first line. The error says why it cannot be
  /// used: no such file, empty, no CSV, or a required column (time, network mode, level) is
  /// missing.
  [[nodiscard]] static Result<DriveTestLog> open(const std::string& path);
  /// The same for a file that is unread still.
  [[nodiscard]] static Result<DriveTestLog> open(RecordedFile file);

  /// The next usable row, or nothing at the end. A row that cannot be used (its number of fields
  /// differs from the first line's, its time or network mode is unreadable) is left out; a value
  /// that is no usable number counts as not measured. Both are counted. A value that was not
  /// measured ("-", or nothing) keeps the last one of the row's family, a network mode the last
  /// row's. An error means that the system could read no further.
  [[nodiscard]] Result<std::optional<DriveTestRow>> next();

  [[nodiscard]] const DriveTestProblems& problems() const noexcept { return _problems; }

  /// How much of it has been read, 0 to 1; absent when nobody knows.
  [[nodiscard]] std::optional<double> fractionRead() const noexcept {
    return _file->file().fractionRead();
  }

  /// The names of the columns that the log does not have.
  [[nodiscard]] const std::vector<std::string>& missingColumns() const noexcept {
    return _missingColumns;
  }

 private:
  using Values = std::array<std::optional<std::string>, kDriveTestColumnCount>;

  explicit DriveTestLog(RecordedFile file);
  [[nodiscard]] Result<void> readFirstLine();
  [[nodiscard]] Result<DriveTestRow> rowOf(const CsvRecord& record);
  [[nodiscard]] Values measuredValues(const CsvRecord& record);
  void note(std::uint64_t& count, std::string problem);

  std::string _path;
  std::unique_ptr<RecordedFileStream> _file;
  std::unique_ptr<CsvReader> _csv;
  std::size_t _fieldCount = 0;
  std::array<std::optional<std::size_t>, kDriveTestColumnCount> _fieldOfColumn;
  std::vector<std::string> _missingColumns;
  std::optional<std::string> _lastMode;
  std::array<Values, kDriveTestFamilyCount> _lastValues;
  DriveTestProblems _problems;
};

}  // namespace kestro
