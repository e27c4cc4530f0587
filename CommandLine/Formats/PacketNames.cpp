// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/PacketNames.h"

#include <fmt/format.h>

#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {

std::string remarkTooShortForAPacket() {
  return fmt::format("too short for a packet, which has at least {} bytes", kPacketHeaderSize);
}

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
    return remarkTooShortForAPacket();
  }
  const PacketView packet(packetOfMessage(message));
  if (!isKnownLogType(logTypeOf(packet))) {
    return fmt::format(kRemarkUnknownType, logTypeOf(packet));
  }
  const auto known = _codes.find(logCodeOf(packet));
  if (known == _codes.end()) return kRemarkUnknownCode;
  if (known->second.name.empty()) return kRemarkUnknownContents;
  if (packet.size() < known->second.minimumLength) {
    return fmt::format(kRemarkTooShort, known->second.minimumLength);
  }
  return kRemarkNoValue;
}

}  // namespace kestro
