// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortSendQueue.h"

#include <sys/socket.h>

#include <cerrno>

namespace kestro {
namespace {

/// What an idle queue may keep allocated.
constexpr std::size_t kKeptCapacity = std::size_t{256} * 1024;

std::size_t frameSize(ByteView bytes, std::size_t at) {
  return PortFrameHeader::kSize +
         loadLittleEndian<std::uint32_t>(bytes, at + PortFrameHeader::kLengthOffset);
}

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

std::map<std::int32_t, std::size_t> PortSendQueue::waitingMessages() const {
  std::map<std::int32_t, std::size_t> counts;
  for (std::size_t at = firstUnwritten(); at < _bytes.size(); at += frameSize(_bytes, at)) {
    if (_bytes[at + PortFrameHeader::kKindOffset] != std::uint8_t(PortFrameKind::Message)) continue;
    const auto id = loadLittleEndian<std::uint32_t>(_bytes, at + PortFrameHeader::kMessageIdOffset);
    ++counts[static_cast<std::int32_t>(id)];
  }
  return counts;
}

std::size_t PortSendQueue::firstUnwritten() const {
  std::size_t at = 0;
  while (at < _bytes.size() && at + frameSize(_bytes, at) <= _written) at += frameSize(_bytes, at);
  return at;
}

void PortSendQueue::forgetWritten() {
  const std::size_t count = firstUnwritten();
  _bytes.erase(_bytes.begin(), _bytes.begin() + static_cast<std::ptrdiff_t>(count));
  _start += count;
  _written -= count;
}

void PortSendQueue::giveBackMemory() {
  forgetWritten();
  if (_bytes.capacity() > kKeptCapacity) _bytes = Bytes();
}

}  // namespace kestro
