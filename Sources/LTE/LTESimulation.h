// SPDX-License-Identifier: MIT
// The simulated drive of an LTE phone, as its baseband's packets.
#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Sources/LTE/LTEPhone.h"
#include "Sources/PacketSimulation.h"

namespace kestro {

/// Every code of the technology: measurements in every step, what cells broadcast when the cell
/// changes and now and then, SIM files, packet-data contexts and cells as the telephony service
/// knows them.
class LTESimulation : public SimulatedBaseband {
 public:
  static constexpr std::uint64_t kSeed = 2012;

  /// `coding` must outlive the simulation.
  explicit LTESimulation(const PropertyListCoding& coding) : _coding(coding), _phone(kSeed) {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> step(std::chrono::milliseconds elapsed, Moment now) override;

 private:
  void addBroadcast(PacketList& packets, Moment now);
  void addMeasurements(PacketList& packets, Moment now);
  void addReselection(PacketList& packets, Moment now);
  void addLists(PacketList& packets, Moment now);

  const PropertyListCoding& _coding;
  LTEPhone _phone;
  unsigned _steps = 0;
};

}  // namespace kestro
