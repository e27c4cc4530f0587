// SPDX-License-Identifier: MIT
#include "Sources/C2K/C2KStates.h"

#include <cmath>

#include "Sources/World/Noise.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

/// So many milliseconds, evenly spread between two limits in seconds.
milliseconds between(double shortest, double longest, double fraction) noexcept {
  return milliseconds(std::llround((shortest + (longest - shortest) * fraction) * 1000));
}

}  // namespace

// --- 1x ------------------------------------------------------------------------------------------

void OneXCallProcessing::advance(milliseconds time) noexcept {
  if (isIdle()) _untilCall -= time;
  _left -= time;
  if (_left > milliseconds(0)) return;
  const OneXState before = _state;
  _state = next();
  _left = durationOf(_state);
  if (before != OneXState::Traffic) return;
  ++_calls;
  _untilCall = between(25, 60, hashedFraction(_seed, 2 * _calls));
}

OneXState OneXCallProcessing::next() const noexcept {
  switch (_state) {
    case OneXState::PowerUp:
    case OneXState::Initial:
      return OneXState::Acquisition;
    case OneXState::Acquisition:
      return OneXState::Sync;
    case OneXState::Paging:
      return _untilCall > milliseconds(0) ? OneXState::Sleep : OneXState::Traffic;
    case OneXState::Sync:
    case OneXState::Sleep:
      return OneXState::Paging;
    case OneXState::Traffic:
      break;
  }
  return OneXState::Initial;
}

milliseconds OneXCallProcessing::durationOf(OneXState state) const noexcept {
  switch (state) {
    case OneXState::Traffic:
      return between(6, 14, hashedFraction(_seed, 2 * _calls + 1));
    case OneXState::Sleep:
      return milliseconds(1'500);
    case OneXState::Paging:
      return milliseconds(1'000);
    default:
      return milliseconds(500);
  }
}

// --- EV-DO ---------------------------------------------------------------------------------------

void EVDOConnection::advance(milliseconds time, bool hasReceiver, Activity activity) noexcept {
  constexpr milliseconds kShortest{500};
  _inState += time;
  if (_inState < kShortest) return;
  const bool hasSession = _session == EVDOSession::Open;
  if (isConnected() && !hasSession) {
    _session = static_cast<EVDOSession>(static_cast<int>(_session) + 1);
  }
  const bool wantsConnection = _session != EVDOSession::Open || activity != Activity::Idle;
  const EVDOState state = hasReceiver ? next(wantsConnection) : EVDOState::Inactive;
  if (state == _state) return;
  _state = state;
  _inState = {};
}

EVDOState EVDOConnection::next(bool wantsConnection) const noexcept {
  switch (_state) {
    case EVDOState::Inactive:
      return EVDOState::Acquisition;
    case EVDOState::Acquisition:
      return EVDOState::Sync;
    case EVDOState::Sync:
      return EVDOState::Idle;
    case EVDOState::Idle:
      return wantsConnection ? EVDOState::Access : _state;
    case EVDOState::Access:
      return EVDOState::Connected;
    case EVDOState::Connected:
      break;
  }
  return wantsConnection ? EVDOState::Connected : EVDOState::Idle;
}

}  // namespace kestro
