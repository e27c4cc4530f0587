// SPDX-License-Identifier: MIT
#include "Platform/Virtual/VirtualModemService.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

namespace kestro {
namespace {

std::string textOf(const BusCall& call) {
  if (call.arguments.empty()) return call.method;
  const auto& content = call.arguments.back().content;
  if (const auto* number = std::get_if<std::uint64_t>(&content)) {
    return fmt::format("{}({})", call.method, *number);
  }
  if (const auto* text = std::get_if<std::string>(&content)) {
    return fmt::format("{}({})", call.method, *text);
  }
  return call.method;
}

}  // namespace

class VirtualModemService::Connection : public ModemServiceConnection {
 public:
  Connection(VirtualModemService& service, std::shared_ptr<Client> client)
      : _service(service), _client(std::move(client)) {}

  void call(const BusCall& call, std::chrono::milliseconds deadline,
            std::function<void(const BusReply& reply)> answered) override {
    _service.answer(call, deadline, _client, std::move(answered));
  }

 private:
  VirtualModemService& _service;
  std::shared_ptr<Client> _client;
};

std::unique_ptr<ModemServiceConnection> VirtualModemService::connect(
    ModemServiceHandlers handlers) {
  auto client = std::make_shared<Client>(Client{std::move(handlers)});
  _clients.push_back(client);
  if (_state != ModemServiceState::Connecting) tell(client);
  return std::make_unique<Connection>(*this, std::move(client));
}

void VirtualModemService::tell(const std::shared_ptr<Client>& client) {
  _queue.post([weak = std::weak_ptr(client), state = _state, reason = _reason] {
    if (const auto told = weak.lock()) told->handlers.stateChanged(state, reason);
  });
}

void VirtualModemService::setState(ModemServiceState state, std::string reason) {
  _state = state;
  _reason = std::move(reason);
  for (const auto& weak : _clients) {
    if (const auto client = weak.lock()) tell(client);
  }
}

void VirtualModemService::signal(const BusSignal& signal) {
  for (const auto& weak : _clients) {
    _queue.post([weak, signal] {
      if (const auto client = weak.lock()) client->handlers.signalled(signal);
    });
  }
}

void VirtualModemService::answer(const BusCall& call, std::chrono::milliseconds deadline,
                                 std::weak_ptr<Client> client,
                                 std::function<void(const BusReply&)> answered) {
  _calls.push_back(textOf(call));
  const auto reply = [this, call, client, answered](bool isInTime) {
    if (client.expired()) return;
    if (!isInTime || !_handler) {
      answered(tl::unexpected(BusError{std::string(kBusErrorNoReply), "no answer"}));
    } else {
      answered(_handler(call));
    }
  };
  if (_answers) return _queue.post([reply] { reply(true); });
  _queue.postAfter(deadline, [reply] { reply(false); });
}

std::size_t VirtualModemService::connectionCount() const {
  return static_cast<std::size_t>(
      std::ranges::count_if(_clients, [](const auto& client) { return !client.expired(); }));
}

}  // namespace kestro
