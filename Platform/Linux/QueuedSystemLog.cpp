// SPDX-License-Identifier: MIT
#include "Platform/Linux/QueuedSystemLog.h"

#include <syslog.h>

#include <condition_variable>
#include <mutex>
#include <utility>
#include <vector>

namespace kestro {

/// What the main thread and the log's thread share. It belongs to both.
class QueuedSystemLog::Queue {
 public:
  Queue(Writer writer, std::size_t capacity) : _writer(std::move(writer)), _capacity(capacity) {}

  void add(LogPriority priority, std::string_view line) {
    const std::size_t cost = sizeof(Line) + line.size();
    const std::lock_guard lock(_mutex);
    if (cost > _capacity - _used) {
      ++_dropped;
    } else {
      _waiting.push_back({priority, std::string(line)});
      _used += cost;
    }
    _changed.notify_all();
  }

  void stop() {
    const std::lock_guard lock(_mutex);
    _isStopped = true;
    _changed.notify_all();
  }

  bool waitUntilWritten(std::chrono::milliseconds patience) {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, patience, [this] { return !hasWork() && !_isWriting; });
  }

  /// The log's thread: writes until stopped and out of work.
  void run() {
    std::unique_lock lock(_mutex);
    while (true) {
      _isWriting = false;
      _changed.notify_all();
      _changed.wait(lock, [this] { return hasWork() || _isStopped; });
      if (!hasWork()) return;
      _isWriting = true;
      const std::vector<Line> lines = std::exchange(_waiting, {});
      const std::size_t lost = std::exchange(_dropped, 0);
      _used = 0;
      lock.unlock();
      write(lines, lost);
      lock.lock();
    }
  }

 private:
  struct Line {
    LogPriority priority;
    std::string text;
  };

  [[nodiscard]] bool hasWork() const { return !_waiting.empty() || _dropped != 0; }

  // The lost lines came after all that waited: nothing leaves the queue while it is full.
  void write(const std::vector<Line>& lines, std::size_t lost) const {
    for (const Line& line : lines) _writer(line.priority, line.text);
    if (lost == 0) return;
    _writer(LogPriority::Warning, fmt::format("{} log lines were dropped: the log stalled", lost));
  }

  const Writer _writer;
  const std::size_t _capacity;
  std::mutex _mutex;
  std::condition_variable _changed;
  std::vector<Line> _waiting;
  std::size_t _used = 0;
  std::size_t _dropped = 0;
  bool _isWriting = true;
  bool _isStopped = false;
};

QueuedSystemLog::QueuedSystemLog(LogPriority threshold, Writer writer, std::size_t capacity,
                                 std::chrono::milliseconds patience)
    : SystemLog(threshold),
      _queue(std::make_shared<Queue>(std::move(writer), capacity)),
      _patience(patience),
      _thread([queue = _queue] { queue->run(); }) {}

QueuedSystemLog::~QueuedSystemLog() {
  _queue->stop();
  if (_queue->waitUntilWritten(_patience)) {
    _thread.join();
  } else {
    _thread.detach();
  }
}

bool QueuedSystemLog::flush() { return _queue->waitUntilWritten(_patience); }

void QueuedSystemLog::writeLine(LogPriority priority, std::string_view line) {
  _queue->add(priority, line);
}

QueuedSystemLog::Writer syslogWriter() {
  ::openlog("kestro", LOG_PID, LOG_USER);
  return [](LogPriority priority, const std::string& line) {
    ::syslog(static_cast<int>(priority), "%s", line.c_str());
  };
}

}  // namespace kestro
