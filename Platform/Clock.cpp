// SPDX-License-Identifier: MIT
#include "Platform/Clock.h"

#include <fmt/chrono.h>
#include <fmt/format.h>

namespace kestro {
namespace {

/// The local date and time of day at `moment`, as if it were a UTC calendar time.
std::tm localCalendar(const Clock& clock, Moment moment) {
  const auto local = moment.time_since_epoch() + clock.timeZoneOffset(moment);
  return fmt::gmtime(
      static_cast<std::time_t>(std::chrono::floor<std::chrono::seconds>(local).count()));
}

}  // namespace

std::string dateText(const Clock& clock, Moment moment) {
  const long offset = static_cast<long>(clock.timeZoneOffset(moment).count());
  const long minutes = (offset < 0 ? -offset : offset) / 60;
  return fmt::format("{:%Y-%m-%d %H:%M:%S} {}{:02}{:02}", localCalendar(clock, moment),
                     offset < 0 ? '-' : '+', minutes / 60, minutes % 60);
}

std::string updatedText(const Clock& clock, Moment moment) {
  return fmt::format("Updated {0:%Y-%m-%d} at {0:%H:%M:%S}", localCalendar(clock, moment));
}

}  // namespace kestro
