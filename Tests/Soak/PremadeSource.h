// SPDX-License-Identifier: MIT
// Messages that were made beforehand: what plays them is timed without what made them.
#pragma once

#include <chrono>
#include <cstddef>
#include <memory>
#include <optional>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "Sources/LogSource.h"

namespace kestro::soak {

struct PremadeMessages {
  struct Message {
    std::optional<std::chrono::microseconds> time;
    Bytes bytes;
  };

  /// Takes the first `count` messages of a source that never waits; fewer when it ends before.
  PremadeMessages(LogSource& source, std::size_t count) : technology(source.technology()) {
    while (messages.size() < count) {
      const Result<SourceStep> step = source.next();
      const auto* event = step ? std::get_if<SourceEvent>(&*step) : nullptr;
      if (event == nullptr) return;
      messages.push_back({event->time, Bytes(event->message.begin(), event->message.end())});
    }
  }

  std::string_view technology;
  std::vector<Message> messages;
};

/// Plays them once; Playback begins again where it loops.
class PremadeSource : public LogSource {
 public:
  explicit PremadeSource(std::shared_ptr<const PremadeMessages> premade)
      : _premade(std::move(premade)) {}

  [[nodiscard]] std::string_view technology() const override { return _premade->technology; }
  [[nodiscard]] Result<SourceStep> next() override {
    if (_next == _premade->messages.size()) return SourceEnded{};
    const PremadeMessages::Message& message = _premade->messages[_next++];
    return SourceEvent{
        .time = message.time, .technology = _premade->technology, .message = message.bytes};
  }
  [[nodiscard]] Result<void> restart() override {
    _next = 0;
    return {};
  }

 private:
  std::shared_ptr<const PremadeMessages> _premade;
  std::size_t _next = 0;
};

}  // namespace kestro::soak
