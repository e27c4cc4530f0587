// SPDX-License-Identifier: MIT
// Where the telephony server's log messages come from.
#pragma once

#include <chrono>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <variant>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"

namespace kestro {

/// What a source says next: a message, a technology, or both at one moment.
struct SourceEvent {
  /// When the event is due, in the source's own time since its beginning; never before the event
  /// before it. Absent when the source is live: the event is due at once.
  std::optional<std::chrono::microseconds> time;
  /// The technology from this event on; a constant text of Platform/TelephonyService.h.
  std::string_view technology;
  /// The message, in that technology's format. Valid until the source's next `next` or `restart`.
  /// Empty when the event only changes the technology.
  ByteView message;
  /// When the source had the message, by its own clock; absent where it has none: that is now.
  std::optional<Moment> moment = std::nullopt;
  /// What is to be said of the message, as comments of a recording are; valid as it is.
  std::span<const std::string> comments = {};
};

/// Nothing is there yet; the source's ready handler will say when to ask again.
struct SourceWaits {};

/// The source has come to its regular end.
struct SourceEnded {};

using SourceStep = std::variant<SourceEvent, SourceWaits, SourceEnded>;

/// A source of log messages. It knows nothing of clients and reads no clock: whoever plays it
/// decides when to ask. Main thread only.
class LogSource {
 public:
  LogSource() = default;
  virtual ~LogSource() = default;
  LogSource(const LogSource&) = delete;
  LogSource& operator=(const LogSource&) = delete;

  /// The technology with which the source begins, before its first event.
  [[nodiscard]] virtual std::string_view technology() const = 0;

  /// The next event. An error is final, as the end is: the source yields nothing more until a
  /// `restart`.
  [[nodiscard]] virtual Result<SourceStep> next() = 0;

  /// What made the messages up, in whole or in part: "simulation" or "drive-test"; empty for what a
  /// baseband has sent. Valid until the next `next`.
  [[nodiscard]] virtual std::string_view madeUp() const noexcept { return {}; }

  /// How much there has been of what there will be, 0 to 1; absent when nobody knows.
  [[nodiscard]] virtual std::optional<double> fractionRead() const noexcept { return std::nullopt; }

  /// Goes back to the beginning: the times of the events start again from there.
  [[nodiscard]] virtual Result<void> restart() = 0;

  /// For sources that yield SourceWaits: `handler` runs on the main thread when `next` may have
  /// more. It must not destroy the source.
  virtual void setReadyHandler(std::function<void()> handler) { static_cast<void>(handler); }

  /// Whether anybody gets the messages; nobody does at first. A source that asks others asks them
  /// only while somebody does. `done` runs once the source has come to rest, or goes on, in the
  /// call or later; it may be empty, and is dropped when the next call comes first.
  virtual void setWatched(bool isWatched, std::function<void()> done) {
    static_cast<void>(isWatched);
    if (done) done();
  }
};

/// What sources say of messages that they made up; see `LogSource::madeUp`.
inline constexpr std::string_view kMadeUpBySimulation = "simulation";
inline constexpr std::string_view kMadeUpFromDriveTest = "drive-test";

/// Takes one line for the people who run the server: what a source left out, and why.
using SourceReporter = std::function<void(std::string_view line)>;

}  // namespace kestro
