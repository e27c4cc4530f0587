// SPDX-License-Identifier: MIT
#include "TelephonyServer/Server.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Platform/PortName.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {
namespace {

// A client that closed its ports without a word is forgotten this soon.
constexpr std::chrono::seconds kLookInterval{1};

Dictionary channelReply(LogChannelError error) {
  return {{kTelephonyError, Value::integer(static_cast<std::int64_t>(error))}};
}

}  // namespace

Result<std::unique_ptr<Server>> Server::open(Platform& platform, std::string_view name,
                                             std::string_view technology,
                                             std::function<void()> portLost) {
  if (!isPortName(name)) return failure(fmt::format("\"{}\" is no port name", name));
  std::unique_ptr<Server> server(new Server(platform, technology));
  if (server->openPort(name)) {
    server->_port->setInvalidationHandler(std::move(portLost));
    return server;
  }
  if (platform.messagePorts().createRemotePort(name)) {
    return failure(fmt::format("another server is running: the port name \"{}\" is taken", name));
  }
  return failure(fmt::format("cannot open the port \"{}\"; the system log says why", name));
}

Server::Server(Platform& platform, std::string_view technology)
    : _platform(platform), _technology(technology) {}

bool Server::openPort(std::string_view name) {
  _port = _platform.messagePorts().createLocalPort(
      name,
      [this](std::int32_t messageId, ByteView message) { return answer(messageId, message); });
  if (!_port) return false;
  _timer = _platform.mainQueue().scheduleRepeating(kLookInterval, [this] { forgetWhoIsGone(); });
  return true;
}

void Server::technologyChanged(std::string_view technology) {
  _technology = technology;
  _channels.clear();
  const auto notification = _platform.propertyListCoding().xml(
      Dictionary{{kTelephonyNotification, kTelephonyTechnologyChanged}});
  if (!notification) return;
  for (const auto& [name, client] : _registrations) {
    static_cast<void>(client->post(messageId(TelephonyMessage::Notification), *notification));
  }
}

void Server::messageDue(ByteView message) {
  if (message.size() > kMaximumStreamedMessage) {
    _platform.systemLog().log(LogPriority::Warning,
                              "A message of {} bytes is left out: no more than {} can wait for a "
                              "client",
                              message.size(), kMaximumStreamedMessage);
    return;
  }
  std::erase_if(_channels, [&](const auto& channel) { return !channel->deliver(message); });
}

void Server::forgetWhoIsGone() {
  std::erase_if(_channels, [](const auto& channel) { return !channel->isOpen(); });
  std::erase_if(_registrations, [](const auto& entry) { return !entry.second->isValid(); });
}

std::optional<Bytes> Server::answer(std::int32_t id, ByteView message) {
  if (id == messageId(TelephonyMessage::Register)) {
    registerClient(message);
  } else if (id == messageId(TelephonyMessage::CreateLogChannel)) {
    return createLogChannel(message);
  }
  return std::nullopt;
}

void Server::registerClient(ByteView message) {
  const auto refuse = [this](std::string_view why) {
    _platform.systemLog().log(LogPriority::Warning, "A registration is dropped: {}", why);
  };
  forgetWhoIsGone();
  const auto name = portNameIn(message, kTelephonyNotificationPort);
  if (!name) return refuse("it names no port");
  if (_registrations.contains(*name)) return;
  if (_registrations.size() >= kMaximumRegistrations) return refuse("there are too many");
  auto client = _platform.messagePorts().createRemotePort(*name);
  if (!client) return refuse(fmt::format("nobody owns the port {}", *name));
  _registrations.emplace(*name, std::move(client));
}

Bytes Server::createLogChannel(ByteView message) {
  Dictionary reply = channelReply(LogChannelError::None);
  forgetWhoIsGone();
  if (const auto name = portNameIn(message, kTelephonyLocalPort); !name) {
    reply = channelReply(LogChannelError::BadRequest);
  } else if (_channels.size() >= kMaximumChannels) {
    _platform.systemLog().log(LogPriority::Warning, "No log channel for {}: there are {} already",
                              *name, kMaximumChannels);
    reply = channelReply(LogChannelError::NoChannel);
  } else if (auto client = _platform.messagePorts().createRemotePort(*name); !client) {
    reply = channelReply(LogChannelError::NoLocalPort);
  } else {
    auto channel =
        std::make_unique<LogChannel>(_platform, std::move(client), [this] { return _technology; });
    if (channel->open()) {
      reply.set(kTelephonyPort, channel->portName());
      _channels.push_back(std::move(channel));
    } else {
      reply = channelReply(LogChannelError::NoChannel);
    }
  }
  return _platform.propertyListCoding().xml(reply).value_or(Bytes{});
}

std::optional<std::string> Server::portNameIn(ByteView message, std::string_view key) const {
  const auto parsed = _platform.propertyListCoding().parse(message);
  if (!parsed) return std::nullopt;
  const auto dictionary = parsed->dictionary();
  const auto name = dictionary[key].text();
  if (!isPortName(name)) return std::nullopt;
  return std::string(name);
}

}  // namespace kestro
