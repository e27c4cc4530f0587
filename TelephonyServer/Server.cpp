// SPDX-License-Identifier: MIT
#include "TelephonyServer/Server.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Platform/PortName.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"

namespace kestro {
namespace {

// A client that closed its ports without a word is forgotten this soon.
constexpr std::chrono::seconds kLookInterval{1};

Dictionary channelReply(LogChannelError error) {
  return {{kTelephonyError, Value::integer(static_cast<std::int64_t>(error))}};
}

/// The port name under `key`; absent when there is none.
std::optional<std::string> portNameIn(const Dictionary& body, std::string_view key) {
  const auto name = body[key].text();
  if (!isPortName(name)) return std::nullopt;
  return std::string(name);
}

}  // namespace

Result<std::unique_ptr<Server>> Server::open(Platform& platform, std::string_view name,
                                             std::string_view technology,
                                             std::function<void()> portLost) {
  if (!isPortName(name)) return failure(fmt::format("\"{}\" is no port name", name));
  std::unique_ptr<Server> server(new Server(platform, name, technology));
  if (server->openPort()) {
    server->_port->setInvalidationHandler(std::move(portLost));
    return server;
  }
  if (platform.messagePorts().createRemotePort(name)) {
    return failure(fmt::format("another server is running: the port name \"{}\" is taken", name));
  }
  const std::string problem = platform.messagePorts().problem();
  if (!problem.empty()) return failure(problem);
  return failure(fmt::format("cannot open the port \"{}\"; the system log says why", name));
}

Server::Server(Platform& platform, std::string_view name, std::string_view technology)
    : _platform(platform), _name(name), _technology(technology) {}

bool Server::openPort() {
  _port = _platform.messagePorts().createLocalPort(
      _name,
      [this](std::int32_t messageId, ByteView message) { return answer(messageId, message); });
  if (!_port) return false;
  _timer = _platform.mainQueue().scheduleRepeating(kLookInterval, [this] {
    forgetWhoIsGone();
    _lostChannels.secondPassed();
  });
  return true;
}

void Server::technologyChanged(std::string_view technology) {
  _technology = technology;
  closeChannels([](LogChannel&) { return true; });
  _lostChannels.technologyChanged();
  notify({{kTelephonyNotification, kTelephonyTechnologyChanged}});
}

void Server::setSource(LogSourceState source) {
  const auto hasEnded = _source.hasEnded;
  _source = std::move(source);
  if (!_source.hasEnded) _source.hasEnded = hasEnded;
}

void Server::sourceEnded() {
  _source.hasEnded = true;
  Dictionary body{{kTelephonyNotification, kTelephonySourceChanged}};
  addSourceState(_source, body);
  notify(body);
}

void Server::notify(const Dictionary& body) {
  const auto notification = _platform.propertyListCoding().xml(body);
  if (!notification) return;
  for (const auto& [name, client] : _registrations) {
    static_cast<void>(client->post(messageId(TelephonyMessage::Notification), *notification));
  }
}

void Server::messageDue(ByteView message, Moment time) {
  if (message.size() > kMaximumStreamedMessage) {
    _platform.systemLog().log(LogPriority::Warning,
                              "A message of {} bytes is left out: no more than {} can wait for a "
                              "client",
                              message.size(), kMaximumStreamedMessage);
    return;
  }
  _lostChannels.messageDue(message);
  closeChannels([&](LogChannel& channel) { return !channel.deliver(message, time); });
}

void Server::closeChannels(const std::function<bool(LogChannel&)>& isOver) {
  std::erase_if(_channels, [&](const auto& channel) {
    if (!isOver(*channel)) return false;
    if (auto lost = channel->close()) _lostChannels.remember(*std::move(lost));
    return true;
  });
  tellWhetherWatched();
}

void Server::tellWhetherWatched() {
  if (std::exchange(_isWatched, !_channels.empty()) == !_channels.empty()) return;
  if (_watchHandler) _watchHandler(_isWatched);
}

void Server::forgetWhoIsGone() {
  closeChannels([](const LogChannel& channel) { return !channel.isOpen(); });
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
  const auto name = portNameIn(dictionaryIn(message), kTelephonyNotificationPort);
  if (!name) return refuse("it names no port");
  if (_registrations.contains(*name)) return;
  if (_registrations.size() >= kMaximumRegistrations) return refuse("there are too many");
  auto client = connectTo(*name);
  if (!client) return refuse(client.error().message);
  _registrations.emplace(*name, std::move(*client));
}

Bytes Server::createLogChannel(ByteView message) {
  forgetWhoIsGone();
  const Dictionary request = dictionaryIn(message);
  const auto localPort = portNameIn(request, kTelephonyLocalPort);
  const Dictionary reply =
      localPort ? channelReplyTo(request, *localPort) : channelReply(LogChannelError::BadRequest);
  return _platform.propertyListCoding().xml(reply).value_or(Bytes{});
}

Dictionary Server::channelReplyTo(const Dictionary& request, const std::string& localPort) {
  const auto channel = openChannel(localPort);
  if (!channel) return channelReply(channel.error());
  Dictionary reply = channelReply(LogChannelError::None);
  reply.set(kTelephonyPort, (*channel)->portName());
  addSourceState(_source, reply);
  if (const auto previous = portNameIn(request, kTelephonyPrevious)) {
    const auto lost = follow(**channel, *previous);
    if (lost) reply.set(kTelephonyLost, Value::integer(static_cast<std::int64_t>(*lost)));
  }
  return reply;
}

std::optional<std::uint64_t> Server::follow(LogChannel& channel, std::string_view previous) {
  // What the client has given up may look open from here.
  closeChannels([&](const LogChannel& other) {
    return &other != &channel && other.portName() == previous && other.client() == channel.client();
  });
  auto lost = _lostChannels.take(previous, channel.client());
  if (!lost) return std::nullopt;
  channel.start(std::move(lost->command));
  return lost->missed;
}

tl::expected<LogChannel*, LogChannelError> Server::openChannel(const std::string& localPort) {
  const auto refuse = [&](LogChannelError error, std::string_view why) {
    _platform.systemLog().log(LogPriority::Warning, "No log channel for {}: {}", localPort, why);
    return tl::unexpected(error);
  };
  if (_registrations.contains(localPort)) {
    return refuse(LogChannelError::NoLocalPort, "notifications go to this port");
  }
  if (_channels.size() >= kMaximumChannels) {
    return refuse(LogChannelError::NoChannel,
                  fmt::format("there are {} already", kMaximumChannels));
  }
  auto client = connectTo(localPort);
  if (!client) return refuse(LogChannelError::NoLocalPort, client.error().message);
  auto channel =
      std::make_unique<LogChannel>(_platform, std::move(*client), [this] { return _technology; });
  if (!channel->open()) return tl::unexpected(LogChannelError::NoChannel);
  LogChannel* opened = _channels.emplace_back(std::move(channel)).get();
  tellWhetherWatched();
  return opened;
}

Result<std::shared_ptr<RemotePort>> Server::connectTo(const std::string& port) const {
  if (isOwnPort(port)) return failure(fmt::format("the port {} is the server's own", port));
  auto client = _platform.messagePorts().createRemotePort(port);
  if (!client) return failure(fmt::format("nobody owns the port {}", port));
  // Whoever names another's port would fill it with messages that its owner did not ask for.
  if (client->owner() == kUnknownProcess || client->owner() != _port->sender()) {
    return failure(fmt::format("the port {} is not of the process that asks", port));
  }
  return client;
}

bool Server::isOwnPort(std::string_view name) const {
  return name == _name || std::ranges::any_of(_channels, [name](const auto& channel) {
           return channel->portName() == name;
         });
}

Dictionary Server::dictionaryIn(ByteView message) const {
  const auto parsed = _platform.propertyListCoding().parse(message);
  return parsed ? parsed->dictionary() : Dictionary();
}

}  // namespace kestro
