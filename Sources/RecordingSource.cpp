// SPDX-License-Identifier: MIT
#include "Sources/RecordingSource.h"

#include <fmt/format.h>

#include <utility>

#include "Platform/TelephonyService.h"
#include "Sources/StreamSource.h"

namespace kestro {

Result<std::unique_ptr<RecordingSource>> RecordingSource::open(RecordedFile file,
                                                               RecordingContext context,
                                                               SourceReporter report) {
  std::unique_ptr<RecordingSource> source(
      new RecordingSource(file.path(), std::move(context), std::move(report)));
  if (auto begun = source->begin(openRecording(std::move(file), source->_context)); !begun) {
    return tl::unexpected(begun.error());
  }
  return source;
}

Result<void> RecordingSource::begin(Result<Reader> reader) {
  if (!reader) return tl::unexpected(reader.error());
  _reader = *std::move(reader);
  _first = _reader->next();
  _technology = _context.technology;
  if (!_technology.empty()) return {};
  const auto& announced = _reader->technologies();
  if (_first->has_value() && (*_first)->has_value()) {
    _technology = (**_first)->technology;
  } else if (!announced.empty()) {
    _technology = announced.front();
  } else {
    _technology = kTqLogChannelTechnology_IFX;
  }
  return {};
}

Result<SourceStep> RecordingSource::next() {
  while (true) {
    const auto message = _first ? *std::exchange(_first, std::nullopt) : _reader->next();
    if (!message) return tl::unexpected(message.error());
    if (!message->has_value()) break;
    const RecordedMessage& recorded = **message;
    const auto time = _timeline.advanceTo(recorded.time);
    if (recorded.isCut()) continue;
    if (_context.technology.empty()) _technology = recorded.technology;
    return SourceEvent{.time = time,
                       .technology = _technology,
                       .message = recorded.bytes,
                       .moment = recorded.time,
                       .comments = recorded.comments};
  }
  if (_reader->cutMessageCount() > 0) {
    _report(fmt::format("{}: {} of {} messages had been cut when they were recorded; left out",
                        _path, _reader->cutMessageCount(), _reader->messageCount()));
  }
  return SourceEnded{};
}

Result<void> RecordingSource::restart() {
  if (_path == RecordedFile::kStandardInput) return cannotBeReadTwice();
  _timeline = {};
  return begin(openRecording(_path, _context));
}

}  // namespace kestro
