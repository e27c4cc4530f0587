// SPDX-License-Identifier: MIT
// Reading sources to their end.
#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "Sources/LogSource.h"

namespace kestro {

/// One event, kept.
struct ReadEvent {
  std::optional<std::chrono::microseconds> time;
  std::string technology;
  Bytes message;
  std::optional<Moment> moment = std::nullopt;
};

/// The source's next event, which there must be.
inline ReadEvent readEvent(LogSource& source) {
  const auto step = source.next();
  if (!step.has_value()) {
    ADD_FAILURE() << step.error().message;
    return {};
  }
  const auto* event = std::get_if<SourceEvent>(&*step);
  if (event == nullptr) {
    ADD_FAILURE() << "no event";
    return {};
  }
  return {event->time, std::string(event->technology),
          Bytes(event->message.begin(), event->message.end()), event->moment};
}

/// All events up to the source's regular end.
inline std::vector<ReadEvent> readToEnd(LogSource& source) {
  std::vector<ReadEvent> events;
  while (true) {
    const auto step = source.next();
    if (!step.has_value()) {
      ADD_FAILURE() << step.error().message;
      return events;
    }
    const auto* event = std::get_if<SourceEvent>(&*step);
    if (event == nullptr) {
      EXPECT_TRUE(std::holds_alternative<SourceEnded>(*step));
      return events;
    }
    events.push_back({event->time, std::string(event->technology),
                      Bytes(event->message.begin(), event->message.end()), event->moment});
  }
}

}  // namespace kestro
