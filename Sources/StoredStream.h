// SPDX-License-Identifier: MIT
// The source that reads messages from a stream and waits for them.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Recordings/RecordedFile.h"
#include "Sources/LogSource.h"
#include "Sources/StreamFraming.h"

namespace kestro {

/// Yields the messages of a stream as StreamSource does, for those who have no event loop: `next`
/// reads, and waits where the stream is a pipe.
class StoredStream : public LogSource {
 public:
  /// Opens `path` ("-" is standard input). `technology` is a constant text of
  /// Platform/TelephonyService.h.
  [[nodiscard]] static Result<std::unique_ptr<StoredStream>> open(const std::string& path,
                                                                  std::string_view technology);

  [[nodiscard]] std::string_view technology() const override { return _technology; }
  [[nodiscard]] Result<SourceStep> next() override;
  [[nodiscard]] std::optional<double> fractionRead() const noexcept override {
    return _file.fractionRead();
  }
  /// Opens the path again; standard input cannot be read twice.
  [[nodiscard]] Result<void> restart() override;

 private:
  StoredStream(RecordedFile file, std::string_view technology)
      : _file(std::move(file)), _technology(technology) {}

  /// Reads what is there; false at the end.
  [[nodiscard]] Result<bool> readMore();

  RecordedFile _file;
  std::string_view _technology;
  StreamFraming _framing;
  Bytes _message;
};

}  // namespace kestro
