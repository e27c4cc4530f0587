// SPDX-License-Identifier: MIT
// The simulated drive of a CDMA2000 phone, as its baseband's packets.
#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "Platform/PropertyListCoding.h"
#include "TelephonyServer/Sources/C2kPhone.h"
#include "TelephonyServer/Sources/PacketSimulation.h"
#include "TelephonyServer/Sources/SentCounters.h"

namespace kestro {

/// Every code of the technology: 1x and EV-DO states and pilots in every step, the frames of calls,
/// throughput counters every second, and the 1x system when the cell changes and now and then.
class C2kSimulation : public SimulatedBaseband {
 public:
  static constexpr std::uint64_t kSeed = 2012;

  C2kSimulation() : _phone(kSeed) {}
  /// The technology has no lists that would need coding.
  explicit C2kSimulation(const PropertyListCoding& /*coding*/) : C2kSimulation() {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> step(std::chrono::milliseconds elapsed, Moment now) override;

  /// The phone after the last step.
  [[nodiscard]] const C2kPhone& phone() const noexcept { return _phone; }

 private:
  void addOneX(PacketList& packets, Moment now);
  void addEvdo(PacketList& packets, Moment now);
  void count(std::chrono::milliseconds elapsed);

  C2kPhone _phone;
  SentCounters _forward{kForwardThroughput};
  SentCounters _reverse{kReverseThroughput};
  unsigned _steps = 0;
};

}  // namespace kestro
