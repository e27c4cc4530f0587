// SPDX-License-Identifier: MIT
// The source's times that a telephony server sends with its messages, to who asks for them.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// The body of the message that says when the source had the log data that follows it.
using SourceTimeBytes = std::array<std::uint8_t, 8>;
[[nodiscard]] SourceTimeBytes sourceTimeBytes(Moment time) noexcept;

/// Keeps the time that came until the log data comes that it belongs to.
class SourceTimes {
 public:
  /// To be called for every message on a client's local port. Whether it is log data.
  [[nodiscard]] bool isLogData(std::int32_t messageId, ByteView message) noexcept;

  /// The time of the log data that has just come; absent when the server did not send one.
  [[nodiscard]] std::optional<Moment> time() const noexcept { return _time; }

 private:
  std::optional<Moment> _next;
  std::optional<Moment> _time;
};

}  // namespace kestro
