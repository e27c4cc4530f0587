// SPDX-License-Identifier: MIT
// The states that a simulated CDMA2000 phone moves through: 1x for paging and calls, EV-DO for
// data. The same sequence in every run.
#pragma once

#include <chrono>
#include <cstdint>

#include "Sources/C2K/C2KPackets.h"
#include "Sources/World/SimulatedPhone.h"

namespace kestro {

/// 1x call processing. Calls come and go by themselves.
class OneXCallProcessing {
 public:
  explicit OneXCallProcessing(std::uint64_t seed) noexcept : _seed(seed) {}

  void advance(std::chrono::milliseconds time) noexcept;

  [[nodiscard]] OneXState state() const noexcept { return _state; }
  [[nodiscard]] bool isInTraffic() const noexcept { return _state == OneXState::Traffic; }
  /// Whether there is nothing to do but to wait for pages.
  [[nodiscard]] bool isIdle() const noexcept {
    return _state == OneXState::Paging || _state == OneXState::Sleep;
  }
  /// Whether a pilot has been found.
  [[nodiscard]] bool hasPilot() const noexcept {
    return isIdle() || isInTraffic() || _state == OneXState::Sync;
  }

 private:
  [[nodiscard]] OneXState next() const noexcept;
  [[nodiscard]] std::chrono::milliseconds durationOf(OneXState state) const noexcept;

  std::uint64_t _seed;
  std::uint64_t _calls = 0;
  OneXState _state = OneXState::PowerUp;
  std::chrono::milliseconds _left{500};
  std::chrono::milliseconds _untilCall{12'000};
};

/// EV-DO: a session that is set up once, and connections for its data.
class EVDOConnection {
 public:
  /// Without the receiver (1x needs it) there is no EV-DO.
  void advance(std::chrono::milliseconds time, bool hasReceiver, Activity activity) noexcept;

  [[nodiscard]] EVDOState state() const noexcept { return _state; }
  [[nodiscard]] EVDOSession session() const noexcept { return _session; }
  [[nodiscard]] bool isConnected() const noexcept { return _state == EVDOState::Connected; }
  /// Whether a pilot has been found.
  [[nodiscard]] bool hasPilot() const noexcept { return _state >= EVDOState::Sync; }

 private:
  [[nodiscard]] EVDOState next(bool wantsConnection) const noexcept;

  EVDOState _state = EVDOState::Inactive;
  EVDOSession _session = EVDOSession::Closed;
  std::chrono::milliseconds _inState{0};
};

}  // namespace kestro
