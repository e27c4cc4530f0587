// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/PropertyListReading.h"

#include <algorithm>

#include "LogGenerator/Packets/Section.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {

Result<Value> parsePayload(ByteView packet, const PropertyListCoding& coding) {
  return coding.parse(packet.subspan(std::min(packet.size(), kPacketHeaderSize)));
}

}  // namespace kestro
