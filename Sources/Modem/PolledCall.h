// SPDX-License-Identifier: MIT
// A call that is made again and again.
#pragma once

#include <chrono>
#include <optional>
#include <utility>

#include "Platform/ModemService.h"

namespace kestro {

/// Says every second whether the call is due: once per interval, never before the last one is
/// answered, more rarely while it is refused, and no more once the modem cannot do it.
class PolledCall {
 public:
  /// After a refusal.
  static constexpr std::chrono::seconds kPause{10};

  explicit PolledCall(std::chrono::seconds interval) : _interval(interval) {}

  /// A second has passed: whether to call now.
  [[nodiscard]] bool isDue() {
    if (_wait > std::chrono::seconds(0)) --_wait;
    if (_isPending || _isUnsupported || _wait > std::chrono::seconds(0)) return false;
    _isPending = true;
    _wait = _interval;
    return true;
  }

  void answered(const BusReply& reply);

  /// The modem's state is another one: all is tried anew.
  void reset() { *this = PolledCall(_interval); }

  [[nodiscard]] const std::optional<BusError>& error() const noexcept { return _error; }
  [[nodiscard]] bool isUnsupported() const noexcept { return _isUnsupported; }

 private:
  std::chrono::seconds _interval;
  std::chrono::seconds _wait{0};
  std::optional<BusError> _error;
  bool _isPending = false;
  bool _isUnsupported = false;
};

/// Whether the error says that the modem, or this ModemManager, cannot do it at all.
[[nodiscard]] bool isUnsupportedError(const BusError& error);
/// Whether the error says that this user may not.
[[nodiscard]] bool isPermissionError(const BusError& error);

}  // namespace kestro
