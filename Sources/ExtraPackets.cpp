// SPDX-License-Identifier: MIT
#include "Sources/ExtraPackets.h"

#include <fmt/format.h>

#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Packets/Encode.h"

namespace kestro {
namespace {

constexpr double kMegabyte = 1e6;

}  // namespace

std::optional<Bytes> extraPacket(const PacketKind& packet, const Value& list,
                                 const PropertyListCoding& coding, Moment time) {
  const auto payload = coding.binary(list);
  if (!payload) return std::nullopt;
  PacketWriter writer(packet);
  writer.append(*payload);
  return writer.finish(time);
}

Dictionary simulatedSimFiles(unsigned areaCode) {
  // The network is 001-01; the location files end in its digits and the area code.
  const std::string location = fmt::format("00F110{:04X}", areaCode);
  return {{"kSimFile_ICCID", "8999901000000000013"},
          {"kSimFile_MSISDN", "+9990100000001"},
          {"kSimFile_MBDN", "+9990100000099"},
          {"kSimFile_HPPLMN", "05"},
          {"kSimFile_LOCI", "1A2B3C4D" + location + "FF00"},
          {"kSimFile_PSLOCI", "5A2B3C4D00000A" + location + "0100"},
          {"kSimFile_ACC", "0008"},
          {"kSimFile_AD", "00000002"},
          {"kSimFile_FPLMN", "FFFFFFFFFFFFFFFFFFFFFFFF"},
          {"kSimFile_AHPLMN", "00F110"},
          {"kSimFile_RATMODE", "Automatic"},
          {"kSimFile_PNN", "Kestro Test Network"},
          {"kSimFile_OPL", "00F1100000FFFE01"},
          {"kSimFile_OPLMNAcT", "00F1104080"}};
}

Dictionary simulatedContext(const SimulatedContext& context) {
  return {{"APN", context.accessPoint},
          {"State", context.isActive ? "Active" : "Inactive"},
          {"Bearer", context.bearer},
          {"IP Address", context.isActive ? "192.0.2.17" : "-"},
          {"Downlink", fmt::format("{:.1f} MB", context.downlinkBytes / kMegabyte)},
          {"Uplink", fmt::format("{:.1f} MB", context.uplinkBytes / kMegabyte)}};
}

Dictionary cellOfKind(std::string_view technology, std::string_view type) {
  return {{kTqCellMonitorCellRadioAccessTechnology, technology}, {kTqCellMonitorCellType, type}};
}

}  // namespace kestro
