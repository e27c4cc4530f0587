// SPDX-License-Identifier: MIT
// The packets of the GSM/UMTS channel, in three files: cells, states, links.
#pragma once

#include <map>

#include "Fuzz/PlainReader/PlainReader.h"

namespace kestro::plain {

class GsmUmtsReader : public SectionReader {
 public:
  explicit GsmUmtsReader(const PropertyListCoding& coding);

  [[nodiscard]] std::span<const std::uint32_t> codes() const override;

 protected:
  void read(const Packet& packet, std::uint32_t code) override;

 private:
  // GsmUmtsCells.cpp
  void readCellSets(const Packet& packet);
  void readRanking(const Packet& packet);
  void readServingIdentity(const Packet& packet);
  void readMeasurements(const Packet& packet);
  void readIdentities(const Packet& packet);
  void readMobileAllocation(const Packet& packet);
  void readUMTSNeighbors(const std::vector<Dictionary>& cells);
  void readGSMNeighbors(const std::vector<Dictionary>& cells);
  void readServingCells(const std::vector<Dictionary>& cells);

  // GsmUmtsStates.cpp
  void readMobilityManagement(const Packet& packet);
  void readRegistration(const Packet& packet);
  void readPacketMobilityManagement(const Packet& packet);
  void readServingNetwork(const Packet& packet);
  void readEquivalentNetworks(const Packet& packet);
  void readRadioResource(const Packet& packet);

  // GsmUmtsLinks.cpp
  void readBlockErrors(const Packet& packet);
  void readHsdpa(const Packet& packet);
  void readLevels(const Packet& packet);

  std::map<int, int> _identities;  ///< of cells, by channel
};

}  // namespace kestro::plain
