// SPDX-License-Identifier: MIT
// The two ports of a log channel: on one its messages arrive, on the other commands go out.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Model/ConnectionProblem.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/LogSourceState.h"
#include "Platform/MessagePort.h"
#include "Platform/Platform.h"
#include "Platform/SourceTimes.h"
#include "Platform/TelephonyService.h"

namespace kestro {

/// The most that one command to the log channel waits to be sent, and its reply to arrive.
inline constexpr std::chrono::seconds kCommandTimeout{1};

/// What comes in, on the main thread. No handler may destroy the ports.
struct LogChannelHandlers {
  /// One message of the channel, borrowed for the call.
  std::function<void(ByteView message)> received;
  /// The local port is gone without having been closed here.
  std::function<void()> lost;
  /// The telephony server notifies.
  std::function<void()> notified;
  /// The server has made a channel in place of the one before; how many messages that one has
  /// missed, if the server knows. Without this handler it is not asked.
  std::function<void(std::optional<std::uint64_t> missed)> followed = {};
  /// What the server says of its source: with each channel, and when it changes.
  std::function<void(const LogSourceState& source)> sourceTold = {};
};

/// Main thread only.
class LogChannelPorts {
 public:
  /// The platform outlives the ports.
  LogChannelPorts(Platform& platform, LogChannelHandlers handlers);
  /// Closes the ports and ends the registration for notifications.
  ~LogChannelPorts();
  LogChannelPorts(const LogChannelPorts&) = delete;
  LogChannelPorts& operator=(const LogChannelPorts&) = delete;

  /// Opens the local port, the log channel and the remote port to it; false when one is missing.
  /// What went wrong has its line in the system log, and ports that were opened stay open.
  bool open();
  /// Why `open` failed.
  [[nodiscard]] const ConnectionProblem& problem() const noexcept { return _problem; }
  /// Closes the ports, as far as there are any; no handler runs.
  void close();

  /// Whether both ports exist; it does not look whether they still work.
  [[nodiscard]] bool areOpen() const noexcept { return _recvPort && _sendPort; }
  /// Loses the local port when the telephony server has closed the channel. Whether the channel is
  /// there.
  bool check();

  /// While `received` runs: when the source had the message, if the server says so.
  [[nodiscard]] std::optional<Moment> sourceTime() const noexcept { return _sourceTimes.time(); }

  /// Sends a command to the channel, the remote port of which must exist, and waits for its reply.
  [[nodiscard]] RemotePort::Reply request(ByteView command);
  /// Sends a command that has no reply.
  [[nodiscard]] SendError send(ByteView command);

 private:
  void createLocalPort(std::string_view name);
  [[nodiscard]] bool createRemotePort(std::string_view localPortName);
  [[nodiscard]] LogChannelReply requestChannel(TqServerConnection& connection,
                                               std::string_view localPortName);
  void logError(std::string_view line);

  Platform& _platform;
  LogChannelHandlers _handlers;
  std::shared_ptr<LocalPort> _recvPort;
  std::shared_ptr<RemotePort> _sendPort;
  SourceTimes _sourceTimes;
  ConnectionProblem _problem;
  std::string _channelPort;  ///< of the last channel that there was
};

}  // namespace kestro
