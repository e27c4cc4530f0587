// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortFlusher.h"

#include <QMetaObject>
#include <utility>

#include "Platform/Linux/PortConnection.h"

namespace kestro {

void PortFlusher::schedule(std::weak_ptr<PortConnection> connection) {
  if (_scheduled.empty()) {
    QMetaObject::invokeMethod(
        this, [this] { flushAll(); }, Qt::QueuedConnection);
  }
  _scheduled.push_back(std::move(connection));
}

void PortFlusher::flushAll() {
  for (const auto& weak : std::exchange(_scheduled, {})) {
    if (const auto connection = weak.lock()) connection->endTurn();
  }
}

}  // namespace kestro
