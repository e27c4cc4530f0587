// SPDX-License-Identifier: MIT
#include "Platform/Virtual/VirtualServices.h"

#include <fmt/format.h>

namespace kestro {
namespace {

std::string joined(std::string_view left, std::string_view right) {
  return fmt::format("{} {}", left, right);
}

}  // namespace

std::vector<std::string> VirtualBundle::resourcesOfType(std::string_view extension) const {
  std::vector<std::string> result;
  const std::string suffix = fmt::format(".{}", extension);
  for (const auto& [path, contents] : _resources) {
    if (path.ends_with(suffix)) result.push_back(path);
  }
  return result;
}

std::optional<Bytes> VirtualBundle::resource(std::string_view name,
                                             std::string_view extension) const {
  const auto found = _resources.find(fmt::format("{}.{}", name, extension));
  if (found == _resources.end()) return std::nullopt;
  return found->second;
}

std::optional<bool> VirtualPreferences::boolean(std::string_view domain,
                                                std::string_view key) const {
  const auto found = _values.find(joined(domain, key));
  if (found == _values.end()) return std::nullopt;
  return found->second;
}

void VirtualPreferences::setBoolean(std::string_view domain, std::string_view key, bool value) {
  _values.insert_or_assign(joined(domain, key), value);
  _events.push_back(fmt::format("set {} {} {}", domain, key, value));
}

void VirtualPreferences::synchronize(std::string_view domain) {
  _events.push_back(joined("synchronize", domain));
}

void VirtualPreferences::notifyChanged(std::string_view domain, std::string_view key) {
  _events.push_back(fmt::format("notify {} {}", domain, key));
}

Result<void> VirtualDeviceRoot::write(std::string_view devicePath, ByteView contents) {
  if (_failure) return failure(*_failure);
  _files.insert_or_assign(std::string(devicePath), Bytes(contents.begin(), contents.end()));
  return {};
}

std::optional<std::string> VirtualUuids::create() {
  if (_exhausted) return std::nullopt;
  return fmt::format("00000000-0000-0000-0000-{:012}", ++_last);
}

std::unique_ptr<TqServerConnection> VirtualTelephonyService::_TqServerConnectionCreate(
    std::function<void()> notificationHandler) {
  if (!_reachable) return nullptr;
  _notificationHandler = std::move(notificationHandler);
  return std::make_unique<TqServerConnection>();
}

LogChannelReply VirtualTelephonyService::_TqServerConnectionNetworkMonitorCreateLogChannel(
    TqServerConnection& /*connection*/, std::string_view localPortName) {
  return _channelHandler ? _channelHandler(localPortName) : LogChannelReply{};
}

LogChannelReply VirtualTelephonyService::createLogChannelAfter(TqServerConnection& connection,
                                                               std::string_view localPortName,
                                                               std::string_view previousPortName) {
  _previousPorts.emplace_back(previousPortName);
  return _TqServerConnectionNetworkMonitorCreateLogChannel(connection, localPortName);
}

class VirtualInputStreams::Stream : public InputStream {
 public:
  explicit Stream(std::shared_ptr<Handlers> handlers) : _handlers(std::move(handlers)) {}

 private:
  std::shared_ptr<Handlers> _handlers;
};

Result<std::unique_ptr<InputStream>> VirtualInputStreams::open(
    std::string_view path, std::function<void(ByteView)> received,
    std::function<void(std::string_view reason)> ended) {
  if (path != _allowed) return failure(fmt::format("{}: No such file or directory", path));
  auto handlers = std::make_shared<Handlers>(Handlers{std::move(received), std::move(ended)});
  _open = handlers;
  return std::make_unique<Stream>(std::move(handlers));
}

void VirtualInputStreams::receive(ByteView bytes) const {
  if (const auto handlers = _open.lock()) handlers->received(bytes);
}

void VirtualInputStreams::end(std::string_view reason) const {
  if (const auto handlers = _open.lock()) handlers->ended(reason);
}

}  // namespace kestro
