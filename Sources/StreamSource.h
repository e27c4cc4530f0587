// SPDX-License-Identifier: MIT
// The source that reads messages from a stream, as a bridge to a live baseband writes them.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/InputStream.h"
#include "Sources/LogSource.h"

namespace kestro {

/// Yields the messages of a stream as they arrive. Each is framed by its length in 4 bytes, least
/// significant byte first; a length of 0 only says that the writer is still there, and yields
/// nothing. A length above kMaximumMessageSize, or an end within a message, is an error: behind it
/// no frame can be found.
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
  void takeLengthByte(std::uint8_t byte);
  void fail(std::string message);
  [[nodiscard]] bool isStopped() const noexcept { return _error || _ended; }

  InputStreams& _streams;
  std::string _path;
  std::string_view _technology;
  std::function<void()> _ready;
  std::unique_ptr<InputStream> _stream;

  /// The frame that is arriving: first its length, then that many bytes.
  Bytes _lengthBytes;
  std::optional<std::size_t> _length;
  Bytes _arriving;
  /// Where that frame begins, counted from the beginning of the stream.
  std::uint64_t _frameOffset = 0;

  std::deque<Bytes> _messages;
  Bytes _message;
  bool _ended = false;
  std::optional<Error> _error;
};

}  // namespace kestro
