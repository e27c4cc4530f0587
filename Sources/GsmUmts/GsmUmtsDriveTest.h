// SPDX-License-Identifier: MIT
// Drive-test rows as packets of the GSM/UMTS channel.
#pragma once

#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Sources/DriveTestSource.h"
#include "Sources/PacketSimulation.h"

namespace kestro {

/// Writes the UMTS and GSM rows of a log as the baseband would report them. UMTS: RSCP and Ec/N0
/// are the log's, in the active set, to whole dB. GSM: the level L is shown as clamp(L + 110, 0,
/// 63), the cell identity is the log's. Both: the area. What the log does not hold is made up:
/// network code (999-990), scrambling code (the whole identity modulo 512), ARFCN and BSIC of the
/// GSM cell, states, SIM and contexts. The UMTS cell's identity has no place in the display. A
/// packet is not sent before the log has had each of its values.
class GsmUmtsDriveTestEncoder : public DriveTestEncoder {
 public:
  /// `coding` must outlive the encoder.
  explicit GsmUmtsDriveTestEncoder(const PropertyListCoding& coding) : _coding(coding) {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> messages(const DriveTestRow& row) override;
  [[nodiscard]] std::uint64_t leftOutCount() const override { return _leftOutCount; }

 private:
  void addStates(const DriveTestRow& row, PacketList& packets);
  void addUMTSCell(const DriveTestRow& row, PacketList& packets);
  void addGSMCell(const DriveTestRow& row, PacketList& packets);

  const PropertyListCoding& _coding;
  bool _hasSentFiles = false;
  std::uint64_t _leftOutCount = 0;
};

}  // namespace kestro
