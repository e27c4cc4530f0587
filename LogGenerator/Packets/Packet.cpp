// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Packet.h"

#include <algorithm>

#include "LogGenerator/Packets/Section.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {

const Result<Value>& Packet::propertyList(const PropertyListCoding& coding) const {
  if (!_propertyList) {
    _propertyList = coding.parse(_bytes.subspan(std::min(_bytes.size(), kPacketHeaderSize)));
  }
  return *_propertyList;
}

}  // namespace kestro
