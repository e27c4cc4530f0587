// SPDX-License-Identifier: MIT
// The bytes that wait to be written to a connection.
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>

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

  /// How many messages (no requests, no replies) have not been written whole, by their ids.
  [[nodiscard]] std::map<std::int32_t, std::size_t> waitingMessages() const;

  [[nodiscard]] std::size_t size() const noexcept { return _bytes.size() - _written; }
  [[nodiscard]] bool empty() const noexcept { return size() == 0; }

 private:
  /// Where in `_bytes` the first frame stands that has not been written whole.
  [[nodiscard]] std::size_t firstUnwritten() const;
  void forgetWritten();
  void giveBackMemory();

  Bytes _bytes;
  std::size_t _written = 0;  ///< how many of `_bytes` are written already
  Position _start = 0;       ///< of `_bytes` in the stream; a frame begins there
};

}  // namespace kestro
