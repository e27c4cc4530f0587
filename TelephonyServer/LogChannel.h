// SPDX-License-Identifier: MIT
// One client's log channel.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/MessagePort.h"
#include "Platform/Platform.h"
#include "TelephonyServer/ChannelCommand.h"
#include "TelephonyServer/LostChannels.h"

namespace kestro {

/// A log channel: a port of its own, on which its client's commands arrive, and the connection to
/// the client's local port, on which log messages leave. Both close with it. Its port's handler
/// refers to it, so it must not move; it may not be destroyed inside that handler.
class LogChannel {
 public:
  /// `technology` says what the answer to "GetTechnology" is. The platform must outlive the
  /// channel.
  LogChannel(Platform& platform, std::shared_ptr<RemotePort> client,
             std::function<std::string_view()> technology);
  LogChannel(const LogChannel&) = delete;
  LogChannel& operator=(const LogChannel&) = delete;
  ~LogChannel() = default;

  /// Opens the channel's port under a name that no other channel ever had; false (with a log line)
  /// when that is not possible.
  [[nodiscard]] bool open();

  /// The name of the channel's port.
  [[nodiscard]] const std::string& portName() const noexcept { return _portName; }

  /// The process whose channel it is.
  [[nodiscard]] ProcessNumber client() const noexcept { return _clientProcess; }

  /// Starts streaming as by that command, until the client sends one.
  void start(StartCommand command) { _command = std::move(command); }

  /// Sends a log message to the client, if streaming has started and the client asked for its code,
  /// after the source's time if it asked for that. Never waits. False when the client's connection
  /// refused it: the channel is of no use any more, as a log line says.
  [[nodiscard]] bool deliver(ByteView message, Moment time);

  /// Closes the channel. What there is to remember of it; absent when it never streamed.
  [[nodiscard]] std::optional<LostChannel> close();

  /// Whether client and channel are still connected; looks at both connections. A channel that is
  /// not will never be again.
  [[nodiscard]] bool isOpen() const;

 private:
  [[nodiscard]] std::optional<Bytes> answer(std::int32_t messageId, ByteView message);
  [[nodiscard]] std::optional<Bytes> technologyReply() const;
  [[nodiscard]] SendError post(ByteView message, Moment time);

  Platform& _platform;
  std::shared_ptr<RemotePort> _client;
  ProcessNumber _clientProcess;
  std::function<std::string_view()> _technology;
  std::string _portName;
  std::shared_ptr<LocalPort> _port;
  std::optional<StartCommand> _command;  ///< absent before streaming starts
  std::uint64_t _refused = 0;            ///< messages that the client's connection did not take
};

}  // namespace kestro
