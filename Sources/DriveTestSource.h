// SPDX-License-Identifier: MIT
// The source that plays a drive-test log.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Sources/DriveTestLog.h"
#include "Sources/LogSource.h"
#include "Sources/RecordedTimeline.h"

namespace kestro {

/// Writes the rows of a drive-test log as one technology's messages.
class DriveTestEncoder {
 public:
  DriveTestEncoder() = default;
  virtual ~DriveTestEncoder() = default;
  DriveTestEncoder(const DriveTestEncoder&) = delete;
  DriveTestEncoder& operator=(const DriveTestEncoder&) = delete;

  /// The technology of the messages; a constant text of Platform/TelephonyService.h.
  [[nodiscard]] virtual std::string_view technology() const = 0;

  /// The messages that say what `row` says, in order; none when the technology cannot say it.
  [[nodiscard]] virtual std::vector<Bytes> messages(const DriveTestRow& row) = 0;

  /// How many messages were left out so far because they cannot hold a value of their row.
  [[nodiscard]] virtual std::uint64_t leftOutCount() const { return 0; }
};

/// Yields a drive-test log's rows at their times. The log counts in seconds: the rows of one second
/// are spread evenly over it.
class DriveTestSource : public LogSource {
 public:
  /// So many rows of one second are spread together; a log with more is damaged, and its further
  /// rows begin anew at that second.
  static constexpr std::size_t kMaximumRowsOfASecond = 1'000;

  /// Makes the encoder of a log whose first usable row is of this family (LTE where there is none).
  using MakeEncoder = std::function<std::unique_ptr<DriveTestEncoder>(DriveTestFamily first)>;

  /// A source of the log in a file that is unread still. Missing columns and unusable rows are told
  /// to `report`. The comment of a message is its row's position.
  [[nodiscard]] static Result<std::unique_ptr<DriveTestSource>> open(RecordedFile file,
                                                                     const MakeEncoder& makeEncoder,
                                                                     SourceReporter report);

  [[nodiscard]] std::string_view technology() const override { return _encoder->technology(); }
  [[nodiscard]] Result<SourceStep> next() override;
  [[nodiscard]] std::string_view madeUp() const noexcept override { return kMadeUpFromDriveTest; }
  [[nodiscard]] std::optional<double> fractionRead() const noexcept override {
    return _log.fractionRead();
  }
  [[nodiscard]] Result<void> restart() override;

 private:
  struct TimedRow {
    std::chrono::microseconds time;
    Moment moment;  ///< the log's own, whatever its zone, as if that were GMT
    DriveTestRow row;
  };

  DriveTestSource(std::string path, DriveTestLog log, std::optional<DriveTestRow> first,
                  std::unique_ptr<DriveTestEncoder> encoder, SourceReporter report);
  [[nodiscard]] Result<void> readSecond();
  void reportProblems();

  std::string _path;
  DriveTestLog _log;
  std::unique_ptr<DriveTestEncoder> _encoder;
  SourceReporter _report;
  RecordedTimeline _timeline;
  std::optional<DriveTestRow> _rowOfNextSecond;
  std::deque<TimedRow> _rows;
  std::chrono::microseconds _time{0};
  Moment _moment{};
  std::deque<Bytes> _messages;
  Bytes _message;
  std::vector<std::string> _comments;  ///< of the row
};

}  // namespace kestro
