// SPDX-License-Identifier: MIT
// Bytes that arrive at a port, in pieces of any size.
#include <sys/socket.h>
#include <unistd.h>

#include <array>

#include "Fuzz/Harness.h"
#include "Platform/Linux/PortFrameReader.h"

namespace kestro::fuzz {
namespace {

/// Takes what is there; false when the stream is of no more use.
bool takeFrames(PortFrameReader& reader) {
  for (;;) {
    const auto frame = reader.next();
    if (!frame) return false;
    if (!*frame) return true;
    require((*frame)->body.size() <= reader.capacity(), "a body lies in the buffer");
  }
}

void readAll(Input& input, PortDirection direction, const std::array<int, 2>& sockets) {
  PortFrameReader reader(direction);
  while (!input.isAtEnd()) {
    const ByteView piece = input.bytes(input.byte() + std::size_t{1});
    if (::send(sockets[0], piece.data(), piece.size(), MSG_NOSIGNAL) < 0) return;
    static_cast<void>(reader.fill(sockets[1]));
    if (!takeFrames(reader)) return;
    require(reader.capacity() <= 2 * PortFrameReader::kReadSize + reader.unreadBytes() * 2,
            "a buffer grows with what has arrived only");
  }
}

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  std::array<int, 2> sockets{};
  if (::socketpair(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK, 0, sockets.data()) != 0) return;
  const auto direction =
      (input.byte() & 1) != 0 ? PortDirection::ToReceiver : PortDirection::ToSender;
  readAll(input, direction, sockets);
  ::close(sockets[0]);
  ::close(sockets[1]);
}

}  // namespace kestro::fuzz
