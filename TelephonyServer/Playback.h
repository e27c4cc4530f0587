// SPDX-License-Identifier: MIT
// Plays a source at its own pace.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string_view>
#include <utility>

#include "Platform/Clock.h"
#include "Platform/MainQueue.h"
#include "Sources/LogSource.h"

namespace kestro {

/// Who takes what is played.
class PlaybackListener {
 public:
  PlaybackListener() = default;
  virtual ~PlaybackListener() = default;
  PlaybackListener(const PlaybackListener&) = delete;
  PlaybackListener& operator=(const PlaybackListener&) = delete;

  /// The technology of the following messages, before the first of them; a constant text. Called
  /// for changes only: the listener knows the technology with which the source begins.
  virtual void technologyChanged(std::string_view technology) = 0;

  /// One message, when it is due; valid during the call. `time` is when the source had it, by the
  /// source's own clock; for sources without one it is now.
  virtual void messageDue(ByteView message, Moment time) = 0;

  /// The source has ended for good: no more messages come.
  virtual void sourceEnded() = 0;
};

struct PlaybackOptions {
  /// How many seconds of the source pass in one second; above 0.
  double speed = 1.0;
  /// Whether the source begins again when it has ended.
  bool loop = false;
};

/// Hands a source's events to a listener when they are due. Time passes whether or not anybody is
/// there to listen; events that are late (a busy machine) follow at once, in portions that leave
/// room for everything else on the main thread. When the clock is set, the source jumps ahead by at
/// most ten seconds, or stands still for at most one.
class Playback {
 public:
  /// The references must outlive the playback. `report` gets a line when the source ends, fails or
  /// pauses for long.
  Playback(std::unique_ptr<LogSource> source, const PlaybackOptions& options, MainQueue& queue,
           const Clock& clock, PlaybackListener& listener, SourceReporter report);
  Playback(const Playback&) = delete;
  Playback& operator=(const Playback&) = delete;
  ~Playback() = default;

  /// Starts the source's time. Nothing is handed over inside this call.
  void start();

  /// Says to the source whether anybody gets its messages; see `LogSource::setWatched`.
  void setWatched(bool isWatched, std::function<void()> done = {}) {
    _source->setWatched(isWatched, std::move(done));
  }

 private:
  /// What one turn on the main thread may hand over before others have theirs.
  static constexpr std::size_t kMessagesPerTurn = 256;
  static constexpr std::size_t kBytesPerTurn = std::size_t{1024} * 1024;

  using Microseconds = std::chrono::duration<double, std::micro>;

  void turn();
  void passTime();
  [[nodiscard]] bool fetch();
  void handOver();
  void finishPass(std::string_view error);
  void stop();
  void restart();
  void wakeAfter(std::chrono::nanoseconds delay);
  void wakeWhenDue();

  std::unique_ptr<LogSource> _source;
  PlaybackOptions _options;
  MainQueue& _queue;
  const Clock& _clock;
  PlaybackListener& _listener;
  SourceReporter _report;

  std::string_view _technology;
  /// The event that waits for its time.
  std::optional<SourceEvent> _event;
  bool _isPauseAnnounced = false;
  /// How far the source's time has come, and when that was so.
  Microseconds _position{0};
  Moment _looked;
  std::chrono::nanoseconds _asked{0};

  std::uint64_t _messages = 0;
  std::uint64_t _eventsOfPass = 0;
  bool _isStopped = false;
  bool _isInTurn = false;
  bool _isRestarting = false;
  std::uint64_t _wakes = 0;
  /// Blocks on the queue hold it weakly, to know whether the playback still is.
  std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

}  // namespace kestro
