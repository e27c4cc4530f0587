// SPDX-License-Identifier: MIT
// The bytes that wait to be written to a connection.
#pragma once

#include <cstddef>
#include <cstdint>

#include "Platform/Bytes.h"
#include "Platform/Linux/PortFrame.h"

namespace kestro {

/// The sending half of one connection: whole frames go in, bytes go out as the system takes them.
/// The queue sets itself no limit.
class PortSendQueue {
 public:
  /// A frame's place in the stream of all bytes ever queued.
  using Position = std::uint64_t;

  enum class FlushStatus { Empty, Blocked, Broken };

  /// Queues a frame; the header's length is set to the body's.
  Position append(PortFrameHeader header, ByteView body);

  /// Takes back the frame at `position`, the last one appended, if no byte of it has been written.
  void withdraw(Position position);

  /// Writes to a non-blocking socket until nothing is left or the system takes no more.
  [[nodiscard]] FlushStatus flush(int socket);

  [[nodiscard]] std::size_t size() const noexcept { return _bytes.size() - _written; }
  [[nodiscard]] bool empty() const noexcept { return size() == 0; }

 private:
  void forgetWritten();
  void giveBackMemory();

  Bytes _bytes;
  std::size_t _written = 0;  ///< how many of `_bytes` are written already
  Position _start = 0;       ///< of `_bytes` in the stream
};

}  // namespace kestro
