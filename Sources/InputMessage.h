// SPDX-License-Identifier: MIT
// One message of what a command reads.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

/// What it refers to is valid until the next message is asked for, or its input ends; the
/// technology is a constant text of Platform/TelephonyService.h.
struct InputMessage {
  /// Its place among all messages of all inputs, from 1, before anything is narrowed.
  std::uint64_t number = 0;
  Moment time;
  std::string_view technology = {};
  /// The message as it came on the log channel.
  ByteView bytes;
  /// The message's length when it was recorded; more than `bytes.size()` when the recorder cut it.
  std::size_t originalLength = 0;
  /// Notes, remarks of the recorder, and where the phone was (see Recordings/PositionComment.h).
  std::span<const std::string> comments = {};
  /// What made it up, in whole or in part: "simulation" or "drive-test"; empty for what a baseband
  /// has sent.
  std::string_view madeUp = {};
  /// Which of the inputs it is of, the first being 0.
  std::size_t input = 0;

  [[nodiscard]] bool isCut() const noexcept { return bytes.size() < originalLength; }
};

}  // namespace kestro
