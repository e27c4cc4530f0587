// SPDX-License-Identifier: MIT
// A client of the telephony server: it keeps a log channel open and hands its messages on.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Model/LogChannelPorts.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/MainQueue.h"
#include "Platform/Platform.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// How long after a failure the whole connect cycle is run again.
inline constexpr std::chrono::seconds kRetryDelay{5};
/// How often a client that watches its channel looks whether it is still there.
inline constexpr std::chrono::seconds kChannelCheckInterval{2};

/// What a client asks and tells the one that it works for. All of it is called from within the
/// client's operations, on the main thread; nothing here may destroy the client.
class LogChannelUser {
 public:
  LogChannelUser() = default;
  virtual ~LogChannelUser() = default;
  LogChannelUser(const LogChannelUser&) = delete;
  LogChannelUser& operator=(const LogChannelUser&) = delete;

  /// The technology that a channel speaks, as the telephony server names it: once a channel, before
  /// its messages. A channel for which the server names none speaks that of the one before.
  virtual void technologyAnswered(std::string_view technology) = 0;

  /// The command that starts the messages; absent when they are of no use, which is a failure to
  /// connect. Asked for once a channel, after its technology.
  [[nodiscard]] virtual std::optional<Dictionary> startCommand() = 0;

  /// One message, borrowed for the call. What this throws passes through.
  virtual void messageArrived(ByteView message) = 0;

  /// The start command was sent.
  virtual void channelStarted() {}
  /// The ports are about to be closed, as far as there are any.
  virtual void channelStops() {}

  /// The connection has come or gone: at the end of the operation that made the difference. One
  /// that is replaced at once has not gone.
  virtual void connectionChanged(bool /*isConnected*/) {}

  /// A channel has taken the place of one that was lost, `gap` after that was last seen to be
  /// there. So many messages were missed meanwhile; absent when the server does not know. Only with
  /// `ChannelWatch::ByClient`.
  virtual void channelFollowed(std::chrono::microseconds /*gap*/,
                               std::optional<std::uint64_t> /*missed*/) {}

  /// What the server says of its source: with each channel, before its technology, and when it
  /// changes.
  virtual void sourceTold(const LogSourceState& /*source*/) {}

  /// An attempt to connect has failed; the next one comes by itself.
  virtual void connectionFailed(const ConnectionProblem& /*problem*/) {}

  /// The telephony server has something to tell; only with `ChannelWatch::ByUser`.
  virtual void serverNotified() {}

  /// What a queued retry keeps alive.
  [[nodiscard]] virtual std::shared_ptr<const void> keptByRetry() { return nullptr; }
};

/// Who finds out that the telephony server has closed the channel.
enum class ChannelWatch {
  ByClient,  ///< the client: it calls `check` every 2 s and when the server notifies
  ByUser,    ///< whoever uses it, who calls `check`
};

/// Idle, running, or waiting to retry. Main thread only.
class LogChannelClient {
 public:
  /// A client without ports. Platform and user outlive it.
  LogChannelClient(Platform& platform, LogChannelUser& user, ChannelWatch watch);
  /// Closes the ports and ends the registration for notifications. The user is told nothing any
  /// more, and a queued retry does nothing.
  ~LogChannelClient() = default;
  LogChannelClient(const LogChannelClient&) = delete;
  LogChannelClient& operator=(const LogChannelClient&) = delete;

  /// Whether both ports exist; it does not look whether they still work.
  [[nodiscard]] bool isConnected() const noexcept { return _ports.areOpen(); }

  /// Opens the ports, asks for the technology and sends the start command; after a failure, which
  /// has its line in the system log, it closes the ports and tries again in 5 s, for ever. Does
  /// nothing while messages are running.
  void start();
  /// Closes the ports, then `start`.
  void restart();
  /// Closes the ports. A retry that is queued connects again all the same.
  void close();
  /// Restarts when the telephony server has closed the channel.
  void check();

  /// How long ago the channel was last seen that is lost; absent while there is one, and before
  /// there was one. Only with `ChannelWatch::ByClient`.
  [[nodiscard]] std::optional<std::chrono::microseconds> gap() const;

  /// While a message arrives: when the source had it, if the start command asked for that and the
  /// server says so.
  [[nodiscard]] std::optional<Moment> sourceTime() const noexcept { return _ports.sourceTime(); }

  /// The steps of `start`, for who takes them one by one. Opens the ports, see
  /// `LogChannelPorts::open`.
  bool openPorts() { return _ports.open(); }
  /// Asks for the technology; the ports must exist.
  void requestTechnology();

 private:
  void stopPorts();
  [[nodiscard]] LogChannelHandlers handlers();
  void followed(std::optional<std::uint64_t> missed);
  void readTechnology(ByteView reply);
  [[nodiscard]] std::optional<ConnectionProblem> sendStartCommand();
  [[nodiscard]] std::optional<ConnectionProblem> tryToConnect();
  void scheduleRetry();
  void serverNotified();
  void tellConnection();
  void logError(std::string_view line);

  Platform& _platform;
  LogChannelUser& _user;
  ChannelWatch _watch;
  LogChannelPorts _ports;
  std::shared_ptr<LogChannelClient*> _self;  ///< what a queued retry finds this by, while it lives
  std::unique_ptr<Timer> _checkTimer;
  bool _isRunning = false;
  bool _toldConnected = false;
  std::string _technology;      ///< as the server answered last
  std::optional<Moment> _seen;  ///< when there was a channel for the last time
};

}  // namespace kestro
