// SPDX-License-Identifier: MIT
#include "Sources/GsmUmts/GsmUmtsDriveTest.h"

#include <optional>

#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Platform/TelephonyService.h"
#include "Sources/DriveTestValues.h"
#include "Sources/ExtraPackets.h"
#include "Sources/GsmUmts/GsmUmtsPackets.h"

namespace kestro {
namespace {

constexpr unsigned kScramblingCodes = 512;
constexpr unsigned kArfcns = 124;
constexpr unsigned kColourCodes = 64;
constexpr int kGSMAccessLevel = -104;

}  // namespace

std::string_view GsmUmtsDriveTestEncoder::technology() const {
  return kTqLogChannelTechnology_Ondrel_GSM;
}

std::vector<Bytes> GsmUmtsDriveTestEncoder::messages(const DriveTestRow& row) {
  PacketList packets;
  if (row.family == DriveTestFamily::LTE) return packets.take();
  addStates(row, packets);
  if (row.family == DriveTestFamily::UMTS) {
    addUMTSCell(row, packets);
  } else {
    addGSMCell(row, packets);
  }
  _leftOutCount += packets.leftOutCount();
  return packets.take();
}

void GsmUmtsDriveTestEncoder::addStates(const DriveTestRow& row, PacketList& packets) {
  const Moment time = row.time;
  if (!_hasSentFiles) {
    _hasSentFiles = true;
    packets.add(extraPacket(kSimFilesPacket, simulatedSimFiles(1), _coding, time));
    packets.add(extraPacket(
        kPacketDataContextsPacket,
        Array{simulatedContext(
            {.accessPoint = "internet", .bearer = "PS, interactive", .isActive = true})},
        _coding, time));
  }
  packets.add(mmState("MM_IDLE", "MM_NORMAL_SERVICE", "UPDATED", time));
  packets.add(gmmState("GMM_REGISTERED", "GMM_NORMAL_SERVICE", "GMM_GU1_UPDATED", time));
  packets.add(registrationState("REG_STATE_IDLE", "Automatic", time));
  const bool isGSM = row.family == DriveTestFamily::GSM;
  packets.add(gsmRadioResource(isGSM ? "RR_IDLE" : "RR_INACTIVE", 0, time));
  if (const auto area = integerIn(row, DriveTestColumn::Area, 16)) {
    packets.add(servingNetwork({.locationArea = *area}, "CS_PS_SERVICE", time));
  }
}

void GsmUmtsDriveTestEncoder::addUMTSCell(const DriveTestRow& row, PacketList& packets) {
  const auto rscp = numberIn(row, DriveTestColumn::Level);
  const auto energyPerChip = numberIn(row, DriveTestColumn::Quality);
  const auto identity = integerIn(row, DriveTestColumn::RawCellId, 10);
  if (!rscp || !energyPerChip || !identity) return;
  const UMTSCellReport cell{.scramblingCode = *identity % kScramblingCodes,
                            .rscp = *rscp,
                            .energyPerChip = *energyPerChip};
  packets.add(umtsSets({&cell, 1}, *rscp - *energyPerChip, row.time));
}

void GsmUmtsDriveTestEncoder::addGSMCell(const DriveTestRow& row, PacketList& packets) {
  packets.add(umtsSets({}, 0, row.time));  // no UMTS cell serves any more
  const auto level = numberIn(row, DriveTestColumn::Level);
  const auto identity = integerIn(row, DriveTestColumn::Cell, 16);
  if (!level || !identity) return;
  const GSMCellReport cell{.arfcn = 1 + *identity % kArfcns,
                           .bsic = *identity % kColourCodes,
                           .level = *level,
                           .c1 = static_cast<int>(*level) - kGSMAccessLevel};
  packets.add(gsmServingCell(cell, *identity, row.time));
  packets.add(gsmMeasurements(cell, {}, row.time));
}

}  // namespace kestro
