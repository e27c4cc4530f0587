// SPDX-License-Identifier: MIT
// One connection between two ports, from either end's view.
#pragma once

#include <QSocketNotifier>
#include <chrono>
#include <map>
#include <memory>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Linux/FileDescriptor.h"
#include "Platform/Linux/PortFlusher.h"
#include "Platform/Linux/PortFrame.h"
#include "Platform/Linux/PortFrameReader.h"
#include "Platform/Linux/PortSendQueue.h"
#include "Platform/Linux/UnfinishedFrames.h"
#include "Platform/SystemLog.h"

namespace kestro {

/// What the ports of one MessagePorts share; the ports keep it alive.
struct PortContext {
  PortContext(SystemLog& systemLog, uid_t user, std::chrono::milliseconds patience)
      : log(systemLog), peerUser(user), unfinished(patience) {}

  SystemLog& log;
  uid_t peerUser;  ///< the one user whose processes may be peers
  PortFlusher flusher;
  UnfinishedFrames unfinished;
  std::size_t queuedBytes = 0;  ///< what waits to be sent, on all connections together
};

/// When a wait ends.
using PortDeadline = std::chrono::steady_clock::time_point;

/// `timeout` from now; negative timeouts are over at once, enormous ones are cut to a day.
[[nodiscard]] PortDeadline portDeadline(std::chrono::nanoseconds timeout);

/// An open socket, the frames that wait to be sent on it, and the bytes that have arrived. Only
/// `waitFor` blocks, up to its deadline. Derived classes take the frames. Made by make_shared only.
class PortConnection : public std::enable_shared_from_this<PortConnection> {
 public:
  /// The most that may wait in a send queue, headers included.
  static constexpr std::size_t kMaximumQueuedBytes = std::size_t{4} * 1024 * 1024;
  /// While more than this waits on all connections together, a message is queued on those only on
  /// which no more than `kCrowdedQueuedBytes` wait.
  static constexpr std::size_t kMaximumQueuedBytesOfAll = std::size_t{64} * 1024 * 1024;
  static constexpr std::size_t kCrowdedQueuedBytes = std::size_t{256} * 1024;

  PortConnection(const PortConnection&) = delete;
  PortConnection& operator=(const PortConnection&) = delete;
  virtual ~PortConnection();

  [[nodiscard]] bool isOpen() const noexcept { return _socket.isOpen(); }

  /// Writes what is queued as far as the system takes it; the rest follows when the peer reads.
  void flush();

  /// The flush at the end of a turn in which something was queued.
  void endTurn();

  /// Hands over what the system takes at once of what is queued, then closes the socket. Later
  /// calls do nothing.
  void close();

  /// Closes at once, with a log line that says why.
  void abandon(std::string_view reason);

  /// Whether bytes that have arrived wait to be read from the socket.
  [[nodiscard]] bool hasUnreadBytes() const;

 protected:
  /// `direction`: which way the frames travel that arrive here. `portName` is for log lines.
  PortConnection(FileDescriptor socket, PortDirection direction, std::string portName,
                 std::shared_ptr<PortContext> context);

  /// Something can be read: bytes, or the end of the stream.
  virtual void onReadable() = 0;
  /// The send queue, which the system had refused to take, is empty.
  virtual void onDrained() {}
  /// The socket has been closed.
  virtual void onClosed() {}

  [[nodiscard]] PortContext& context() const noexcept { return *_context; }
  [[nodiscard]] PortFrameReader& reader() noexcept { return _reader; }
  [[nodiscard]] PortSendQueue& queue() noexcept { return _queue; }
  [[nodiscard]] int socket() const noexcept { return _socket.get(); }

  /// How many messages with this id the system has not taken whole: they wait, or were dropped when
  /// the socket was closed.
  [[nodiscard]] std::size_t unsent(std::int32_t messageId) const;

  /// Keeps the count of what waits on all connections true. For those who change the queue.
  void countQueue();

  /// Queues a frame without looking at the limit; it leaves at the end of this turn at the latest,
  /// if the peer reads. Drops it when the socket is closed.
  void enqueue(const PortFrameHeader& header, ByteView body);

  /// Reads once, which needs an open socket and no frame left to take. At the end of the stream an
  /// unfinished frame leaves a log line.
  [[nodiscard]] PortFrameReader::FillStatus fill();

  /// The next frame that has arrived in full. A malformed one closes the connection, with a log
  /// line, and yields nothing.
  [[nodiscard]] std::optional<PortFrame> nextFrame();

  /// Waits for one of poll's `events` on this socket alone; yields what happened, 0 when the
  /// deadline passed.
  [[nodiscard]] short waitFor(short events, PortDeadline deadline) const;

  /// Turns the calls of `onReadable` for the socket off and on.
  void setReading(bool reading);

  /// Calls `onReadable` once in the event loop's next turn, whether anything is new or not.
  void readNextTurn();

  /// Gives back the memory of frames that were taken and counts what is left. For those who have
  /// taken frames, when no body is of use any more. May close the connection.
  void settle();

  /// Writes a log line about this connection.
  void note(std::string_view what);

 private:
  /// Queues are written out when they reach this size even before the turn ends.
  static constexpr std::size_t kFlushSize = std::size_t{64} * 1024;

  void countUnfinished();

  FileDescriptor _socket;
  std::string _portName;
  std::shared_ptr<PortContext> _context;
  PortFrameReader _reader;
  PortSendQueue _queue;
  std::map<std::int32_t, std::size_t> _dropped;  ///< messages that waited at the end, by their ids
  bool _isUnfinished = false;     ///< whether the context counts bytes of an unfinished frame
  std::size_t _countedBytes = 0;  ///< this queue's part of what waits on all connections
  std::unique_ptr<QSocketNotifier> _readNotifier;
  std::unique_ptr<QSocketNotifier> _writeNotifier;  ///< enabled while the system takes no more
  bool _flushScheduled = false;
};

}  // namespace kestro
