// SPDX-License-Identifier: MIT
#include "Sources/DriveTestSource.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <utility>

#include "Recordings/PositionComment.h"

namespace kestro {
namespace {

std::vector<std::string> commentsOf(const DriveTestRow& row) {
  const auto& latitude = row.text(DriveTestColumn::Latitude);
  const auto& longitude = row.text(DriveTestColumn::Longitude);
  if (!latitude || !longitude) return {};
  return {positionComment(*latitude, *longitude, row.text(DriveTestColumn::Speed).value_or(""))};
}

}  // namespace

Result<std::unique_ptr<DriveTestSource>> DriveTestSource::open(RecordedFile file,
                                                               const MakeEncoder& makeEncoder,
                                                               SourceReporter report) {
  const std::string path = file.path();
  auto log = DriveTestLog::open(std::move(file));
  if (!log) return tl::unexpected(log.error());
  if (const auto& missing = log->missingColumns(); !missing.empty()) {
    report(fmt::format("{}: no columns {}; their values are left out", path,
                       fmt::join(missing, ", ")));
  }
  auto first = log->next();
  if (!first) return tl::unexpected(first.error());
  auto encoder = makeEncoder(first->has_value() ? (*first)->family : DriveTestFamily::LTE);
  return std::unique_ptr<DriveTestSource>(new DriveTestSource(
      path, std::move(*log), std::move(*first), std::move(encoder), std::move(report)));
}

DriveTestSource::DriveTestSource(std::string path, DriveTestLog log,
                                 std::optional<DriveTestRow> first,
                                 std::unique_ptr<DriveTestEncoder> encoder, SourceReporter report)
    : _path(std::move(path)),
      _log(std::move(log)),
      _encoder(std::move(encoder)),
      _report(std::move(report)),
      _rowOfNextSecond(std::move(first)) {}

Result<SourceStep> DriveTestSource::next() {
  while (_messages.empty()) {
    if (_rows.empty()) {
      if (auto read = readSecond(); !read) return tl::unexpected(read.error());
      if (_rows.empty()) {
        reportProblems();
        return SourceEnded{};
      }
    }
    const TimedRow timed = std::move(_rows.front());
    _rows.pop_front();
    _time = timed.time;
    _moment = timed.moment;
    _comments = commentsOf(timed.row);
    auto messages = _encoder->messages(timed.row);
    std::ranges::move(messages, std::back_inserter(_messages));
  }
  _message = std::move(_messages.front());
  _messages.pop_front();
  return SourceEvent{.time = _time,
                     .technology = _encoder->technology(),
                     .message = _message,
                     .moment = _moment,
                     .comments = _comments};
}

Result<void> DriveTestSource::readSecond() {
  std::vector<DriveTestRow> rows;
  if (_rowOfNextSecond) rows.push_back(*std::exchange(_rowOfNextSecond, std::nullopt));
  while (rows.size() < kMaximumRowsOfASecond) {
    auto row = _log.next();
    if (!row) return tl::unexpected(row.error());
    if (!row->has_value()) break;
    if (!rows.empty() && (*row)->time != rows.front().time) {
      _rowOfNextSecond = std::move(*row);
      break;
    }
    rows.push_back(std::move(**row));
  }
  if (rows.empty()) return {};
  // Where the log's clock was set back, its second lies before rows that are spread already.
  const auto begin = std::max(_timeline.advanceTo(rows.front().time), _time);
  const auto count = static_cast<std::int64_t>(rows.size());
  for (std::int64_t i = 0; i < count; ++i) {
    const auto share = std::chrono::microseconds(std::chrono::seconds(1)) * i / count;
    auto& row = rows[static_cast<std::size_t>(i)];
    _rows.push_back({begin + share, row.time + share, std::move(row)});
  }
  return {};
}

void DriveTestSource::reportProblems() {
  if (const auto count = _encoder->leftOutCount(); count > 0) {
    _report(fmt::format("{}: {} packets were left out, as they cannot hold a value of their row",
                        _path, count));
  }
  const auto& problems = _log.problems();
  if (problems.rows == 0 && problems.values == 0) return;
  _report(fmt::format("{}: {} rows and {} values could not be used; the first: {}", _path,
                      problems.rows, problems.values, problems.first));
}

Result<void> DriveTestSource::restart() {
  auto log = DriveTestLog::open(_path);
  if (!log) return tl::unexpected(log.error());
  _log = std::move(*log);
  _timeline = {};
  _rowOfNextSecond.reset();
  _rows.clear();
  _time = {};
  _messages.clear();
  return {};
}

}  // namespace kestro
