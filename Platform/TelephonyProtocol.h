// SPDX-License-Identifier: MIT
// The messages between the telephony server and its clients: ids, keys and error numbers, named
// once for both sides. Documentation/message-ports.md describes them.
#pragma once

#include <cstdint>
#include <string_view>

namespace kestro {

/// The name of the server's port unless another is asked for.
inline constexpr std::string_view kDefaultServerName = "TelephonyServer";

/// The messages, by id. Bodies are XML property lists (a dictionary) unless said otherwise.
enum class TelephonyMessage : std::int32_t {
  /// On a channel port: a command; on the client's local port: log data, unparsed.
  Channel = 0,
  /// One-way, to the server: kTelephonyNotificationPort.
  Register = 1,
  /// Request, to the server: kTelephonyLocalPort. Reply: kTelephonyError, kTelephonyPort.
  CreateLogChannel = 2,
  /// One-way, to a registered notification port: kTelephonyNotification.
  Notification = 3,
  /// One-way, to the client's local port: the source's time of the log data that follows, where
  /// kTelephonyTimes has asked for it. Eight bytes (Platform/SourceTimes.h), no property list.
  SourceTime = 4,
};

[[nodiscard]] constexpr std::int32_t messageId(TelephonyMessage message) noexcept {
  return static_cast<std::int32_t>(message);
}

/// Register: the name of the client's port that wants notifications (text).
inline constexpr std::string_view kTelephonyNotificationPort = "NotificationPort";
/// CreateLogChannel: the name of the client's port that log data goes to (text).
inline constexpr std::string_view kTelephonyLocalPort = "LocalPort";
/// And, when this channel takes the place of one that was lost, the name of that one's port (text).
inline constexpr std::string_view kTelephonyPrevious = "Previous";
/// Its reply: an error number (integer, 0 for none) and, without error, the channel's port (text).
inline constexpr std::string_view kTelephonyError = "Error";
inline constexpr std::string_view kTelephonyPort = "Port";
/// The reply may also say how many messages the lost channel has missed (integer), and what the
/// source is (Platform/LogSourceState.h): its kind and name (texts in a dictionary), whether it is
/// simulated and whether it has ended (booleans).
inline constexpr std::string_view kTelephonyLost = "Lost";
inline constexpr std::string_view kTelephonySource = "Source";
inline constexpr std::string_view kTelephonySourceKind = "Kind";
inline constexpr std::string_view kTelephonySourceName = "Name";
inline constexpr std::string_view kTelephonySimulated = "Simulated";
inline constexpr std::string_view kTelephonyEnded = "Ended";
/// Notification: what happened (text).
inline constexpr std::string_view kTelephonyNotification = "Notification";
inline constexpr std::string_view kTelephonyTechnologyChanged = "TechnologyChanged";
/// With what the source is now, as in the reply to CreateLogChannel.
inline constexpr std::string_view kTelephonySourceChanged = "SourceChanged";

/// On a channel port: the request for the technology, and the reply's entry of the same name.
inline constexpr std::string_view kTelephonyGetTechnology = "GetTechnology";

/// On a channel port: the command that starts the messages. Its state is always "Streaming". Its
/// two arrays of integers are the codes of the packets that are wanted; without both of them all
/// packets are.
inline constexpr std::string_view kTelephonySetState = "SetState";
inline constexpr std::string_view kTelephonyStreaming = "Streaming";
inline constexpr std::string_view kTelephonySetOndrelLogCodes = "SetOndrelLogCodes";
inline constexpr std::string_view kTelephonySetTqExtraCodes = "SetTqExtraCodes";
/// In it: whether the source's times are wanted as well (boolean).
inline constexpr std::string_view kTelephonyTimes = "Times";

/// Why there is no log channel. The server answers with the positive numbers; the numbers -1 to -4
/// are those of SendError, -5 a reply that does not say what it should.
enum class LogChannelError : long {
  None = 0,
  BadRequest = 1,      ///< no dictionary, or its local port is missing or no port name
  NoLocalPort = 2,     ///< nobody owns the local port, or it takes no connection
  NoChannel = 3,       ///< the server cannot open a port for it, or has too many
  UnusableReply = -5,  ///< found by the client: no reply data, or not the expected dictionary
};

}  // namespace kestro
