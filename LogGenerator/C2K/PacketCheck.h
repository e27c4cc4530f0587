// SPDX-License-Identifier: MIT
// Whether a CDMA2000 packet is taken, and if not, why.
#pragma once

#include <array>
#include <cstddef>
#include <span>
#include <string>
#include <tuple>
#include <vector>

#include "LogGenerator/Packets/PacketView.h"
#include "LogGenerator/Packets/Requirement.h"
#include "LogGenerator/Packets/Section.h"
#include "Platform/SystemLog.h"

namespace kestro {

/// What the packets of one code must have: `reading` describes them, and the requirements are
/// looked at in their order. Both are constants.
struct PacketRules {
  const PacketReading& reading;
  std::span<const Requirement> requirements = {&kMinimumLength, 1};
};

/// A packet that is taken.
struct TakenPacket {
  PacketView bytes;
  /// Where the required sub-packets begin, in the requirement's order.
  std::array<std::size_t, std::tuple_size_v<RefusalNumbers>> subPackets{};
};

/// A line that the log gets for a packet that is refused.
struct RefusalLine {
  LogPriority priority;
  RefusalFormat format;
  RefusalNumbers numbers;

  [[nodiscard]] std::string text() const;
};

/// Whether a packet, header included, meets a requirement; notes where its sub-packets begin.
[[nodiscard]] bool meets(const Requirement& requirement, const PacketReading& reading,
                         TakenPacket& packet);

/// Whether the packet meets all requirements; notes where its sub-packets begin.
[[nodiscard]] inline bool isTaken(const PacketRules& rules, TakenPacket& packet) {
  for (const Requirement& requirement : rules.requirements) {
    // Almost all packets have this one, and few have more.
    const bool isMet = requirement.kind == Requirement::Kind::MinimumLength
                           ? packet.bytes.size() >= rules.reading.packet.minimumLength
                           : meets(requirement, rules.reading, packet);
    if (!isMet) return false;
  }
  return true;
}

/// Why the packet is refused: what is said of the first thing that it lacks. Empty for a packet
/// that is taken.
[[nodiscard]] std::vector<RefusalLine> refusalOf(const PacketRules& rules, PacketView packet);

/// Writes what `refusalOf` says to the log.
void logRefusal(const PacketRules& rules, PacketView packet, SystemLog& log);

}  // namespace kestro
