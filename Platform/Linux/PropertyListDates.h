// SPDX-License-Identifier: MIT
// Dates as the property-list library counts them: seconds since 2001-01-01 00:00:00 UTC.
#pragma once

#include <chrono>
#include <cstdint>
#include <limits>

#include "Platform/Clock.h"

namespace kestro {

inline constexpr Moment kPropertyListEpoch =
    std::chrono::sys_days(std::chrono::year(2001) / std::chrono::January / 1);

/// Whether a property list may hold the date: one of the years 1 to 9999.
[[nodiscard]] constexpr bool isPropertyListDate(double secondsSinceEpoch) noexcept {
  constexpr std::chrono::sys_seconds kStart =
      std::chrono::sys_days(std::chrono::year(1) / std::chrono::January / 1);
  constexpr std::chrono::sys_seconds kEnd =
      std::chrono::sys_days(std::chrono::year(10'000) / std::chrono::January / 1);
  constexpr std::chrono::duration<double> kFirst = kStart - kPropertyListEpoch;
  constexpr std::chrono::duration<double> kBeyond = kEnd - kPropertyListEpoch;
  return secondsSinceEpoch >= kFirst.count() && secondsSinceEpoch < kBeyond.count();
}

/// Whether the library can hand the date over: its whole seconds are a 32-bit number, which reaches
/// from 1932-12-13 to 2069-01-19.
[[nodiscard]] constexpr bool isLibraryDate(double secondsSinceEpoch) noexcept {
  return secondsSinceEpoch > std::numeric_limits<std::int32_t>::min() &&
         secondsSinceEpoch < std::numeric_limits<std::int32_t>::max();
}

}  // namespace kestro
