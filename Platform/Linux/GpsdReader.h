// SPDX-License-Identifier: MIT
// Reads a gpsd on a thread of its own.
#pragma once

#include <memory>
#include <mutex>
#include <optional>
#include <string>

#include "Platform/PositionService.h"

namespace kestro {

/// The last that a gpsd has said. The thread that reads it and the main thread share it.
class GpsdMailbox {
 public:
  struct News {
    bool isNew = false;
    std::optional<PositionFix> fix;
    std::string failure;  ///< empty: gpsd is connected
  };

  void put(std::optional<PositionFix> fix);
  void fail(std::string reason);
  /// What is the case; new if it came since the last time.
  [[nodiscard]] News take();

  void stop();
  [[nodiscard]] bool isStopped() const;

 private:
  mutable std::mutex _mutex;
  News _news;
  bool _isStopped = false;
};

/// Connects and reads until the mailbox is stopped; connects anew, after a while, when that fails.
/// Looking up a host and connecting have no time limit, hence the thread.
void readGpsd(const PositionServer& server, const std::shared_ptr<GpsdMailbox>& mailbox);

}  // namespace kestro
