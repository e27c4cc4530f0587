// SPDX-License-Identifier: MIT
#include "Model/LogChannelPorts.h"

#include <fmt/format.h>

#include <optional>
#include <string>
#include <utility>

#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"
#include "Platform/Uuids.h"

namespace kestro {
namespace {

constexpr std::int32_t kMessageId = messageId(TelephonyMessage::Channel);

}  // namespace

LogChannelPorts::LogChannelPorts(Platform& platform, LogChannelHandlers handlers)
    : _platform(platform), _handlers(std::move(handlers)) {
  if (_handlers.sourceTold) _platform.telephonyService().setSourceHandler(_handlers.sourceTold);
}

LogChannelPorts::~LogChannelPorts() {
  if (_handlers.sourceTold) _platform.telephonyService().setSourceHandler({});
  _platform.telephonyService().cancelNotifications();
  close();
}

bool LogChannelPorts::open() {
  const auto uuid = _platform.uuids().create();
  if (!uuid) return false;
  const std::string name = fmt::format("KestroApp.{}", *uuid);
  createLocalPort(name);
  const std::string unusable = _platform.messagePorts().problem();
  _problem = unusable.empty() ? ConnectionProblem{}
                              : ConnectionProblem{ConnectionProblem::Kind::Ports, unusable};
  if (!createRemotePort(name)) return false;
  _platform.systemLog().log(LogPriority::Error, " ***** Created ports (send={}, recv={})",
                            addressText(_sendPort.get()), addressText(_recvPort.get()));
  return areOpen();
}

void LogChannelPorts::createLocalPort(std::string_view name) {
  _sourceTimes = {};
  _recvPort = _platform.messagePorts().createLocalPort(
      name, [this](std::int32_t messageId, ByteView message) -> std::optional<Bytes> {
        if (_sourceTimes.isLogData(messageId, message)) _handlers.received(message);
        return std::nullopt;
      });
  // Without a port the request for a channel goes out all the same, and fails or is torn down.
  if (!_recvPort) return;
  _recvPort->setInvalidationHandler([this, port = _recvPort.get()] {
    _platform.systemLog().log(LogPriority::Error, " ***** INVALIDATED {} *****", addressText(port));
    _handlers.lost();
  });
}

bool LogChannelPorts::createRemotePort(std::string_view localPortName) {
  TelephonyService& telephony = _platform.telephonyService();
  const auto connection = telephony._TqServerConnectionCreate([this] { _handlers.notified(); });
  if (!connection) {
    logError("Could not create TqServerConnection");
    return false;
  }
  const LogChannelReply channel = requestChannel(*connection, localPortName);
  if (channel.error != 0) {
    _platform.systemLog().log(
        LogPriority::Error, "_TqServerConnectionNetworkMonitorCreateLogChannel returns error: {}!",
        channel.error);
    _problem = {ConnectionProblem::Kind::NoChannel, std::to_string(channel.error)};
    return false;
  }
  if (!channel.portName || channel.portName->empty()) {
    logError("Could not create a log channel (Tq returned null port)!");
    return false;
  }
  const bool follows = !std::exchange(_channelPort, *channel.portName).empty();
  if (_handlers.sourceTold) _handlers.sourceTold(channel.source);
  if (follows && _handlers.followed) _handlers.followed(channel.lost);
  _sendPort = _platform.messagePorts().createRemotePort(*channel.portName);
  if (!_sendPort) logError("Could not create the remote port!");
  return _sendPort != nullptr;
}

LogChannelReply LogChannelPorts::requestChannel(TqServerConnection& connection,
                                                std::string_view localPortName) {
  TelephonyService& telephony = _platform.telephonyService();
  if (_channelPort.empty() || !_handlers.followed) {
    return telephony._TqServerConnectionNetworkMonitorCreateLogChannel(connection, localPortName);
  }
  return telephony.createLogChannelAfter(connection, localPortName, _channelPort);
}

void LogChannelPorts::close() {
  if (const auto port = std::exchange(_recvPort, nullptr)) {
    port->setInvalidationHandler({});  // closing the port does not lose it
    port->invalidate();
  }
  if (const auto port = std::exchange(_sendPort, nullptr)) port->invalidate();
}

bool LogChannelPorts::check() {
  if (!areOpen()) return false;
  if (_sendPort->isValid()) return true;
  // The handler may let go of the port that is being invalidated.
  const std::shared_ptr<LocalPort> port = _recvPort;
  if (_handlers.followed) port->serveArrived();  // what came in time counts as received
  port->invalidate();
  return false;
}

RemotePort::Reply LogChannelPorts::request(ByteView command) {
  return _sendPort->request(kMessageId, command, kCommandTimeout, kCommandTimeout);
}

SendError LogChannelPorts::send(ByteView command) {
  return _sendPort->send(kMessageId, command, kCommandTimeout);
}

void LogChannelPorts::logError(std::string_view line) {
  _platform.systemLog().write(LogPriority::Error, line);
}

}  // namespace kestro
