// SPDX-License-Identifier: MIT
// The mobility management of a simulated phone: it registers, updates its areas and makes calls.
#pragma once

#include <chrono>
#include <cstdint>
#include <string_view>

namespace kestro {

/// What the phone does with the network, apart from data.
enum class MobilityProcedure : std::uint8_t {
  Registering,  ///< switched on, looking for a network
  Attaching,    ///< location update and attach
  None,         ///< registered, at rest
  AreaUpdate,   ///< a new location area: location and routing area update
  CallSetup,
  Call,
};

/// Moves through the procedures as a phone does on a drive. The same sequence in every run.
class MobilityManager {
 public:
  /// Lets time pass in a location area.
  void advance(std::chrono::milliseconds time, unsigned locationArea);

  [[nodiscard]] MobilityProcedure procedure() const noexcept { return _procedure; }
  [[nodiscard]] bool isInCall() const noexcept { return _procedure == MobilityProcedure::Call; }

  // The states as the display names them.
  [[nodiscard]] std::string_view mmState() const noexcept;
  [[nodiscard]] std::string_view mmSubState() const noexcept;
  [[nodiscard]] std::string_view updateStatus() const noexcept;
  [[nodiscard]] std::string_view gmmState() const noexcept;
  [[nodiscard]] std::string_view gmmSubState() const noexcept;
  [[nodiscard]] std::string_view gmmUpdateStatus() const noexcept;
  [[nodiscard]] std::string_view registrationState() const noexcept;
  [[nodiscard]] std::string_view serviceType() const noexcept;

 private:
  void begin(MobilityProcedure procedure) noexcept;
  [[nodiscard]] bool isRegistered() const noexcept;

  MobilityProcedure _procedure = MobilityProcedure::Registering;
  std::chrono::milliseconds _inProcedure{0};
  std::chrono::milliseconds _sinceCall{0};
  unsigned _locationArea = 0;
};

}  // namespace kestro
