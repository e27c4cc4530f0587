// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/PacketNames.h"

#include <fmt/format.h>

#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {

PacketNames::PacketNames(const LogGenerator& generator) {
  for (const ListedCode& code : listCodes(generator)) {
    _codes[code.code] = {code.name, code.minimumLength};
  }
}

std::string_view PacketNames::nameOf(LogCode code) const {
  const auto known = _codes.find(code);
  return known == _codes.end() ? std::string_view() : known->second.name;
}

std::string PacketNames::reasonForNothing(ByteView message) const {
  if (message.size() < kPacketHeaderSize) {
    return fmt::format("too short for a packet, which has at least {} bytes", kPacketHeaderSize);
  }
  const PacketView packet(packetOfMessage(message));
  if (!isKnownLogType(logTypeOf(packet))) {
    return fmt::format("dropped: 0x{:02x} is no log type", logTypeOf(packet));
  }
  const auto known = _codes.find(logCodeOf(packet));
  if (known == _codes.end()) return "no section takes this log code";
  if (known->second.name.empty()) return "what this packet contains is not known";
  if (packet.size() < known->second.minimumLength) {
    return fmt::format("too short: sections read this packet from {} bytes on",
                       known->second.minimumLength);
  }
  return "no section reads a value from it";
}

}  // namespace kestro
