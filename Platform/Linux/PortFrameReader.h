// SPDX-License-Identifier: MIT
// Cuts the bytes that arrive on a connection into frames.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>

#include "Platform/Bytes.h"
#include "Platform/Linux/PortFrame.h"
#include "Platform/Result.h"

namespace kestro {

/// A frame in a reader's buffer: the body is valid until the reader's next `fill` or
/// `giveBackMemory`.
struct PortFrame {
  PortFrameHeader header;
  ByteView body;
};

/// The receiving half of one connection. Its buffer grows with the bytes that have arrived, never
/// because a header announces many.
class PortFrameReader {
 public:
  /// The most that one `fill` takes from the socket.
  static constexpr std::size_t kReadSize = std::size_t{256} * 1024;

  enum class FillStatus { Data, NothingYet, End };

  /// `direction`: which way the frames travel that may arrive here.
  explicit PortFrameReader(PortDirection direction) noexcept : _direction(direction) {}

  /// Reads once from a non-blocking socket. A broken connection counts as the end of the stream.
  /// Call it when `next` has no more frames: it keeps what is unread.
  [[nodiscard]] FillStatus fill(int socket);

  /// Takes the next frame. Absent when it has not arrived in full; an error when it is malformed,
  /// after which the stream is of no more use.
  [[nodiscard]] Result<std::optional<PortFrame>> next();

  /// Keeps no more of the buffer than what is unread needs: nothing of it when all was taken.
  void giveBackMemory();

  /// Forgets what is unread, too.
  void clear();

  /// Whether `next` would yield something, be it an error.
  [[nodiscard]] bool hasNext() const;

  /// How many bytes have arrived that `next` has not taken.
  [[nodiscard]] std::size_t unreadBytes() const noexcept { return _end - _begin; }

  /// How many bytes the buffer holds now.
  [[nodiscard]] std::size_t capacity() const noexcept { return _capacity; }

 private:
  [[nodiscard]] ByteView unread() const noexcept { return {_buffer.get() + _begin, unreadBytes()}; }
  void makeRoom();
  [[nodiscard]] std::size_t nextCapacity() const;
  void moveTo(std::size_t capacity);

  PortDirection _direction;
  std::unique_ptr<std::uint8_t[]> _buffer;
  std::size_t _capacity = 0;
  std::size_t _begin = 0;  ///< of the unread bytes in the buffer
  std::size_t _end = 0;
};

}  // namespace kestro
