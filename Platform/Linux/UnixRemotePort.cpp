// SPDX-License-Identifier: MIT
#include "Platform/Linux/UnixRemotePort.h"

#include <poll.h>

#include <utility>

namespace kestro {
namespace {

bool isOver(PortDeadline deadline) { return std::chrono::steady_clock::now() >= deadline; }

}  // namespace

UnixRemotePort::UnixRemotePort(FileDescriptor socket, ProcessNumber owner, std::string portName,
                               std::shared_ptr<PortContext> context)
    : PortConnection(std::move(socket), PortDirection::ToSender, std::move(portName),
                     std::move(context)),
      _owner(owner) {}

UnixRemotePort::~UnixRemotePort() { close(); }

bool UnixRemotePort::isValid() const {
  if (!isOpen()) return false;
  const short state = waitFor(POLLRDHUP, portDeadline(std::chrono::nanoseconds(0)));
  return (state & (POLLRDHUP | POLLHUP | POLLERR | POLLNVAL)) == 0;
}

std::size_t UnixRemotePort::mostQueuedBytes() const {
  const bool isCrowded = context().queuedBytes > kMaximumQueuedBytesOfAll;
  return isCrowded ? kCrowdedQueuedBytes : kMaximumQueuedBytes;
}

SendError UnixRemotePort::post(std::int32_t messageId, ByteView message) {
  if (!isOpen()) return SendError::InvalidPort;
  if (message.size() > kMaximumMessageSize) return SendError::Transport;
  const std::size_t size = PortFrameHeader::kSize + message.size();
  // What waits already counts, not this message: nobody loses a connection that has nothing queued.
  const auto overflows = [&] {
    return queue().size() + size > kMaximumQueuedBytes || queue().size() > mostQueuedBytes();
  };
  if (overflows()) flush();
  if (overflows()) {
    abandon(fmt::format("the peer does not read: {} bytes wait, at most {} may",
                        queue().size() + size, mostQueuedBytes()));
  }
  if (!isOpen()) return SendError::Transport;
  enqueue({.kind = PortFrameKind::Message, .messageId = messageId}, message);
  return isOpen() ? SendError::None : SendError::Transport;
}

SendError UnixRemotePort::send(std::int32_t messageId, ByteView message,
                               std::chrono::nanoseconds sendTimeout) {
  return transmit({.kind = PortFrameKind::Message, .messageId = messageId}, message,
                  portDeadline(sendTimeout));
}

RemotePort::Reply UnixRemotePort::request(std::int32_t messageId, ByteView message,
                                          std::chrono::nanoseconds sendTimeout,
                                          std::chrono::nanoseconds receiveTimeout) {
  if (++_lastSequence == 0) ++_lastSequence;
  const std::uint32_t sequence = _lastSequence;
  const SendError error =
      transmit({.kind = PortFrameKind::Request, .messageId = messageId, .sequence = sequence},
               message, portDeadline(sendTimeout));
  if (error != SendError::None) return {error, {}};
  return awaitReply(sequence, portDeadline(receiveTimeout));
}

SendError UnixRemotePort::transmit(const PortFrameHeader& header, ByteView message,
                                   PortDeadline deadline) {
  if (!isValid()) return SendError::InvalidPort;
  if (message.size() > kMaximumMessageSize) return SendError::Transport;
  context().flusher.flushAll();
  if (!isOpen()) return SendError::Transport;
  const PortSendQueue::Position position = queue().append(header, message);
  for (flush(); isOpen() && !queue().empty(); flush()) {
    const short ready = waitFor(POLLOUT | POLLIN, deadline);
    // A peer that sends replies without end, or reads byte by byte, would be ready for ever.
    if (ready == 0 || isOver(deadline)) {
      queue().withdraw(position);
      countQueue();
      return SendError::SendTimeout;
    }
    // A peer may be unable to read on before its replies are taken.
    if ((ready & POLLIN) != 0) onReadable();
  }
  return isOpen() ? SendError::None : SendError::Transport;
}

RemotePort::Reply UnixRemotePort::awaitReply(std::uint32_t sequence, PortDeadline deadline) {
  for (bool isLastRead = false;;) {
    if (const auto reply = findReply(sequence)) {
      Reply result;
      if (reply->header.kind == PortFrameKind::Reply) {
        result.data.emplace(reply->body.begin(), reply->body.end());
      }
      settle();
      return result;
    }
    if (!isOpen()) return {SendError::Transport, {}};
    if (isLastRead || waitFor(POLLIN, deadline) == 0) return {SendError::ReceiveTimeout, {}};
    // A reply that came in time may lie there still. Other replies without end must not hold us up.
    isLastRead = isOver(deadline);
    if (!readOnce()) close();
  }
}

std::optional<PortFrame> UnixRemotePort::findReply(std::uint32_t sequence) {
  while (isOpen()) {
    const auto frame = nextFrame();
    if (!frame || frame->header.sequence == sequence) return frame;
  }
  return std::nullopt;
}

// False when the connection is over. The replies that came before its end stay to be found.
bool UnixRemotePort::readOnce() { return isOpen() && fill() != PortFrameReader::FillStatus::End; }

void UnixRemotePort::onReadable() {
  constexpr std::uint32_t kNobodys = 0;  // no reply has this sequence
  static_cast<void>(findReply(kNobodys));
  const bool open = readOnce();
  static_cast<void>(findReply(kNobodys));
  if (!open) return close();
  settle();
}

}  // namespace kestro
