// SPDX-License-Identifier: MIT
// The source that reads messages from a stream, as a bridge to a live baseband writes them.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/InputStream.h"
#include "Sources/LogSource.h"
#include "Sources/StreamFraming.h"

namespace kestro {

/// What is wrong with the stream of that path.
[[nodiscard]] tl::unexpected<Error> streamFailure(const std::string& path, std::string_view what);

/// The error of reading standard input from its beginning once more.
[[nodiscard]] tl::unexpected<Error> cannotBeReadTwice();

/// Yields the messages of a stream as they arrive; StreamFraming says how they are told apart.
class StreamSource : public LogSource {
 public:
  /// Opens `path` ("-" is standard input). `technology` is a constant text of
  /// Platform/TelephonyService.h. `streams` must outlive the source.
  [[nodiscard]] static Result<std::unique_ptr<StreamSource>> open(InputStreams& streams,
                                                                  std::string path,
                                                                  std::string_view technology);

  [[nodiscard]] std::string_view technology() const override { return _technology; }
  [[nodiscard]] Result<SourceStep> next() override;
  /// Opens the path again; standard input cannot be read twice.
  [[nodiscard]] Result<void> restart() override;
  void setReadyHandler(std::function<void()> handler) override { _ready = std::move(handler); }

 private:
  StreamSource(InputStreams& streams, std::string path, std::string_view technology);
  [[nodiscard]] Result<void> openStream();
  void receive(ByteView bytes);
  void end(std::string_view reason);
  [[nodiscard]] bool isStopped() const noexcept { return _framing.error() || _ended; }

  InputStreams& _streams;
  std::string _path;
  std::string_view _technology;
  std::function<void()> _ready;
  std::unique_ptr<InputStream> _stream;

  StreamFraming _framing;
  Bytes _message;
  bool _ended = false;
  std::string _reason;  ///< why it ended
};

}  // namespace kestro
