// SPDX-License-Identifier: MIT
// Feeding recorded messages to a generator, refreshing its display as time passes in the recording.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "LogGenerator/LogGenerator.h"
#include "Model/KestroModel.h"
#include "Model/StateOwner.h"
#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"

namespace kestro {

/// The time in a recording, in the zone of another clock. Give it to the platform of the generator
/// that is replayed to, so that dates are the recording's.
class ReplayClock : public Clock {
 public:
  /// `zone` must outlive this clock; its own time is not asked for.
  explicit ReplayClock(const Clock& zone) : _zone(zone) {}

  [[nodiscard]] Moment now() const override { return _now; }
  [[nodiscard]] std::chrono::seconds timeZoneOffset(Moment moment) const override {
    return _zone.timeZoneOffset(moment);
  }
  [[nodiscard]] bool isDaylightSaving(Moment moment) const override {
    return _zone.isDaylightSaving(moment);
  }

  void setNow(Moment now) noexcept { _now = now; }

 private:
  const Clock& _zone;
  Moment _now{};
};

struct ReplayMessage {
  std::uint64_t number = 0;  ///< its place in the recording
  Moment time;
  std::string_view technology;
  ByteView bytes;
};

struct ReplayOptions {
  /// The recording's time between two refreshes; 0 refreshes after every message.
  std::chrono::microseconds refreshInterval = kDisplayUpdateInterval;
  /// How many bytes of messages a generator may collect until it is refreshed before its time.
  std::size_t refreshBytes = std::size_t{4} * 1024 * 1024;
};

/// What a refresh yields.
struct ReplayRefresh {
  Moment time;                  ///< of the tick, or of the message that caused the refresh
  std::uint64_t message = 0;    ///< the last message that was applied
  std::string_view technology;  ///< of the display
  const Value& display;         ///< may be null; the generator may go on changing it later
};

/// Does with a recording what the model does with a live channel. The first message starts the
/// ticks; a tick refreshes when messages were applied since the last refresh. A message of another
/// technology starts them anew, with another generator on the same state: what no tick has seen of
/// the display before is gone. The generator's history and collected data are bound by the
/// refreshes, so memory does not grow with the recording.
class Replay {
 public:
  using RefreshHandler = std::function<void(const ReplayRefresh&)>;
  /// Makes the generator for a technology; null when there is none.
  using GeneratorFactory =
      std::function<std::unique_ptr<LogGenerator>(std::string_view technology)>;

  /// The clock must outlive the replay. `refreshed` runs within `feed` and `finish`.
  Replay(GeneratorFactory makeGenerator, ReplayClock& clock, const ReplayOptions& options,
         RefreshHandler refreshed);

  /// Makes the generator of the first message's technology beforehand, for recordings that have no
  /// message; false when there is none.
  bool begin(std::string_view technology);

  /// Applies one message, after the refreshes that its time makes due. A message that would end the
  /// application, or whose technology has no generator, is left out, and the error says why; the
  /// next one can be fed all the same. Times that run backwards by more than an interval start the
  /// ticks anew.
  [[nodiscard]] Result<void> feed(const ReplayMessage& message);

  /// Refreshes once more if messages were applied since the last refresh.
  void finish();

  /// The display of the last refresh; null before the first, or when there was none.
  [[nodiscard]] const Value& display() const noexcept { return _display; }
  /// The state as the generator keeps it.
  [[nodiscard]] Dictionary& state() noexcept { return _state; }
  /// The technology of the last message; empty before there was one.
  [[nodiscard]] const std::string& technology() const noexcept { return _stateOwner.technology(); }
  /// Its generator; null before there was one.
  [[nodiscard]] LogGenerator* generator() const noexcept { return _generator.get(); }

 private:
  bool follow(std::string_view technology);
  void passTimeTo(Moment time);
  void refreshAt(Moment time);

  GeneratorFactory _makeGenerator;
  ReplayClock& _clock;
  ReplayOptions _options;
  RefreshHandler _refreshed;
  std::unique_ptr<LogGenerator> _generator;
  StateOwner _stateOwner;
  Dictionary _state;
  Value _display;
  std::optional<Moment> _nextTick;
  std::uint64_t _lastMessage = 0;
  std::size_t _bytesSinceRefresh = 0;
  bool _updated = false;
};

}  // namespace kestro
