// SPDX-License-Identifier: MIT
// Drive-test rows as packets of the LTE channel.
#pragma once

#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Sources/DriveTestSource.h"
#include "Sources/LTE/LTEPackets.h"
#include "Sources/PacketSimulation.h"

namespace kestro {

/// Writes the LTE rows of a log as the baseband would report them: RSRP, RSRQ, RSSI, cell identity,
/// tracking area and the neighbour's levels are the log's. What the log does not hold is made up:
/// channel numbers and bandwidth (one 20 MHz carrier of band 3), physical cell identities (the
/// cell's identity modulo 504, the neighbour's the next one), the number of antennas, reselection
/// parameters, SIM and contexts; and, before the first RSSI of the log, the RSSI. A packet is not
/// sent before the log has had each of its values.
class LTEDriveTestEncoder : public DriveTestEncoder {
 public:
  /// `coding` must outlive the encoder.
  explicit LTEDriveTestEncoder(const PropertyListCoding& coding) : _coding(coding) {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> messages(const DriveTestRow& row) override;
  [[nodiscard]] std::uint64_t leftOutCount() const override { return _leftOutCount; }

 private:
  void addLists(PacketList& packets, Moment time);
  static void addLevels(const DriveTestRow& row, const LTEServing& serving, PacketList& packets);

  const PropertyListCoding& _coding;
  bool _hasSentFiles = false;
  std::uint64_t _leftOutCount = 0;
};

}  // namespace kestro
