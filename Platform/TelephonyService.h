// SPDX-License-Identifier: MIT
// The telephony server as the program sees it: a registration for notifications, log channels, and
// the technology names that the server reports.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

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
  std::optional<std::string> portName;
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

  /// Ends the registration for notifications, if there is one.
  virtual void cancelNotifications() = 0;
};

}  // namespace kestro
