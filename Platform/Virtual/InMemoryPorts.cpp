// SPDX-License-Identifier: MIT
#include "Platform/Virtual/InMemoryPorts.h"

#include <utility>
#include <vector>

#include "Platform/PortName.h"

namespace kestro {
namespace {

constexpr std::size_t kMaximumWaitingBytes = std::size_t{4} * 1024 * 1024;
constexpr std::chrono::nanoseconds kAtOnce{0};

}  // namespace

class InMemoryPorts::Local : public LocalPort, public std::enable_shared_from_this<Local> {
 public:
  Local(MainQueue& queue, ReceiveHandler handler, ProcessNumber owner)
      : _queue(queue), _handler(std::move(handler)), _owner(owner) {}

  void setInvalidationHandler(std::function<void()> handler) override {
    _invalidationHandler = std::move(handler);
  }

  void invalidate() override {
    if (!_valid) return;
    _valid = false;
    _waiting.clear();
    if (const auto handler = std::exchange(_invalidationHandler, {})) handler();
  }

  [[nodiscard]] bool isValid() const override { return _valid; }
  void serveArrived() override {
    const auto self = shared_from_this();
    while (_valid && !_stalled && !_waiting.empty()) deliverFirst();
  }
  [[nodiscard]] bool isStalled() const noexcept { return _stalled; }

  [[nodiscard]] ProcessNumber sender() const override { return _sender; }
  [[nodiscard]] ProcessNumber owner() const noexcept { return _owner; }

  /// Takes a message for delivery; false when too much waits already.
  bool enqueue(std::int32_t messageId, ByteView message, ProcessNumber sender) {
    if (_waitingBytes + message.size() > kMaximumWaitingBytes) return false;
    _waitingBytes += message.size();
    _waiting.push_back({messageId, Bytes(message.begin(), message.end()), sender});
    if (!_stalled) scheduleDelivery();
    return true;
  }

  std::optional<Bytes> answer(std::int32_t messageId, ByteView message, ProcessNumber sender) {
    const ProcessNumber outer = std::exchange(_sender, sender);
    auto reply = _handler(messageId, message);
    _sender = outer;
    return reply;
  }

  void setStalled(bool stalled) {
    _stalled = stalled;
    if (stalled) return;
    for (std::size_t i = 0; i < _waiting.size(); ++i) scheduleDelivery();
  }

 private:
  struct Message {
    std::int32_t id;
    Bytes bytes;
    ProcessNumber sender;
  };

  void scheduleDelivery() {
    _queue.post([weak = weak_from_this()] {
      if (const auto port = weak.lock()) port->deliverFirst();
    });
  }

  void deliverFirst() {
    if (!_valid || _stalled || _waiting.empty()) return;
    const Message message = std::move(_waiting.front());
    _waiting.pop_front();
    _waitingBytes -= message.bytes.size();
    static_cast<void>(answer(message.id, message.bytes, message.sender));
  }

  MainQueue& _queue;
  ReceiveHandler _handler;
  ProcessNumber _owner;
  ProcessNumber _sender = kUnknownProcess;
  std::function<void()> _invalidationHandler;
  std::deque<Message> _waiting;
  std::size_t _waitingBytes = 0;
  bool _valid = true;
  bool _stalled = false;
};

class InMemoryPorts::Remote : public RemotePort {
 public:
  Remote(InMemoryPorts& ports, const std::shared_ptr<Local>& receiver, ProcessNumber process)
      : _ports(ports), _receiver(receiver), _owner(receiver->owner()), _process(process) {}

  SendError post(std::int32_t messageId, ByteView message) override {
    const SendError error = deliver(messageId, message, _ports._failures.post);
    if (error != kQueueIsFull) return error;
    invalidate();
    return SendError::Transport;
  }

  SendError send(std::int32_t messageId, ByteView message,
                 std::chrono::nanoseconds sendTimeout) override {
    const SendError error = deliver(messageId, message, _ports._failures.send);
    if (error == SendError::SendTimeout) _ports._queue.wait(sendTimeout);
    return error;
  }

  [[nodiscard]] Reply request(std::int32_t messageId, ByteView message,
                              std::chrono::nanoseconds sendTimeout,
                              std::chrono::nanoseconds receiveTimeout) override {
    Reply reply = ask(messageId, message, receiveTimeout);
    if (reply.error == SendError::SendTimeout) _ports._queue.wait(sendTimeout);
    if (reply.error == SendError::ReceiveTimeout) _ports._queue.wait(receiveTimeout);
    return reply;
  }

  void invalidate() override { _receiver.reset(); }

