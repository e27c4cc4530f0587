// SPDX-License-Identifier: MIT
// The source that plays a recorded capture.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Recordings/PcapReader.h"
#include "Sources/LogSource.h"
#include "Sources/RecordedTimeline.h"

namespace kestro {

/// Yields a capture's messages with the pauses between them. A message that the recorder had cut is
/// left out; how many were is reported at the end of the capture.
class RecordingSource : public LogSource {
 public:
  /// Opens the capture. `technology`, unless empty, replaces the one that the file's link type
  /// names; it must be a constant text of Platform/TelephonyService.h.
  [[nodiscard]] static Result<std::unique_ptr<RecordingSource>> open(const std::string& path,
                                                                     std::string_view technology,
                                                                     SourceReporter report);

  [[nodiscard]] std::string_view technology() const override { return _technology; }
  [[nodiscard]] Result<SourceStep> next() override;
  [[nodiscard]] Result<void> restart() override;

 private:
  RecordingSource(std::string path, PcapReader reader, std::string_view technology,
                  SourceReporter report);

  std::string _path;
  PcapReader _reader;
  std::string_view _technology;
  SourceReporter _report;
  RecordedTimeline _timeline;
};

}  // namespace kestro
