// SPDX-License-Identifier: MIT
// Taking the bytes of a stream apart into messages.
#pragma once

#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <utility>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// Each message is framed by its length in 4 bytes, least significant byte first; a length of 0
/// only says that the writer is still there, and yields nothing. A length above
/// kMaximumMessageSize, or an end within a message, is an error: behind it no frame can be found.
class StreamFraming {
 public:
  /// Takes bytes as they arrive, in pieces of any size; none behind an error.
  void receive(ByteView bytes);

  /// Says that the stream has come to its end.
  void end();

  [[nodiscard]] bool hasMessage() const noexcept { return !_messages.empty(); }
  /// The next whole message, which there must be.
  [[nodiscard]] Bytes take();

  /// What is wrong with the stream; it counts when the messages before it are taken.
  [[nodiscard]] const std::optional<std::string>& error() const noexcept { return _error; }

 private:
  void takeLengthByte(std::uint8_t byte);

  /// The frame that is arriving: first its length, then that many bytes.
  Bytes _lengthBytes;
  std::optional<std::size_t> _length;
  Bytes _arriving;
  /// Where that frame begins, counted from the beginning of the stream.
  std::uint64_t _frameOffset = 0;
  std::deque<Bytes> _messages;
  std::optional<std::string> _error;
};

}  // namespace kestro
