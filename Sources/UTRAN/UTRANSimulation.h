// SPDX-License-Identifier: MIT
// The simulated drive of a UTRAN phone, as its baseband's packets.
#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Sources/PacketSimulation.h"
#include "Sources/UTRAN/UTRANPhone.h"

namespace kestro {

/// Every code of the technology: the connection's mode, cells and channels in every step, what
/// cells broadcast when the cell changes and now and then, GSM cells, SIM files, packet-data
/// contexts and cells as the telephony service knows them.
class UTRANSimulation : public SimulatedBaseband {
 public:
  static constexpr std::uint64_t kSeed = 2012;

  /// `coding` must outlive the simulation.
  explicit UTRANSimulation(const PropertyListCoding& coding) : _coding(coding), _phone(kSeed) {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> step(std::chrono::milliseconds elapsed, Moment now) override;

  /// The phone after the last step.
  [[nodiscard]] const UTRANPhone& phone() const noexcept { return _phone; }

 private:
  void addServingCell(PacketList& packets, Moment now);
  void addLists(PacketList& packets, Moment now);

  const PropertyListCoding& _coding;
  UTRANPhone _phone;
  unsigned _steps = 0;
};

}  // namespace kestro
