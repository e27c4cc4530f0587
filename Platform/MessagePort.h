// SPDX-License-Identifier: MIT
// Named message ports: how the program and the telephony server exchange messages.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"

namespace kestro {

/// Outcome of a send or a request; Documentation/message-ports.md has the same numbers.
enum class SendError : int {
  None = 0,             ///< handed to the system; for a request: the reply is there
  SendTimeout = -1,     ///< the system did not take all of it in time
  ReceiveTimeout = -2,  ///< no reply came in time
  InvalidPort = -3,     ///< the connection was closed before
  Transport = -4,       ///< the connection broke meanwhile, or the message is too long
};

/// The largest body of a message; longer ones are refused by the sender (SendError::Transport) and
/// close the connection at the receiver.
inline constexpr std::size_t kMaximumMessageSize = std::size_t{16} * 1024 * 1024;

/// A process, by the number that the system has for it.
using ProcessNumber = std::int32_t;

/// The system has no number for this process, such as one of a process namespace that is not seen.
inline constexpr ProcessNumber kUnknownProcess = 0;

/// Answers one message, on the main thread. It is given the message's id and bytes (valid during
/// the call) and returns the reply, which is sent only when the sender asked for one.
using ReceiveHandler =
    std::function<std::optional<Bytes>(std::int32_t messageId, ByteView message)>;

/// A port under a name of this process's own, on which messages arrive.
class LocalPort {
 public:
  LocalPort() = default;
  virtual ~LocalPort() = default;
  LocalPort(const LocalPort&) = delete;
  LocalPort& operator=(const LocalPort&) = delete;

  /// `handler` runs once, on the main thread, when the port becomes invalid: by `invalidate`, or
  /// because its name was lost. An empty handler removes the one before.
  virtual void setInvalidationHandler(std::function<void()> handler) = 0;

  /// Closes the port and gives its name back; runs the invalidation handler before it returns.
  /// A second call does nothing. Destroying a valid port closes it without running the handler.
  virtual void invalidate() = 0;

  [[nodiscard]] virtual bool isValid() const = 0;

  /// Serves, before it returns, what has arrived by now. For who is about to close the port and
  /// wants no message lost that came in time.
  virtual void serveArrived() = 0;

  /// The process that sent what the handler is answering: who connected. Of use in the handler
  /// only; elsewhere kUnknownProcess.
  [[nodiscard]] virtual ProcessNumber sender() const = 0;
};

/// The sending end of a connection to somebody's local port.
class RemotePort {
 public:
  struct Reply {
    SendError error = SendError::None;
    std::optional<Bytes> data;  ///< absent when the receiver answered without data
  };

  RemotePort() = default;
  virtual ~RemotePort() = default;
  RemotePort(const RemotePort&) = delete;
  RemotePort& operator=(const RemotePort&) = delete;

  /// Queues one message and returns at once. At most 4 MiB wait for a slow peer, 256 KiB while more
  /// than 64 MiB wait for all peers of the process; a message beyond that closes the connection
  /// (with a log line) and yields SendError::Transport.
  virtual SendError post(std::int32_t messageId, ByteView message) = 0;

  /// Sends one message, waiting at most `sendTimeout` until it has been handed to the system.
  virtual SendError send(std::int32_t messageId, ByteView message,
                         std::chrono::nanoseconds sendTimeout) = 0;

  /// Sends one message and waits for its reply. While it waits only the reply is served: no block,
  /// timer or handler of this process runs; what else arrives is delivered afterwards.
  [[nodiscard]] virtual Reply request(std::int32_t messageId, ByteView message,
                                      std::chrono::nanoseconds sendTimeout,
                                      std::chrono::nanoseconds receiveTimeout) = 0;

  /// Closes the connection. Later calls do nothing, later sends yield SendError::InvalidPort.
  virtual void invalidate() = 0;

  /// False once the connection was closed from either end. The test looks at the connection itself,
  /// so a peer that closed it before the call is noticed by the call.
  [[nodiscard]] virtual bool isValid() const = 0;

  /// How many messages with this id were posted or sent and have not been handed to the system
  /// whole: they wait, or were dropped when the connection closed.
  [[nodiscard]] virtual std::size_t unsentMessages(std::int32_t messageId) const = 0;

  /// The process at the other end: who listened to the port when this connection was made.
  [[nodiscard]] virtual ProcessNumber owner() const = 0;
};

/// Makes ports. A port name is 1 to 64 letters, digits, '.', '-' or '_', and not "." or "..".
class MessagePorts {
 public:
  MessagePorts() = default;
  virtual ~MessagePorts() = default;
  MessagePorts(const MessagePorts&) = delete;
  MessagePorts& operator=(const MessagePorts&) = delete;

  /// Opens a local port; null (with a log line) when the name is not a port name, is in use by a
  /// living process, or the port directory cannot be used. `handler` runs on the main thread.
  [[nodiscard]] virtual std::shared_ptr<LocalPort> createLocalPort(std::string_view name,
                                                                   ReceiveHandler handler) = 0;

  /// Connects to somebody's local port; null when nobody owns that name, or (with a log line) when
  /// it cannot be connected to: it is another user's, or a symbolic link.
  [[nodiscard]] virtual std::shared_ptr<RemotePort> createRemotePort(std::string_view name) = 0;

  /// Why no port could be made when one was last asked for, whatever its name, as one line for a
  /// person; empty when that was not the reason.
  [[nodiscard]] virtual std::string problem() const { return {}; }
};

}  // namespace kestro
