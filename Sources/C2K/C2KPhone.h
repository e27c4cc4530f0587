// SPDX-License-Identifier: MIT
// A simulated CDMA2000 phone on a drive: 1x for calls and EV-DO for data, on the same masts.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "Sources/C2K/C2KPackets.h"
#include "Sources/C2K/C2KStates.h"
#include "Sources/World/CellSelection.h"
#include "Sources/World/RadioWorld.h"
#include "Sources/World/SimulatedPhone.h"

namespace kestro {

/// The pilots of one CDMA channel, as the phone receives them.
class C2KCarrier {
 public:
  struct Parameters {
    RadioLayerParameters radio;
    C2KChannel channel;
    double traffic = 0;     ///< what a sector radiates more than its pilot, dB
    double hysteresis = 0;  ///< dB
  };

  explicit C2KCarrier(Parameters parameters);

  /// Measures all pilots from where the car is, and chooses the serving one; true when it changed.
  bool measure(const Drive& drive, std::chrono::milliseconds time);

  [[nodiscard]] const C2KChannel& channel() const noexcept { return _parameters.channel; }
  [[nodiscard]] const SimulatedCell& servingCell() const;
  /// Everything received, dBm.
  [[nodiscard]] double total() const noexcept { return _total; }
  /// The serving pilot against everything received, then the others of a soft handover.
  [[nodiscard]] std::vector<C2KPilot> pilots() const;
  /// A pilot's carrier against all that is not its own, dB.
  [[nodiscard]] double carrierToInterference(const C2KPilot& pilot) const;

 private:
  [[nodiscard]] C2KPilot pilot(std::size_t index) const;

  Parameters _parameters;
  RadioLayer _radio;
  CellSelection _selection;
  SoftHandoverSet _handover;
  std::vector<CellLevel> _levels;
  double _total = 0;
};

class C2KPhone {
 public:
  explicit C2KPhone(std::uint64_t seed);

  /// Lets time pass: the car drives, pilots are measured, calls and data come and go.
  void advance(std::chrono::milliseconds time);

  [[nodiscard]] const OneXCallProcessing& oneX() const noexcept { return _oneX; }
  [[nodiscard]] const EVDOConnection& evdo() const noexcept { return _evdo; }

  /// The active set: none before a pilot is found, one while there is no traffic. The report
  /// borrows it.
  [[nodiscard]] std::vector<C2KPilot> oneXPilots() const;
  [[nodiscard]] OneXReport oneXReport(std::span<const C2KPilot> activeSet) const;
  [[nodiscard]] OneXSystem system() const;
  /// Whether a frame of the traffic channel arrives badly. Each call is another frame.
  [[nodiscard]] bool receivesBadFrame();

  [[nodiscard]] std::vector<C2KPilot> evdoPilots() const;
  [[nodiscard]] std::vector<std::optional<C2KPilot>> fingers() const;
  [[nodiscard]] EVDOReport evdoReport() const;
  /// The serving pilot's carrier to interference, dB.
  [[nodiscard]] double carrierToInterference() const;

  /// bit/s at present.
  [[nodiscard]] double forwardRate() const noexcept { return _forwardRate; }
  [[nodiscard]] double reverseRate() const noexcept { return _reverseRate; }
  /// Whether the 1x serving pilot changed in the last step.
  [[nodiscard]] bool hasNewCell() const noexcept { return _hasNewCell; }

 private:
  void transfer();
  /// The second receiver's power, when the first one has this.
  [[nodiscard]] double secondReceivePower(double first) const;

  Drive _drive;
  DataSession _session;
  SmoothNoise _load;
  std::uint64_t _frameSeed;
  std::uint64_t _frames = 0;
  C2KCarrier _oneXCarrier;
  C2KCarrier _evdoCarrier;
  OneXCallProcessing _oneX;
  EVDOConnection _evdo;
  double _forwardRate = 0;
  double _reverseRate = 0;
  bool _hasNewCell = true;
};

}  // namespace kestro
