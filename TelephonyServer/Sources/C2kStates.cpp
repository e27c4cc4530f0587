// SPDX-License-Identifier: MIT
#include "TelephonyServer/Sources/C2kStates.h"

#include <array>
#include <cmath>

#include "TelephonyServer/Sources/Noise.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

/// So many milliseconds, evenly spread between two limits in seconds.
milliseconds between(double shortest, double longest, double fraction) noexcept {
  return milliseconds(std::llround((shortest + (longest - shortest) * fraction) * 1000));
}

}  // namespace

// --- 1x ------------------------------------------------------------------------------------------

std::string_view oneXStateName(OneXState state) noexcept {
  switch (state) {
    case OneXState::PowerUp:
      return "Powerup state [11]";
    case OneXState::Initial:
      return "Initial state for CDMA operation [2]";
    case OneXState::Acquisition:
      return "Acquisition [3]";
    case OneXState::Sync:
      return "Sync [4]";
    case OneXState::Paging:
      return "Paging [6]";
    case OneXState::Sleep:
      return "Slotted mode sleep state [7]";
    case OneXState::Traffic:
      break;
  }
  return "Traffic [8]";
}

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

std::string_view evdoStateName(EvdoState state) noexcept {
  constexpr std::array<std::string_view, 6> kNames = {
      "Inactive [0]", "Acquisition [1]", "Sync [2]", "Idle [3]", "Access [4]", "Connected [5]"};
  return kNames[static_cast<std::size_t>(state)];
}

std::string_view evdoSessionName(EvdoSession session) noexcept {
  constexpr std::array<std::string_view, 5> kNames = {
      "Closed [0]", "AMP setup [1]", "AT-initiated neg [2]", "Initiated neg [3]", "Open [4]"};
  return kNames[static_cast<std::size_t>(session)];
}

void EvdoConnection::advance(milliseconds time, bool hasReceiver, Activity activity) noexcept {
  constexpr milliseconds kShortest{500};
  _inState += time;
  if (_inState < kShortest) return;
  const bool hasSession = _session == EvdoSession::Open;
  if (isConnected() && !hasSession) {
    _session = static_cast<EvdoSession>(static_cast<int>(_session) + 1);
  }
  const bool wantsConnection = _session != EvdoSession::Open || activity != Activity::Idle;
  const EvdoState state = hasReceiver ? next(wantsConnection) : EvdoState::Inactive;
  if (state == _state) return;
  _state = state;
  _inState = {};
}

EvdoState EvdoConnection::next(bool wantsConnection) const noexcept {
  switch (_state) {
    case EvdoState::Inactive:
      return EvdoState::Acquisition;
    case EvdoState::Acquisition:
      return EvdoState::Sync;
    case EvdoState::Sync:
      return EvdoState::Idle;
    case EvdoState::Idle:
      return wantsConnection ? EvdoState::Access : _state;
    case EvdoState::Access:
      return EvdoState::Connected;
    case EvdoState::Connected:
      break;
  }
  return wantsConnection ? EvdoState::Connected : EvdoState::Idle;
}

}  // namespace kestro
