// SPDX-License-Identifier: MIT
// A port of this process's own.
#pragma once

#include <QSocketNotifier>
#include <QTimer>
#include <functional>
#include <memory>
#include <string>
#include <unordered_map>

#include "Platform/Linux/InboundConnection.h"
#include "Platform/Linux/PortConnection.h"
#include "Platform/Linux/PortDirectory.h"
#include "Platform/MessagePort.h"

namespace kestro {

class UnixLocalPort final : public LocalPort {
 public:
  UnixLocalPort(PortListener listener, std::string name, ReceiveHandler handler,
                std::shared_ptr<PortContext> context);
  ~UnixLocalPort() override;

  void setInvalidationHandler(std::function<void()> handler) override;
  void invalidate() override;
  [[nodiscard]] bool isValid() const override { return _listener.has_value(); }
  void serveArrived() override;
  [[nodiscard]] ProcessNumber sender() const override { return _receiver->sender; }

 private:
  void acceptConnections();
  void pauseAccepting(int error);
  void serve(FileDescriptor socket);
  void checkName();
  void close();

  std::optional<PortListener> _listener;  ///< absent once the port is invalid
  std::string _name;
  std::shared_ptr<PortReceiver> _receiver;
  std::shared_ptr<PortContext> _context;
  std::function<void()> _invalidationHandler;
  std::unique_ptr<QSocketNotifier> _acceptNotifier;
  bool _acceptFailed = false;  ///< the last time; told once
  std::unique_ptr<QTimer> _watch;
  std::unordered_map<const InboundConnection*, std::shared_ptr<InboundConnection>> _connections;
};

}  // namespace kestro
