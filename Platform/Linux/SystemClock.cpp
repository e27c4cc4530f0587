// SPDX-License-Identifier: MIT
// The system's clock and the zone of the process ($TZ, /etc/localtime).
#include <ctime>

#include "Platform/Clock.h"
#include "Platform/Linux/LinuxPlatform.h"

namespace kestro {
namespace {

/// Local calendar time; all zero (GMT) for a moment that the system's calendar cannot express.
std::tm localTime(Moment moment) {
  const auto seconds = std::chrono::floor<std::chrono::seconds>(moment).time_since_epoch();
  const auto time = static_cast<std::time_t>(seconds.count());
  std::tm result = {};
  ::tzset();  // localtime_r alone need not look at $TZ
  if (::localtime_r(&time, &result) == nullptr) return {};
  return result;
}

class SystemClock final : public Clock {
 public:
  [[nodiscard]] Moment now() const override {
    return std::chrono::floor<std::chrono::microseconds>(std::chrono::system_clock::now());
  }

  [[nodiscard]] std::chrono::seconds timeZoneOffset(Moment moment) const override {
    return std::chrono::seconds(localTime(moment).tm_gmtoff);
  }

  [[nodiscard]] bool isDaylightSaving(Moment moment) const override {
    return localTime(moment).tm_isdst > 0;
  }
};

}  // namespace

std::unique_ptr<Clock> createSystemClock() { return std::make_unique<SystemClock>(); }

}  // namespace kestro
