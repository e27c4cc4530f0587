// SPDX-License-Identifier: MIT
// The rate at which a modem measures its signal, and the only thing that is ever changed of a
// modem.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "Platform/ModemService.h"
#include "Sources/Modem/BusFaults.h"

namespace kestro {

/// Holds one modem's rate at one second: reads `Rate`, calls `Setup(1)` if that is 0 or more than
/// 1, and gives the former rate back at the end if it is still 1 then. One call at a time.
class SignalRate {
 public:
  using Call =
      std::function<void(const BusCall& call, std::function<void(const BusReply& reply)> answered)>;

  /// `call` runs calls, for as long as this lives; `path` is the modem's. The faults must outlive
  /// it.
  SignalRate(std::string path, Call call, BusFaults& faults);

  /// Reads the rate and raises it if need be; again after every return to enabled.
  void hold();
  /// Gives the rate back; `done` runs once that is over, whatever came of it.
  void release(std::function<void()> done);

  /// Why the rate could not be set; empty when nothing is wrong.
  [[nodiscard]] const std::optional<BusError>& error() const noexcept { return _error; }

 private:
  void read(std::function<void(std::optional<std::uint64_t>)> then);
  void setUp(std::uint32_t rate, std::function<void(bool isDone)> then);
  void raise(std::optional<std::uint64_t> rate);
  void giveBack(std::optional<std::uint64_t> rate);
  void next();

  enum class Wish : std::uint8_t { None, Hold, Release };

  std::string _path;
  Call _call;
  BusFaults& _faults;
  std::optional<std::uint32_t> _former;  ///< while the rate is ours
  std::optional<BusError> _error;
  Wish _wish = Wish::None;
  bool _isBusy = false;
  std::function<void()> _done;
};

}  // namespace kestro
