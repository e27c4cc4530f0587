// SPDX-License-Identifier: MIT
// A message with what it says.
#pragma once

#include <cstdint>
#include <string_view>

#include "LogGenerator/Measurer.h"
#include "Platform/Clock.h"

namespace kestro {

/// One message of a drive. What it refers to need not outlive the call that it is given to; its
/// series must outlive who is given it.
struct MeasuredMessage {
  Moment time{};
  std::uint64_t number = 0;  ///< its place in the recording, from 1
  /// As the log channel names it: a constant text of Platform/TelephonyService.h.
  std::string_view technology;
  /// It was encoded from a drive-test log: what such a log does not hold is made up.
  bool isFromDriveTest = false;
  Measured measured;
};

}  // namespace kestro
