// SPDX-License-Identifier: MIT
// Where in its inputs a command begins and ends.
#pragma once

#include <chrono>
#include <cstdint>
#include <string_view>
#include <variant>

#include "Platform/Clock.h"
#include "Platform/Result.h"

namespace kestro {

/// A moment; a time after the first message; or a message, by its number from 1 on.
struct MessageNumber {
  std::uint64_t number = 1;
  friend bool operator==(const MessageNumber&, const MessageNumber&) = default;
};
using InputBound = std::variant<Moment, std::chrono::microseconds, MessageNumber>;

/// The forms of a bound, for helps and refusals.
inline constexpr const char* kInputBoundForms =
    "2019-11-21T15:38:36 (UTC, unless Z or +hh:mm follows), +90s or +2m30s (from the first message "
    "on) or #N (a message)";

/// Reads a bound: a date, perhaps with a time of day (behind "T" or a blank, to the minute, second
/// or microsecond) and a zone ("Z", "+01:00"; UTC without one); "+", then hours, minutes and
/// seconds, each at most once ("+1h", "+2m30s", "+0.5s"); or "#" and a number from 1 on. The error
/// names the forms.
[[nodiscard]] Result<InputBound> parseInputBound(std::string_view text);

}  // namespace kestro
