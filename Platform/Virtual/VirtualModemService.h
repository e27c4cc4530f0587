// SPDX-License-Identifier: MIT
// A ModemManager in memory, which does what its test says.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/MainQueue.h"
#include "Platform/ModemService.h"

namespace kestro {

/// A service that is Connecting until it is given a state. Calls are answered in the next turn of
/// the queue, or at their deadline with kBusErrorNoReply when `answers` is told so.
class VirtualModemService : public ModemService {
 public:
  /// Answers a call; none: nobody answers.
  using Handler = std::function<BusReply(const BusCall& call)>;

  explicit VirtualModemService(MainQueue& queue) : _queue(queue) {}

  [[nodiscard]] std::unique_ptr<ModemServiceConnection> connect(
      ModemServiceHandlers handlers) override;

  /// Tells all connections, and those that are made from now on.
  void setState(ModemServiceState state, std::string reason = "");
  void signal(const BusSignal& signal);
  void setHandler(Handler handler) { _handler = std::move(handler); }
  /// Whether calls are answered at all.
  void setAnswers(bool answers) noexcept { _answers = answers; }

  /// All calls so far, as "method", or "method(argument)" where there is one number or text.
  [[nodiscard]] const std::vector<std::string>& calls() const noexcept { return _calls; }
  void forgetCalls() { _calls.clear(); }
  [[nodiscard]] std::size_t connectionCount() const;

 private:
  class Connection;
  struct Client {
    ModemServiceHandlers handlers;
  };
  void tell(const std::shared_ptr<Client>& client);
  void answer(const BusCall& call, std::chrono::milliseconds deadline, std::weak_ptr<Client> client,
              std::function<void(const BusReply&)> answered);

  MainQueue& _queue;
  ModemServiceState _state = ModemServiceState::Connecting;
  std::string _reason;
  Handler _handler;
  bool _answers = true;
  std::vector<std::weak_ptr<Client>> _clients;
  std::vector<std::string> _calls;
};

}  // namespace kestro
