// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortSendQueue.h"

#include <sys/socket.h>

#include <cerrno>

namespace kestro {
namespace {

/// What an idle queue may keep allocated.
constexpr std::size_t kKeptCapacity = std::size_t{256} * 1024;

}  // namespace

PortSendQueue::Position PortSendQueue::append(PortFrameHeader header, ByteView body) {
  if (_written > _bytes.size() / 2) forgetWritten();
  const Position position = _start + _bytes.size();
  header.length = static_cast<std::uint32_t>(body.size());
  const PortFrameHeaderBytes encoded = encodePortFrameHeader(header);
  _bytes.insert(_bytes.end(), encoded.begin(), encoded.end());
  _bytes.insert(_bytes.end(), body.begin(), body.end());
  return position;
}

void PortSendQueue::withdraw(Position position) {
  if (position < _start + _written) return;
  _bytes.resize(static_cast<std::size_t>(position - _start));
  if (empty()) giveBackMemory();
}

PortSendQueue::FlushStatus PortSendQueue::flush(int socket) {
  while (!empty()) {
    const ssize_t count = ::send(socket, _bytes.data() + _written, size(), MSG_NOSIGNAL);
    if (count >= 0) {
      _written += static_cast<std::size_t>(count);
    } else if (errno != EINTR) {
      const bool blocked = errno == EAGAIN || errno == EWOULDBLOCK;
      return blocked ? FlushStatus::Blocked : FlushStatus::Broken;
    }
  }
  giveBackMemory();
  return FlushStatus::Empty;
}

void PortSendQueue::forgetWritten() {
  _bytes.erase(_bytes.begin(), _bytes.begin() + static_cast<std::ptrdiff_t>(_written));
  _start += _written;
  _written = 0;
}

void PortSendQueue::giveBackMemory() {
  forgetWritten();
  if (_bytes.capacity() > kKeptCapacity) _bytes = Bytes();
}

}  // namespace kestro
