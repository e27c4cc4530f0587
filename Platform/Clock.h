// SPDX-License-Identifier: MIT
// Wall-clock time and the local time zone.
#pragma once

#include <chrono>
#include <string>

namespace kestro {

/// A moment of wall-clock time: microseconds since 1970-01-01 00:00:00 UTC.
using Moment = std::chrono::sys_time<std::chrono::microseconds>;

/// Where the program reads the time and the zone.
class Clock {
 public:
  Clock() = default;
  virtual ~Clock() = default;
  Clock(const Clock&) = delete;
  Clock& operator=(const Clock&) = delete;

  [[nodiscard]] virtual Moment now() const = 0;

  /// The local zone's offset from GMT at `moment`, daylight-saving time included; east is positive.
  [[nodiscard]] virtual std::chrono::seconds timeZoneOffset(Moment moment) const = 0;

  /// Whether local daylight-saving time is in force at `moment`.
  [[nodiscard]] virtual bool isDaylightSaving(Moment moment) const = 0;
};

/// The program's default date text in the clock's zone: "2012-03-04 13:05:09 +0100".
[[nodiscard]] std::string dateText(const Clock& clock, Moment moment);

/// The status line of a connected display: "Updated 2012-03-04 at 13:05:09", local time.
[[nodiscard]] std::string updatedText(const Clock& clock, Moment moment);

}  // namespace kestro
