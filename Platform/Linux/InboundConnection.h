// SPDX-License-Identifier: MIT
// A connection that somebody made to a local port of ours.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <utility>

#include "Platform/Linux/PortConnection.h"
#include "Platform/MessagePort.h"

namespace kestro {

/// What a local port shares with its connections, which outlive it while its handler runs.
struct PortReceiver {
  explicit PortReceiver(ReceiveHandler receiveHandler) : handler(std::move(receiveHandler)) {}

  const ReceiveHandler handler;
  ProcessNumber sender = kUnknownProcess;  ///< of what the handler is answering
};

/// Serves the messages and requests of one peer, in order, a bounded amount in each turn of the
/// event loop, so that a busy peer holds up neither timers nor other peers. Made by make_shared
/// only.
class InboundConnection final : public PortConnection {
 public:
  using ClosedHandler = std::function<void(const InboundConnection&)>;

  /// `peer` is the process at the other end. `closed` runs once, unless `disown` was called.
  InboundConnection(FileDescriptor socket, ProcessNumber peer, std::string portName,
                    std::shared_ptr<PortContext> context, std::shared_ptr<PortReceiver> receiver,
                    ClosedHandler closed);

  /// Serves what has arrived by now; no more than a few MiB, in a fraction of a second.
  void serveArrived();

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

  ProcessNumber _peer;
  std::shared_ptr<PortReceiver> _receiver;
  ClosedHandler _closed;
  bool _serving = false;
  bool _ended = false;  ///< the peer sends no more
};

}  // namespace kestro
