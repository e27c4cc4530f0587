// SPDX-License-Identifier: MIT
#include "TelephonyServer/CodeFilter.h"

#include <algorithm>
#include <utility>

#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {

CodeFilter::CodeFilter(std::vector<LogCode> codes)
    : _acceptsEverything(false), _codes(std::move(codes)) {
  std::ranges::sort(_codes);
  _codes.erase(std::unique(_codes.begin(), _codes.end()), _codes.end());
}

bool CodeFilter::accepts(ByteView message) const noexcept {
  if (_acceptsEverything) return true;
  const ByteView packet = packetOfMessage(message);
  if (packet.size() < kLogCodeOffset + sizeof(std::uint16_t)) return false;
  return std::ranges::binary_search(_codes, logCodeOf(PacketView(packet)));
}

}  // namespace kestro
