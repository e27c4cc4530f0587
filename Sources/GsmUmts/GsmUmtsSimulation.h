// SPDX-License-Identifier: MIT
// The simulated drive of a GSM and UMTS phone, as its baseband's packets.
#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Sources/GsmUmts/GsmUmtsPackets.h"
#include "Sources/PacketSimulation.h"
#include "Sources/World/MobilityManager.h"
#include "Sources/World/SimulatedPhone.h"

namespace kestro {

/// Every code of the technology: cell sets and rankings in idle and connected mode, GSM cells with
/// their colour codes, the state machines of mobility management and radio resources, block errors
/// and HSDPA statistics, networks, SIM files, contexts and the cell-monitor list; codes that nobody
/// has described as empty packets.
class GsmUmtsSimulation : public SimulatedBaseband {
 public:
  static constexpr std::uint64_t kSeed = 2012;

  /// `coding` must outlive the simulation.
  explicit GsmUmtsSimulation(const PropertyListCoding& coding) : _coding(coding), _phone(kSeed) {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> step(std::chrono::milliseconds elapsed, Moment now) override;

 private:
  void addCellLists(PacketList& packets, Moment now);
  void addUMTS(PacketList& packets, Moment now);
  void addLinkQuality(PacketList& packets, Moment now);
  void addGSM(PacketList& packets, Moment now);
  void addGSMChannel(PacketList& packets, Moment now);
  void addMobility(PacketList& packets, Moment now);
  void addRare(PacketList& packets, Moment now);
  [[nodiscard]] std::string_view radioResourceState() const;

  const PropertyListCoding& _coding;
  SimulatedPhone _phone;
  MobilityManager _mobility;
  RadioAccess _lastAccess = RadioAccess::UMTS;
  std::uint32_t _blocks = 0;
  std::uint32_t _blockErrors = 0;
  unsigned _steps = 0;
};

}  // namespace kestro