  [[nodiscard]] bool isValid() const override { return valid() != nullptr; }
  [[nodiscard]] std::size_t unsentMessages(std::int32_t) const override { return 0; }
  [[nodiscard]] ProcessNumber owner() const override { return _owner; }

 private:
  static constexpr SendError kQueueIsFull = SendError::SendTimeout;

  [[nodiscard]] Reply ask(std::int32_t messageId, ByteView message,
                          std::chrono::nanoseconds receiveTimeout) {
    const auto receiver = valid();
    if (!receiver) return {SendError::InvalidPort, {}};
    if (const auto meanwhile = std::exchange(_ports._failures.duringRequest, {})) meanwhile();
    if (auto failure = std::exchange(_ports._failures.request, std::nullopt)) return *failure;
    const auto delay = std::exchange(_ports._failures.replyDelay, {}).value_or(kAtOnce);
    if (receiver->isStalled()) return {SendError::ReceiveTimeout, {}};
    auto answer = receiver->answer(messageId, message, _process);
    if (delay > receiveTimeout) return {SendError::ReceiveTimeout, {}};
    _ports._queue.wait(delay);
    return {SendError::None, std::move(answer)};
  }

  [[nodiscard]] std::shared_ptr<Local> valid() const {
    auto receiver = _receiver.lock();
    return receiver && receiver->isValid() ? receiver : nullptr;
  }

  SendError deliver(std::int32_t messageId, ByteView message, std::optional<SendError>& failure) {
    const auto receiver = valid();
    if (!receiver) return SendError::InvalidPort;
    if (const auto error = std::exchange(failure, std::nullopt)) return *error;
    if (message.size() > kMaximumMessageSize) return SendError::Transport;
    return receiver->enqueue(messageId, message, _process) ? SendError::None : kQueueIsFull;
  }

  InMemoryPorts& _ports;
  std::weak_ptr<Local> _receiver;
  ProcessNumber _owner;
  ProcessNumber _process;
};

class InMemoryPorts::OfProcess : public MessagePorts {
 public:
  OfProcess(InMemoryPorts& ports, ProcessNumber process) : _ports(ports), _process(process) {}

  [[nodiscard]] std::shared_ptr<LocalPort> createLocalPort(std::string_view name,
                                                           ReceiveHandler handler) override {
    return _ports.createLocalPort(name, std::move(handler), _process);
  }
  [[nodiscard]] std::shared_ptr<RemotePort> createRemotePort(std::string_view name) override {
    return _ports.createRemotePort(name, _process);
  }

 private:
  InMemoryPorts& _ports;
  ProcessNumber _process;
};

std::unique_ptr<MessagePorts> InMemoryPorts::portsOf(ProcessNumber process) {
  return std::make_unique<OfProcess>(*this, process);
}

std::shared_ptr<LocalPort> InMemoryPorts::createLocalPort(std::string_view name,
                                                          ReceiveHandler handler) {
  return createLocalPort(name, std::move(handler), kOwnProcess);
}

std::shared_ptr<RemotePort> InMemoryPorts::createRemotePort(std::string_view name) {
  return createRemotePort(name, kOwnProcess);
}

std::shared_ptr<LocalPort> InMemoryPorts::createLocalPort(std::string_view name,
                                                          ReceiveHandler handler,
                                                          ProcessNumber process) {
  if (std::exchange(_failures.localPort, false) || !isPortName(name) || exists(name))
    return nullptr;
  std::erase_if(_ports, [](const auto& entry) { return entry.second.expired(); });
  auto port = std::make_shared<Local>(_queue, std::move(handler), process);
  _ports.insert_or_assign(std::string(name), port);
  return port;
}

std::shared_ptr<RemotePort> InMemoryPorts::createRemotePort(std::string_view name,
                                                            ProcessNumber process) {
  const auto receiver = find(name);
  if (std::exchange(_failures.remotePort, false) || !receiver) return nullptr;
  return std::make_shared<Remote>(*this, receiver, process);
}

std::vector<std::string> InMemoryPorts::names() const {
  std::vector<std::string> result;
  for (const auto& [name, port] : _ports) {
    if (exists(name)) result.push_back(name);
  }
  return result;
}

void InMemoryPorts::lose(std::string_view name) {
  if (const auto port = find(name)) port->invalidate();
}

void InMemoryPorts::setStalled(std::string_view name, bool stalled) {
  if (const auto port = find(name)) port->setStalled(stalled);
}

std::shared_ptr<InMemoryPorts::Local> InMemoryPorts::find(std::string_view name) const {
  const auto found = _ports.find(name);
  if (found == _ports.end()) return nullptr;
  auto port = found->second.lock();
  return port && port->isValid() ? port : nullptr;
}

}  // namespace kestro
