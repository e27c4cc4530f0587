// SPDX-License-Identifier: MIT
// The packets of the GSM/UMTS channel, in three files: cells, states, links.
#pragma once

#include <map>

#include "Fuzz/PlainReader/PlainReader.h"

namespace kestro::plain {

class GsmReader : public SectionReader {
 public:
  explicit GsmReader(const PropertyListCoding& coding);

  [[nodiscard]] std::span<const std::uint32_t> codes() const override;

 protected:
  void read(const Packet& packet, std::uint32_t code) override;

 private:
  // GsmCells.cpp
  void readCellSets(const Packet& packet);
  void readRanking(const Packet& packet);
  void readServingIdentity(const Packet& packet);
  void readMeasurements(const Packet& packet);
  void readIdentities(const Packet& packet);
  void readMobileAllocation(const Packet& packet);
  void readUmtsNeighbors(const std::vector<Dictionary>& cells);
  void readGsmNeighbors(const std::vector<Dictionary>& cells);
  void readServingCells(const std::vector<Dictionary>& cells);

  // GsmStates.cpp
  void readMobilityManagement(const Packet& packet);
  void readRegistration(const Packet& packet);
  void readPacketMobilityManagement(const Packet& packet);
  void readServingNetwork(const Packet& packet);
  void readEquivalentNetworks(const Packet& packet);
  void readRadioResource(const Packet& packet);

  // GsmLinks.cpp
  void readBlockErrors(const Packet& packet);
  void readHsdpa(const Packet& packet);
  void readLevels(const Packet& packet);

  std::map<int, int> _identities;  ///< of cells, by channel
};

}  // namespace kestro::plain
