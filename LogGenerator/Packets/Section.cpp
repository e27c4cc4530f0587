// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Section.h"

#include <algorithm>

namespace kestro {

std::vector<LogCode> codesOf(const Section& section) {
  std::vector<LogCode> codes;
  const auto add = [&codes](const PacketKind& packet) {
    if (std::ranges::find(codes, packet.code) == codes.end()) codes.push_back(packet.code);
  };
  for (const PacketReading& reading : section.readings) add(reading.packet);
  if (section.propertyList != nullptr) add(section.propertyList->packet);
  return codes;
}

}  // namespace kestro
