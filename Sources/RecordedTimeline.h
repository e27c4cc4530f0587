// SPDX-License-Identifier: MIT
// The time of a recording that is played back.
#pragma once

#include <chrono>
#include <optional>

#include "Platform/Clock.h"

namespace kestro {

/// Turns the wall-clock times of a recording into times since its beginning that never go back.
/// Where the recording device's clock was set (a step back, or forward by more than a day) the
/// recording goes on without a pause.
class RecordedTimeline {
 public:
  static constexpr std::chrono::hours kLongestPause{24};

  /// The time since the beginning of what was recorded at `moment`, after everything before it.
  std::chrono::microseconds advanceTo(Moment moment) noexcept {
    if (_last) {
      const auto step = moment - *_last;
      if (step > step.zero() && step <= kLongestPause) _elapsed += step;
    }
    _last = moment;
    return _elapsed;
  }

 private:
  std::optional<Moment> _last;
  std::chrono::microseconds _elapsed{0};
};

}  // namespace kestro
