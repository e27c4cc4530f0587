// SPDX-License-Identifier: MIT
#include "Platform/Linux/InboundConnection.h"

#include <utility>

namespace kestro {
namespace {

/// How long one peer is served before others get their turn.
constexpr std::chrono::milliseconds kTurn{10};

/// How many turns are taken at once for what has arrived.
constexpr int kArrivedTurns = 16;

/// Nothing more is read from a peer while more than this waits for it to be read.
constexpr std::size_t kReplyBacklog = std::size_t{1024} * 1024;

// What a handler throws ends the process where it was thrown: it must not unwind through the event
// loop.
std::optional<Bytes> callHandler(PortReceiver& receiver, ProcessNumber sender,
                                 const PortFrame& frame) noexcept {
  // A handler that runs the event loop may be called for another sender meanwhile.
  const ProcessNumber outer = std::exchange(receiver.sender, sender);
  auto reply = receiver.handler(frame.header.messageId, frame.body);
  receiver.sender = outer;
  return reply;
}

}  // namespace

InboundConnection::InboundConnection(FileDescriptor socket, ProcessNumber peer,
                                     std::string portName, std::shared_ptr<PortContext> context,
                                     std::shared_ptr<PortReceiver> receiver, ClosedHandler closed)
    : PortConnection(std::move(socket), PortDirection::ToReceiver, std::move(portName),
                     std::move(context)),
      _peer(peer),
      _receiver(std::move(receiver)),
      _closed(std::move(closed)) {}

void InboundConnection::disown() {
  _closed = nullptr;
  close();
}

void InboundConnection::serveArrived() {
  const auto self = shared_from_this();
  for (int turn = 0; turn < kArrivedTurns && isOpen() && !_serving; ++turn) {
    if (!reader().hasNext() && !hasUnreadBytes()) return;
    onReadable();
  }
}

void InboundConnection::onReadable() {
  if (_serving) {
    setReading(false);  // a handler runs an event loop of its own; `serve` goes on after it
    return;
  }
  if (!reader().hasNext()) _ended = fill() == PortFrameReader::FillStatus::End;
  serve();
}

void InboundConnection::onDrained() {
  if (!_serving) serve();
}

void InboundConnection::onClosed() {
  if (const auto closed = std::exchange(_closed, nullptr)) closed(*this);
}

bool InboundConnection::mayServe() noexcept { return isOpen() && queue().size() <= kReplyBacklog; }

void InboundConnection::serve() {
  _serving = true;
  const auto turnEnd = std::chrono::steady_clock::now() + kTurn;
  while (mayServe() && std::chrono::steady_clock::now() < turnEnd) {
    const auto frame = nextFrame();
    if (!frame) break;
    answer(*frame);
  }
  _serving = false;
  arrangeNextTurn();
}

void InboundConnection::arrangeNextTurn() {
  settle();
  const bool backlog = queue().size() > kReplyBacklog;  // `onDrained` goes on
  const bool unserved = !backlog && reader().hasNext();
  if (unserved) readNextTurn();
  if (_ended && !backlog && !unserved) {
    close();
  } else {
    setReading(!_ended && !backlog && !unserved);
  }
}

void InboundConnection::answer(const PortFrame& frame) {
  std::optional<Bytes> reply = callHandler(*_receiver, _peer, frame);
  if (frame.header.kind != PortFrameKind::Request) return;
  if (reply && reply->size() > kMaximumMessageSize) {
    note(fmt::format("a reply of {} bytes is dropped, at most {} are allowed", reply->size(),
                     kMaximumMessageSize));
    reply.reset();
  }
  enqueue({.kind = reply ? PortFrameKind::Reply : PortFrameKind::ReplyWithoutData,
           .messageId = frame.header.messageId,
           .sequence = frame.header.sequence},
          reply ? ByteView(*reply) : ByteView());
}

}  // namespace kestro
