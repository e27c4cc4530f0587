// SPDX-License-Identifier: MIT
// Message ports within one process, with failures on request.
#pragma once

#include <chrono>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "Platform/MessagePort.h"
#include "Platform/Virtual/VirtualMainQueue.h"

namespace kestro {

/// Ports that deliver through a main queue, in the order of sending. A request calls the receiver's
/// handler at once, as the wait for a reply serves nothing else. What runs out of time takes that
/// time, in which nothing else runs. All ports are of one process, kOwnProcess, save those made by
/// `portsOf`.
class InMemoryPorts : public MessagePorts {
 public:
  /// What goes wrong next; each failure is used up by the first operation that it applies to.
  struct Failures {
    bool localPort = false;                    ///< createLocalPort yields null
    bool remotePort = false;                   ///< createRemotePort yields null
    std::optional<SendError> post;             ///< post yields this and delivers nothing
    std::optional<SendError> send;             ///< send yields this and delivers nothing
    std::optional<RemotePort::Reply> request;  ///< request yields this and delivers nothing
    /// The reply to a request comes so long after it was asked for, if that is in time.
    std::optional<std::chrono::nanoseconds> replyDelay;
    std::function<void()> duringRequest;  ///< runs while the next request waits
  };

  static constexpr ProcessNumber kOwnProcess = 1;

  explicit InMemoryPorts(VirtualMainQueue& queue) : _queue(queue) {}

  [[nodiscard]] std::shared_ptr<LocalPort> createLocalPort(std::string_view name,
                                                           ReceiveHandler handler) override;
  [[nodiscard]] std::shared_ptr<RemotePort> createRemotePort(std::string_view name) override;

  [[nodiscard]] std::string problem() const override { return _problem; }
  void setProblem(std::string problem) { _problem = std::move(problem); }

  /// The same ports as another process sees them, for as long as this object lives.
  [[nodiscard]] std::unique_ptr<MessagePorts> portsOf(ProcessNumber process);

  Failures& failures() noexcept { return _failures; }

  /// Whether somebody owns the name.
  [[nodiscard]] bool exists(std::string_view name) const { return find(name) != nullptr; }
  /// The names in use, in order.
  [[nodiscard]] std::vector<std::string> names() const;
  /// Makes the owner of `name` lose it, as if its file had been removed.
  void lose(std::string_view name);
  /// Stops or resumes the delivery of messages to `name`; meanwhile they wait, up to 4 MiB, and
  /// requests are not answered.
  void setStalled(std::string_view name, bool stalled);

 private:
  class Local;
  class Remote;
  class OfProcess;

  [[nodiscard]] std::shared_ptr<LocalPort> createLocalPort(std::string_view name,
                                                           ReceiveHandler handler,
                                                           ProcessNumber process);
  [[nodiscard]] std::shared_ptr<RemotePort> createRemotePort(std::string_view name,
                                                             ProcessNumber process);

  [[nodiscard]] std::shared_ptr<Local> find(std::string_view name) const;

  VirtualMainQueue& _queue;
  std::string _problem;
  Failures _failures;
  std::map<std::string, std::weak_ptr<Local>, std::less<>> _ports;
};

}  // namespace kestro
