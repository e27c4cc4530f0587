// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortConnection.h"

#include <poll.h>

#include <algorithm>
#include <cerrno>
#include <utility>

namespace kestro {

PortDeadline portDeadline(std::chrono::nanoseconds timeout) {
  return std::chrono::steady_clock::now() +
         std::clamp<std::chrono::nanoseconds>(timeout, std::chrono::nanoseconds(0),
                                              std::chrono::hours(24));
}

PortConnection::PortConnection(FileDescriptor socket, PortDirection direction, std::string portName,
                               std::shared_ptr<PortContext> context)
    : _socket(std::move(socket)),
      _portName(std::move(portName)),
      _context(std::move(context)),
      _reader(direction),
      _readNotifier(std::make_unique<QSocketNotifier>(_socket.get(), QSocketNotifier::Read)),
      _writeNotifier(std::make_unique<QSocketNotifier>(_socket.get(), QSocketNotifier::Write)) {
  _writeNotifier->setEnabled(false);
  // The handlers hold the connection: whatever they call may let go of it.
  QObject::connect(_readNotifier.get(), &QSocketNotifier::activated, [this] {
    const auto self = shared_from_this();
    onReadable();
  });
  QObject::connect(_writeNotifier.get(), &QSocketNotifier::activated, [this] {
    const auto self = shared_from_this();
    flush();
  });
}

PortConnection::~PortConnection() {
  _context->queuedBytes -= _countedBytes;
  if (_isUnfinished) _context->unfinished.count(*this, 0);
}

void PortConnection::countQueue() {
  _context->queuedBytes += _queue.size() - _countedBytes;
  _countedBytes = _queue.size();
}

void PortConnection::enqueue(const PortFrameHeader& header, ByteView body) {
  if (!isOpen()) return;
  _queue.append(header, body);
  countQueue();
  if (_writeNotifier->isEnabled()) return;  // the system takes no more; the notifier goes on
  if (_queue.size() >= kFlushSize) {
    flush();
  } else if (!std::exchange(_flushScheduled, true)) {
    context().flusher.schedule(weak_from_this());
  }
}

void PortConnection::endTurn() {
  _flushScheduled = false;
  flush();
}

void PortConnection::flush() {
  if (!isOpen()) return;
  const PortSendQueue::FlushStatus status = _queue.flush(socket());
  countQueue();
  if (status == PortSendQueue::FlushStatus::Broken) {
    close();
    return;
  }
  const bool blocked = status == PortSendQueue::FlushStatus::Blocked;
  if (blocked == _writeNotifier->isEnabled()) return;
  _writeNotifier->setEnabled(blocked);
  if (!blocked) onDrained();
}

void PortConnection::close() {
  if (!isOpen()) return;
  static_cast<void>(_queue.flush(socket()));
  // Notifiers go before their descriptor does, so that they can never watch a later one's number.
  _readNotifier.reset();
  _writeNotifier.reset();
  _socket.reset();
  _dropped = _queue.waitingMessages();
  _queue = PortSendQueue();
  countQueue();
  countUnfinished();
  onClosed();
}

std::size_t PortConnection::unsent(std::int32_t messageId) const {
  const auto waiting = isOpen() ? _queue.waitingMessages() : _dropped;
  const auto found = waiting.find(messageId);
  return found == waiting.end() ? 0 : found->second;
}

void PortConnection::note(std::string_view what) {
  context().log.log(LogPriority::Warning, "Message port \"{}\": {}", _portName, what);
}

void PortConnection::abandon(std::string_view reason) {
  if (!isOpen()) return;
  note(fmt::format("closing a connection: {}", reason));
  close();
}

PortFrameReader::FillStatus PortConnection::fill() {
  const PortFrameReader::FillStatus status = _reader.fill(socket());
  if (status == PortFrameReader::FillStatus::End && _reader.unreadBytes() != 0) {
    abandon(fmt::format("the stream ends within a frame, {} bytes dropped", _reader.unreadBytes()));
  }
  countUnfinished();
  return status;
}

void PortConnection::settle() {
  _reader.giveBackMemory();
  countUnfinished();
}

void PortConnection::countUnfinished() {
  const std::size_t bytes = isOpen() && !_reader.hasNext() ? _reader.unreadBytes() : 0;
  if (bytes == 0 && !_isUnfinished) return;
  _isUnfinished = bytes != 0;
  context().unfinished.count(*this, bytes);
}

bool PortConnection::hasUnreadBytes() const {
  return (waitFor(POLLIN, portDeadline(std::chrono::nanoseconds(0))) & POLLIN) != 0;
}

std::optional<PortFrame> PortConnection::nextFrame() {
  auto frame = _reader.next();
  if (frame) return *frame;
  abandon(frame.error().message);
  return std::nullopt;
}

short PortConnection::waitFor(short events, PortDeadline deadline) const {
  for (;;) {
    const auto left = std::chrono::duration_cast<std::chrono::nanoseconds>(
        std::max(deadline - std::chrono::steady_clock::now(), PortDeadline::duration::zero()));
    const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(left);
    const timespec timeout{static_cast<time_t>(seconds.count()),
                           static_cast<long>((left - seconds).count())};
    pollfd polled{_socket.get(), events, 0};
    const int count = ::ppoll(&polled, 1, &timeout, nullptr);
    if (count > 0) return polled.revents;
    if (count == 0 || errno != EINTR) return 0;
  }
}

void PortConnection::setReading(bool reading) {
  if (isOpen() && _readNotifier->isEnabled() != reading) _readNotifier->setEnabled(reading);
}

void PortConnection::readNextTurn() {
  if (!isOpen()) return;
  const auto read = [this] {
    const auto self = shared_from_this();
    onReadable();
  };
  // The notifier's end, at the latest with this connection's, takes the call back.
  QMetaObject::invokeMethod(_readNotifier.get(), read, Qt::QueuedConnection);
}

}  // namespace kestro
