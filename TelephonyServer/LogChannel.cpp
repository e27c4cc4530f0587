// SPDX-License-Identifier: MIT
#include "TelephonyServer/LogChannel.h"

#include <utility>
#include <variant>

#include "Platform/PropertyListCoding.h"
#include "Platform/SourceTimes.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"
#include "Platform/Uuids.h"

namespace kestro {

LogChannel::LogChannel(Platform& platform, std::shared_ptr<RemotePort> client,
                       std::function<std::string_view()> technology)
    : _platform(platform),
      _client(std::move(client)),
      _clientProcess(_client->owner()),
      _technology(std::move(technology)) {}

bool LogChannel::open() {
  const auto uuid = _platform.uuids().create();
  if (!uuid) {
    _platform.systemLog().write(LogPriority::Error, "No UUID for the port of a log channel");
    return false;
  }
  _portName = "LogChannel." + *uuid;
  _port = _platform.messagePorts().createLocalPort(
      _portName,
      [this](std::int32_t messageId, ByteView message) { return answer(messageId, message); });
  return _port != nullptr;
}

bool LogChannel::deliver(ByteView message, Moment time) {
  if (!_command || !_command->filter.accepts(message)) return true;
  const SendError error = post(message, time);
  if (error != SendError::None) ++_refused;
  switch (error) {
    case SendError::None:
      return true;
    case SendError::InvalidPort:
      _platform.systemLog().log(LogPriority::Info, "{} closes: its client has gone", _portName);
      return false;
    default:
      _platform.systemLog().log(LogPriority::Warning,
                                "{} closes: its client reads too slowly, or has just gone",
                                _portName);
      return false;
  }
}

SendError LogChannel::post(ByteView message, Moment time) {
  if (_command->wantsTimes) {
    const auto error =
        _client->post(messageId(TelephonyMessage::SourceTime), sourceTimeBytes(time));
    if (error != SendError::None) return error;
  }
  return _client->post(messageId(TelephonyMessage::Channel), message);
}

std::optional<LostChannel> LogChannel::close() {
  _port.reset();
  _client->invalidate();
  if (!_command) return std::nullopt;
  const auto unsent = _client->unsentMessages(messageId(TelephonyMessage::Channel));
  return LostChannel{_portName, _clientProcess, *std::move(_command), _refused + unsent};
}

bool LogChannel::isOpen() const { return _port && _port->isValid() && _client->isValid(); }

std::optional<Bytes> LogChannel::answer(std::int32_t id, ByteView message) {
  if (id != messageId(TelephonyMessage::Channel)) return std::nullopt;
  auto command = parseChannelCommand(_platform.propertyListCoding(), message);
  if (!command) {
    _platform.systemLog().log(LogPriority::Warning, "{} received no command: {}", _portName,
                              command.error().message);
    return std::nullopt;
  }
  if (std::holds_alternative<GetTechnologyCommand>(*command)) return technologyReply();
  start(std::move(std::get<StartCommand>(*command)));
  return std::nullopt;
}

std::optional<Bytes> LogChannel::technologyReply() const {
  return _platform.propertyListCoding().xml(Dictionary{{kTelephonyGetTechnology, _technology()}});
}

}  // namespace kestro
