// SPDX-License-Identifier: MIT
// The source that plays a recording.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "Recordings/OpenRecording.h"
#include "Sources/LogSource.h"
#include "Sources/RecordedTimeline.h"

namespace kestro {

/// Yields a recording's messages with the pauses between them. A message that the recorder had cut
/// is left out; how many were is reported at the end of the recording.
class RecordingSource : public LogSource {
 public:
  /// Opens the recording in a file that is unread still. The context's technology, unless empty,
  /// replaces those that the recording names.
  [[nodiscard]] static Result<std::unique_ptr<RecordingSource>> open(RecordedFile file,
                                                                     RecordingContext context,
                                                                     SourceReporter report);

  [[nodiscard]] std::string_view technology() const override { return _technology; }
  [[nodiscard]] Result<SourceStep> next() override;
  [[nodiscard]] std::string_view madeUp() const noexcept override { return _reader->madeUp(); }
  [[nodiscard]] Result<void> restart() override;

 private:
  using Reader = std::unique_ptr<RecordingReader>;

  RecordingSource(std::string path, RecordingContext context, SourceReporter report)
      : _path(std::move(path)), _context(std::move(context)), _report(std::move(report)) {}

  /// Begins with the first message, which says what the recording speaks.
  [[nodiscard]] Result<void> begin(Result<Reader> reader);

  std::string _path;
  RecordingContext _context;
  SourceReporter _report;
  Reader _reader;
  std::string_view _technology;
  std::optional<Result<std::optional<RecordedMessage>>> _first;
  RecordedTimeline _timeline;
};

}  // namespace kestro
