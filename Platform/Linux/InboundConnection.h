// SPDX-License-Identifier: MIT
// A connection that somebody made to a local port of ours.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "Platform/Linux/PortConnection.h"
#include "Platform/MessagePort.h"

namespace kestro {

/// Serves the messages and requests of one peer, in order, a bounded amount in each turn of the
/// event loop, so that a busy peer holds up neither timers nor other peers. Made by make_shared
/// only.
class InboundConnection final : public PortConnection {
 public:
  using ClosedHandler = std::function<void(const InboundConnection&)>;

  /// `handler` is shared with the port, whose end it outlives while it runs. `closed` runs once,
  /// unless `disown` was called.
  InboundConnection(FileDescriptor socket, std::string portName,
                    std::shared_ptr<PortContext> context,
                    std::shared_ptr<const ReceiveHandler> handler, ClosedHandler closed);

  /// Closes without calling the closed handler: its owner is gone.
  void disown();

 private:
  void onReadable() override;
  void onDrained() override;
  void onClosed() override;
  void serve();
  void arrangeNextTurn();
  void answer(const PortFrame& frame);
  [[nodiscard]] bool mayServe() noexcept;

  std::shared_ptr<const ReceiveHandler> _handler;
  ClosedHandler _closed;
  bool _serving = false;
  bool _ended = false;  ///< the peer sends no more
};

}  // namespace kestro
