// SPDX-License-Identifier: MIT
#include "Platform/Linux/UnfinishedFrames.h"

#include <fmt/format.h>

#include <algorithm>
#include <memory>
#include <vector>

#include "Platform/Linux/PortConnection.h"

namespace kestro {

UnfinishedFrames::UnfinishedFrames(std::chrono::milliseconds patience) : _patience(patience) {
  constexpr int kLooks = 10;
  _timer.setInterval(patience / kLooks);
  QObject::connect(&_timer, &QTimer::timeout, [this] { closeStalled(); });
}

void UnfinishedFrames::count(PortConnection& connection, std::size_t bytes) {
  if (bytes == 0) {
    if (const auto found = _frames.find(&connection); found != _frames.end()) {
      _bytes -= found->second.bytes;
      _frames.erase(found);
    }
    if (_frames.empty()) _timer.stop();
    return;
  }
  Frame& frame = _frames[&connection];
  if (bytes != frame.bytes) frame.lastByte = std::chrono::steady_clock::now();
  _bytes += bytes - frame.bytes;
  frame.bytes = bytes;
  if (!_timer.isActive()) _timer.start();
  if (_bytes > kMaximumBytes) closeLargest();
}

void UnfinishedFrames::closeLargest() {
  const auto largest =
      std::ranges::max_element(_frames, {}, [](const auto& entry) { return entry.second.bytes; });
  const auto connection = largest->first->shared_from_this();
  connection->abandon(fmt::format(
      "{} bytes of a frame that has not ended wait here, and {} on all connections, at most {} may",
      largest->second.bytes, _bytes, kMaximumBytes));
}

void UnfinishedFrames::closeStalled() {
  std::vector<std::shared_ptr<PortConnection>> stalled;
  const auto now = std::chrono::steady_clock::now();
  for (const auto& [connection, frame] : _frames) {
    // What waits to be read is no fault of the peer's: this process had no time for it.
    if (now - frame.lastByte >= _patience && !connection->hasUnreadBytes()) {
      stalled.push_back(connection->shared_from_this());
    }
  }
  for (const auto& connection : stalled) {
    connection->abandon(fmt::format("nothing of a frame that has not ended came for {} s",
                                    std::chrono::duration<double>(_patience).count()));
  }
}

}  // namespace kestro
