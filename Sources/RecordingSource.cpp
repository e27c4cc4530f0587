// SPDX-License-Identifier: MIT
#include "Sources/RecordingSource.h"

#include <fmt/format.h>

#include <utility>

namespace kestro {

Result<std::unique_ptr<RecordingSource>> RecordingSource::open(const std::string& path,
                                                               std::string_view technology,
                                                               SourceReporter report) {
  auto reader = PcapReader::open(path);
  if (!reader) return tl::unexpected(reader.error());
  if (technology.empty()) technology = reader->technology();
  return std::unique_ptr<RecordingSource>(
      new RecordingSource(path, std::move(*reader), technology, std::move(report)));
}

RecordingSource::RecordingSource(std::string path, PcapReader reader, std::string_view technology,
                                 SourceReporter report)
    : _path(std::move(path)),
      _reader(std::move(reader)),
      _technology(technology),
      _report(std::move(report)) {}

Result<SourceStep> RecordingSource::next() {
  while (true) {
    const auto message = _reader.next();
    if (!message) return tl::unexpected(message.error());
    if (!message->has_value()) break;
    const auto time = _timeline.advanceTo((*message)->time);
    if ((*message)->isCut()) continue;
    return SourceEvent{.time = time,
                       .technology = _technology,
                       .message = (*message)->bytes,
                       .moment = (*message)->time};
  }
  if (_reader.cutMessageCount() > 0) {
    _report(fmt::format("{}: {} of {} messages had been cut when they were recorded; left out",
                        _path, _reader.cutMessageCount(), _reader.messageCount()));
  }
  return SourceEnded{};
}

Result<void> RecordingSource::restart() {
  auto reader = PcapReader::open(_path);
  if (!reader) return tl::unexpected(reader.error());
  _reader = std::move(*reader);
  _timeline = {};
  return {};
}

}  // namespace kestro
