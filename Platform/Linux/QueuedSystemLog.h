// SPDX-License-Identifier: MIT
// The system log behind a queue, so that a stalled logger never stalls the program.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <thread>

#include "Platform/SystemLog.h"

namespace kestro {

/// Hands lines to a writer on a thread of its own. Lines wait in a bounded queue; those that find
/// it full are dropped and counted, and one line says how many as soon as the writer takes lines
/// again. Destroying it waits a moment for the lines that wait; a writer that is stuck for longer
/// is left behind with its lines.
class QueuedSystemLog final : public SystemLog {
 public:
  /// Writes one whole line; runs on the log's thread, may block, must not throw. It may outlive the
  /// log (see above), so it owns all it uses.
  using Writer = std::function<void(LogPriority, const std::string& line)>;

  /// How much may wait, the queue's own overhead included.
  static constexpr std::size_t kDefaultCapacity = std::size_t{1024} * 1024;
  static constexpr std::chrono::milliseconds kDefaultPatience{1000};

  QueuedSystemLog(LogPriority threshold, Writer writer, std::size_t capacity = kDefaultCapacity,
                  std::chrono::milliseconds patience = kDefaultPatience);
  ~QueuedSystemLog() override;

  /// Waits until every line so far has been written, at most the log's patience; false when some
  /// still wait then.
  bool flush();

 private:
  class Queue;

  void writeLine(LogPriority priority, std::string_view line) override;

  std::shared_ptr<Queue> _queue;
  std::chrono::milliseconds _patience;
  std::thread _thread;
};

/// Writes to syslog(3) under the identity "kestro".
[[nodiscard]] QueuedSystemLog::Writer syslogWriter();

}  // namespace kestro
