// SPDX-License-Identifier: MIT
// Writes what was queued during a turn of the event loop at the turn's end, connection by
// connection, so that many small messages leave in few system calls.
#pragma once

#include <QObject>
#include <memory>
#include <vector>

namespace kestro {

class PortConnection;

class PortFlusher final : private QObject {
 public:
  /// Flushes `connection` when the event loop gets its next turn.
  void schedule(std::weak_ptr<PortConnection> connection);

  /// Flushes every scheduled connection now: nothing may stay queued while the thread waits.
  void flushAll();

 private:
  std::vector<std::weak_ptr<PortConnection>> _scheduled;
};

}  // namespace kestro
