// SPDX-License-Identifier: MIT
// The telephony server as the program sees it: a registration for notifications, log channels, and
// the technology names that the server reports.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/LogSourceState.h"

namespace kestro {

/// The technologies a log channel can speak: the answers to "GetTechnology".
inline constexpr std::string_view kTqLogChannelTechnology_IFX = "IFX";
inline constexpr std::string_view kTqLogChannelTechnology_Ondrel_GSM = "Ondrel_GSM";
inline constexpr std::string_view kTqLogChannelTechnology_Ondrel_CDMA = "Ondrel_CDMA";
inline constexpr std::string_view kTqLogChannelTechnology_Ondrel_LTE = "LTE";
inline constexpr std::string_view kTqLogChannelTechnology_Ondrel_UTRAN2 = "UTRAN2";

/// An open connection to the telephony server. Whoever holds it may ask for log channels; letting
/// go of it leaves the registration for notifications in place.
class TqServerConnection {
 public:
  TqServerConnection() = default;
  virtual ~TqServerConnection() = default;
  TqServerConnection(const TqServerConnection&) = delete;
  TqServerConnection& operator=(const TqServerConnection&) = delete;
};

/// The answer to a log-channel request: 0 and the name of the server's port, or an error number.
struct LogChannelReply {
  long error = 0;  ///< of a LogChannelError, or of a SendError (Platform/TelephonyProtocol.h)
  std::optional<std::string> portName = std::nullopt;
  LogSourceState source = {};  ///< what the server says of its source
  /// How many messages were missed since the previous channel was lost; absent when none was named
  /// or the server does not know. With a number the messages go on at once, as they were asked for
  /// on that channel, so that none is missed that is not counted.
  std::optional<std::uint64_t> lost = std::nullopt;
};

/// The telephony server's two operations. Main thread only.
class TelephonyService {
 public:
  TelephonyService() = default;
  virtual ~TelephonyService() = default;
  TelephonyService(const TelephonyService&) = delete;
  TelephonyService& operator=(const TelephonyService&) = delete;

  /// Opens a connection and registers `notificationHandler`, which runs on the main thread for
  /// every notification until the next connection is created or `cancelNotifications` is called;
  /// letting go of the connection does not end it. Null when there is no server.
  // NOLINTNEXTLINE(bugprone-reserved-identifier,readability-identifier-naming)
  [[nodiscard]] virtual std::unique_ptr<TqServerConnection> _TqServerConnectionCreate(
      std::function<void()> notificationHandler) = 0;

  /// Asks for a network-monitor log channel that delivers to the local port `localPortName`. Waits
  /// at most 1.0 s to send and 1.0 s for the answer; running out of time is an error too.
  // NOLINTNEXTLINE(bugprone-reserved-identifier,readability-identifier-naming)
  [[nodiscard]] virtual LogChannelReply _TqServerConnectionNetworkMonitorCreateLogChannel(
      TqServerConnection& connection, std::string_view localPortName) = 0;

  /// The same, for a channel that takes the place of one that was lost: `previousPortName` is the
  /// name of that one's port. The server remembers it for 60 s.
  [[nodiscard]] virtual LogChannelReply createLogChannelAfter(
      TqServerConnection& connection, std::string_view localPortName,
      std::string_view previousPortName) = 0;

  /// `handler` runs on the main thread, before the notification's own handler, when the server
  /// notifies that its source has changed, for instance that it has ended. An empty one removes the
  /// one before.
  virtual void setSourceHandler(std::function<void(const LogSourceState&)> handler) = 0;

  /// Ends the registration for notifications, if there is one.
  virtual void cancelNotifications() = 0;
};

}  // namespace kestro
