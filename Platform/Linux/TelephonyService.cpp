// SPDX-License-Identifier: MIT
#include "Platform/Linux/TelephonyService.h"

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <utility>

#include "Platform/TelephonyProtocol.h"

namespace kestro {
namespace {

/// The longest that a log-channel request waits, each way.
constexpr std::chrono::seconds kRequestTimeout{1};

class PortServerConnection final : public TqServerConnection {
 public:
  explicit PortServerConnection(std::shared_ptr<RemotePort> server) : _server(std::move(server)) {}
  [[nodiscard]] RemotePort& server() const noexcept { return *_server; }

 private:
  std::shared_ptr<RemotePort> _server;
};

class PortTelephonyService final : public TelephonyService {
 public:
  PortTelephonyService(MessagePorts& ports, Uuids& uuids, const PropertyListCoding& coding,
                       SystemLog& log, std::string serverName)
      : _ports(ports),
        _uuids(uuids),
        _coding(coding),
        _log(log),
        _serverName(std::move(serverName)) {}

  [[nodiscard]] std::unique_ptr<TqServerConnection> _TqServerConnectionCreate(
      std::function<void()> notificationHandler) override;
  [[nodiscard]] LogChannelReply _TqServerConnectionNetworkMonitorCreateLogChannel(
      TqServerConnection& connection, std::string_view localPortName) override {
    return createLogChannel(connection, {{kTelephonyLocalPort, localPortName}});
  }
  [[nodiscard]] LogChannelReply createLogChannelAfter(TqServerConnection& connection,
                                                      std::string_view localPortName,
                                                      std::string_view previousPortName) override {
    return createLogChannel(
        connection, {{kTelephonyLocalPort, localPortName}, {kTelephonyPrevious, previousPortName}});
  }
  void setSourceHandler(std::function<void(const LogSourceState&)> handler) override {
    _sourceHandler = std::move(handler);
  }
  void cancelNotifications() override { _notificationPort.reset(); }

 private:
  [[nodiscard]] std::shared_ptr<LocalPort> createNotificationPort(
      const std::string& name, std::function<void()> notificationHandler);
  [[nodiscard]] LogChannelReply createLogChannel(TqServerConnection& connection,
                                                 const Dictionary& request);
  [[nodiscard]] LogChannelReply readReply(ByteView data) const;
  void readNotification(ByteView message) const;

  MessagePorts& _ports;
  Uuids& _uuids;
  const PropertyListCoding& _coding;
  SystemLog& _log;
  std::string _serverName;
  std::function<void(const LogSourceState&)> _sourceHandler;
  std::shared_ptr<LocalPort> _notificationPort;  ///< the registration: it lasts as long as the port
};

LogChannelReply failedReply(LogChannelError error) { return {.error = static_cast<long>(error)}; }

LogChannelReply failedReply(SendError error) { return {.error = static_cast<long>(error)}; }

std::unique_ptr<TqServerConnection> PortTelephonyService::_TqServerConnectionCreate(
    std::function<void()> notificationHandler) {
  auto server = _ports.createRemotePort(_serverName);
  if (!server) return nullptr;
  const auto uuid = _uuids.create();
  if (!uuid) return nullptr;
  const std::string name = "TelephonyClient." + *uuid;
  auto notificationPort = createNotificationPort(name, std::move(notificationHandler));
  const auto message = _coding.xml(Dictionary{{kTelephonyNotificationPort, name}});
  if (!notificationPort || !message) return nullptr;
  const SendError error = server->post(messageId(TelephonyMessage::Register), *message);
  if (error != SendError::None) {
    _log.log(LogPriority::Error, "Could not register for notifications (got error={})",
             static_cast<int>(error));
    return nullptr;
  }
  _notificationPort = std::move(notificationPort);
  return std::make_unique<PortServerConnection>(std::move(server));
}

std::shared_ptr<LocalPort> PortTelephonyService::createNotificationPort(
    const std::string& name, std::function<void()> notificationHandler) {
  const auto handler =
      std::make_shared<const std::function<void()>>(std::move(notificationHandler));
  const auto receive = [this, handler](std::int32_t id, ByteView message) -> std::optional<Bytes> {
    // A copy of its own: a handler may end the registration, and this function with it.
    const auto notify = handler;  // NOLINT(performance-unnecessary-copy-initialization)
    if (id != messageId(TelephonyMessage::Notification)) return std::nullopt;
    readNotification(message);
    if (*notify) (*notify)();
    return std::nullopt;
  };
  return _ports.createLocalPort(name, receive);
}

void PortTelephonyService::readNotification(ByteView message) const {
  const auto handler = _sourceHandler;
  if (!handler) return;
  const auto body = _coding.parse(message);
  if (!body || body->dictionary()[kTelephonyNotification].text() != kTelephonySourceChanged) return;
  handler(sourceStateIn(body->dictionary()));
}

LogChannelReply PortTelephonyService::createLogChannel(TqServerConnection& connection,
                                                       const Dictionary& request) {
  const auto message = _coding.xml(request);
  if (!message) return failedReply(LogChannelError::BadRequest);
  const RemotePort::Reply reply = static_cast<PortServerConnection&>(connection)
                                      .server()
                                      .request(messageId(TelephonyMessage::CreateLogChannel),
                                               *message, kRequestTimeout, kRequestTimeout);
  if (reply.error != SendError::None) return failedReply(reply.error);
  if (!reply.data) return failedReply(LogChannelError::UnusableReply);
  return readReply(*reply.data);
}

LogChannelReply PortTelephonyService::readReply(ByteView data) const {
  const auto reply = _coding.parse(data);
  if (!reply || !reply->isDictionary()) return failedReply(LogChannelError::UnusableReply);
  const Dictionary entries = reply->dictionary();
  const Value& error = entries[kTelephonyError];
  const Value& port = entries[kTelephonyPort];
  if (!error.isInteger()) return failedReply(LogChannelError::UnusableReply);
  LogChannelReply result{.error = static_cast<long>(error.integerBits()),
                         .source = sourceStateIn(entries)};
  if (port.isText()) result.portName = std::string(port.text());
  const Value& lost = entries[kTelephonyLost];
  if (lost.isInteger() && (lost.isAboveInt64() || lost.integerBits() >= 0)) {
    result.lost = static_cast<std::uint64_t>(lost.integerBits());
  }
  return result;
}

}  // namespace

std::unique_ptr<TelephonyService> createPortTelephonyService(MessagePorts& ports, Uuids& uuids,
                                                             const PropertyListCoding& coding,
                                                             SystemLog& log,
                                                             std::string serverName) {
  return std::make_unique<PortTelephonyService>(ports, uuids, coding, log, std::move(serverName));
}

}  // namespace kestro
