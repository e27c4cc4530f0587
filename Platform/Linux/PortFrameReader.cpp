// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortFrameReader.h"

#include <sys/socket.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

namespace kestro {

PortFrameReader::FillStatus PortFrameReader::fill(int socket) {
  makeRoom();
  const std::size_t wanted = std::min(_capacity - _end, kReadSize);
  ssize_t count = 0;
  do {
    count = ::recv(socket, _buffer.get() + _end, wanted, 0);
  } while (count < 0 && errno == EINTR);
  if (count > 0) {
    _end += static_cast<std::size_t>(count);
    return FillStatus::Data;
  }
  const bool nothingYet = count < 0 && (errno == EAGAIN || errno == EWOULDBLOCK);
  return nothingYet ? FillStatus::NothingYet : FillStatus::End;
}

Result<std::optional<PortFrame>> PortFrameReader::next() {
  const ByteView bytes = unread();
  if (bytes.size() < PortFrameHeader::kSize) return std::nullopt;
  auto header = decodePortFrameHeader(bytes, _direction);
  if (!header) return tl::unexpected(std::move(header.error()));
  if (bytes.size() - PortFrameHeader::kSize < header->length) return std::nullopt;
  _begin += PortFrameHeader::kSize + header->length;
  return PortFrame{*header, bytes.subspan(PortFrameHeader::kSize, header->length)};
}

bool PortFrameReader::hasNext() const {
  const ByteView bytes = unread();
  if (bytes.size() < PortFrameHeader::kSize) return false;
  const auto header = decodePortFrameHeader(bytes, _direction);
  return !header || bytes.size() - PortFrameHeader::kSize >= header->length;
}

void PortFrameReader::makeRoom() {
  if (unreadBytes() == 0) {
    _begin = _end = 0;
    if (_capacity != kReadSize) moveTo(kReadSize);  // also gives back what a long frame needed
  } else if (_begin != 0) {
    std::memmove(_buffer.get(), _buffer.get() + _begin, unreadBytes());
    _end = unreadBytes();
    _begin = 0;
  }
  if (_end == _capacity) moveTo(nextCapacity());
}

/// Twice as much, but no more than the frame that is arriving takes.
std::size_t PortFrameReader::nextCapacity() const {
  const auto header = decodePortFrameHeader(unread(), _direction);
  const std::size_t frame = header ? PortFrameHeader::kSize + header->length : 0;
  return frame > _capacity ? std::min(frame, _capacity * 2) : _capacity * 2;
}

void PortFrameReader::giveBackMemory() {
  if (unreadBytes() == 0) {
    clear();
  } else if (_capacity > kReadSize && unreadBytes() <= kReadSize) {
    moveTo(kReadSize);
  }
}

void PortFrameReader::clear() {
  _buffer.reset();
  _capacity = _begin = _end = 0;
}

void PortFrameReader::moveTo(std::size_t capacity) {
  auto buffer = std::make_unique_for_overwrite<std::uint8_t[]>(capacity);
  std::copy_n(_buffer.get() + _begin, unreadBytes(), buffer.get());
  _end = unreadBytes();
  _begin = 0;
  _buffer = std::move(buffer);
  _capacity = capacity;
}

}  // namespace kestro
