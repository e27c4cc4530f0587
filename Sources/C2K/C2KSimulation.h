// SPDX-License-Identifier: MIT
// The simulated drive of a CDMA2000 phone, as its baseband's packets.
#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Sources/C2K/C2KPhone.h"
#include "Sources/C2K/SentCounters.h"
#include "Sources/PacketSimulation.h"

namespace kestro {

/// Every code of the technology: 1x and EV-DO states and pilots in every step, the frames of calls,
/// throughput counters every second, and the 1x system when the cell changes and now and then.
class C2KSimulation : public SimulatedBaseband {
 public:
  static constexpr std::uint64_t kSeed = 2012;

  C2KSimulation() : _phone(kSeed) {}
  /// The technology has no lists that would need coding.
  explicit C2KSimulation(const PropertyListCoding& /*coding*/) : C2KSimulation() {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> step(std::chrono::milliseconds elapsed, Moment now) override;

  /// The phone after the last step.
  [[nodiscard]] const C2KPhone& phone() const noexcept { return _phone; }

 private:
  void addOneX(PacketList& packets, Moment now);
  void addEVDO(PacketList& packets, Moment now);
  void count(std::chrono::milliseconds elapsed);

  C2KPhone _phone;
  SentCounters _forward{kForwardThroughput};
  SentCounters _reverse{kReverseThroughput};
  unsigned _steps = 0;
};

}  // namespace kestro
