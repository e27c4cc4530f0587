// SPDX-License-Identifier: MIT
#include "Platform/Linux/UnixLocalPort.h"

#include <sys/socket.h>

#include <cerrno>
#include <system_error>
#include <utility>
#include <vector>

#include "Platform/Linux/PortPeer.h"

namespace kestro {
namespace {

/// How often a port looks whether its name is still its own.
constexpr std::chrono::milliseconds kWatchInterval{1000};

/// How many connections are accepted before others get their turn.
constexpr int kAcceptsPerTurn = 16;

/// How long nothing is accepted after the system had no descriptor or memory for a connection.
constexpr std::chrono::milliseconds kAcceptPause{100};

/// Whether this failure concerns one connection only; the next one may be accepted at once.
bool concernsOneConnection(int error) { return error == ECONNABORTED || error == EINTR; }

}  // namespace

UnixLocalPort::UnixLocalPort(PortListener listener, std::string name, ReceiveHandler handler,
                             std::shared_ptr<PortContext> context)
    : _listener(std::move(listener)),
      _name(std::move(name)),
      _receiver(std::make_shared<PortReceiver>(std::move(handler))),
      _context(std::move(context)),
      _acceptNotifier(
          std::make_unique<QSocketNotifier>(_listener->socket(), QSocketNotifier::Read)),
      _watch(std::make_unique<QTimer>()) {
  QObject::connect(_acceptNotifier.get(), &QSocketNotifier::activated,
                   [this] { acceptConnections(); });
  QObject::connect(_watch.get(), &QTimer::timeout, [this] { checkName(); });
  _watch->start(kWatchInterval);
}

UnixLocalPort::~UnixLocalPort() { close(); }

void UnixLocalPort::setInvalidationHandler(std::function<void()> handler) {
  _invalidationHandler = std::move(handler);
}

void UnixLocalPort::invalidate() {
  if (!isValid()) return;
  close();
  // Nothing of the port is touched after this: the handler may destroy it.
  if (const auto handler = std::exchange(_invalidationHandler, nullptr)) handler();
}

void UnixLocalPort::acceptConnections() {
  for (int i = 0; i < kAcceptsPerTurn; ++i) {
    FileDescriptor socket(
        ::accept4(_listener->socket(), nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC));
    if (socket.isOpen()) {
      _acceptFailed = false;
      serve(std::move(socket));
    } else if (errno == EAGAIN || errno == EWOULDBLOCK) {
      return;
    } else if (!concernsOneConnection(errno)) {
      pauseAccepting(errno);
      return;
    }
  }
}

// The connection stays in the system's queue, so that without a pause the notifier would spin.
void UnixLocalPort::pauseAccepting(int error) {
  if (!std::exchange(_acceptFailed, true)) {
    _context->log.log(LogPriority::Error, "Message port \"{}\": cannot accept a connection: {}",
                      _name, std::generic_category().message(error));
  }
  _acceptNotifier->setEnabled(false);
  QTimer::singleShot(kAcceptPause, _acceptNotifier.get(),
                     [this] { _acceptNotifier->setEnabled(true); });
}

void UnixLocalPort::serve(FileDescriptor socket) {
  const auto peer = peerOf(socket.get());
  if (!peer || peer->user != _context->peerUser) {
    _context->log.log(LogPriority::Error,
                      "Message port \"{}\": refusing a connection of another user", _name);
    return;
  }
  auto connection = std::make_shared<InboundConnection>(
      std::move(socket), peer->process, _name, _context, _receiver,
      [this](const InboundConnection& closed) { _connections.erase(&closed); });
  _connections.emplace(connection.get(), connection);
}

void UnixLocalPort::serveArrived() {
  // Handlers may close connections, and the port.
  std::vector<std::shared_ptr<InboundConnection>> connections;
  connections.reserve(_connections.size());
  for (const auto& [key, connection] : _connections) connections.push_back(connection);
  for (const auto& connection : connections) connection->serveArrived();
}

void UnixLocalPort::checkName() {
  if (_listener->ownsName()) return;
  _context->log.log(LogPriority::Error, "Message port \"{}\": its socket file is gone", _name);
  invalidate();
}

void UnixLocalPort::close() {
  _watch.reset();
  _acceptNotifier.reset();
  _listener.reset();
  for (const auto& [key, connection] : std::exchange(_connections, {})) connection->disown();
}

}  // namespace kestro
