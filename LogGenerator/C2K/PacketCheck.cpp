// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/PacketCheck.h"

#include "LogGenerator/C2K/SubPackets.h"
#include "LogGenerator/Packets/Walk.h"

namespace kestro {
namespace {

constexpr RefusalFormat kBadSubPacketSize = "Log code error in subpkt#{0}: bad size ({1}).";

/// The length of a packet that ends with the last of the records that this one says it has.
std::size_t endOfRecords(const RecordTable& table, PacketView packet) {
  return firstRecord(table, packet).here + table.stride * recordCount(table, packet);
}

bool findSubPackets(std::span<const std::uint8_t> ids, TakenPacket& packet) {
  for (std::size_t i = 0; i < ids.size(); ++i) {
    const SubPacketSearch search = searchSubPacket(packet.bytes, ids[i]);
    if (!search.start) return false;
    packet.subPackets[i] = *search.start;
  }
  return true;
}

/// A line for each sub-packet whose search ends at a bad size, then the requirement's own.
std::vector<RefusalLine> linesOfSubPackets(const Requirement& requirement, PacketView packet) {
  std::vector<RefusalLine> lines;
  RefusalNumbers found{};
  for (std::size_t i = 0; i < requirement.subPackets.size(); ++i) {
    const SubPacketSearch search = searchSubPacket(packet, requirement.subPackets[i]);
    found[i] = search.start ? 1 : 0;
    if (!search.endedAtBadSize) continue;
    lines.push_back({LogPriority::Error, kBadSubPacketSize, {search.badIndex, search.badSize}});
  }
  lines.push_back({requirement.priority, requirement.line, found});
  return lines;
}

std::vector<RefusalLine> linesOf(const Requirement& requirement, const PacketReading& reading,
                                 PacketView packet) {
  const auto line = [&](const RefusalNumbers& numbers) {
    return std::vector{RefusalLine{requirement.priority, requirement.line, numbers}};
  };
  switch (requirement.kind) {
    case Requirement::Kind::Number:
      return line({readBits(requirement.condition.place, packet, {})});
    case Requirement::Kind::SubPackets:
      return linesOfSubPackets(requirement, packet);
    default:
      break;
  }
  const std::size_t records =
      reading.lists.empty() ? 0 : recordCount(reading.lists[0].table, packet);
  return line({packet.size(), reading.packet.minimumLength, reading.packet.code, records});
}

}  // namespace

std::string RefusalLine::text() const {
  return fmt::format(format, numbers[0], numbers[1], numbers[2], numbers[3]);
}

bool meets(const Requirement& requirement, const PacketReading& reading, TakenPacket& packet) {
  const PacketView bytes = packet.bytes;
  switch (requirement.kind) {
    case Requirement::Kind::MinimumLength:
      return bytes.size() >= reading.packet.minimumLength;
    case Requirement::Kind::ExactLength:
      return bytes.size() == reading.packet.minimumLength;
    case Requirement::Kind::HoldsRecords:
      return bytes.size() >= endOfRecords(reading.lists[0].table, bytes);
    case Requirement::Kind::EndsWithRecords:
      return bytes.size() == endOfRecords(reading.lists[0].table, bytes);
    case Requirement::Kind::Number:
      return holds(requirement.condition, bytes, {});
    case Requirement::Kind::SubPackets:
      return findSubPackets(requirement.subPackets, packet);
  }
  return false;
}

std::vector<RefusalLine> refusalOf(const PacketRules& rules, PacketView packet) {
  TakenPacket taken{.bytes = packet};
  for (const Requirement& requirement : rules.requirements) {
    if (!meets(requirement, rules.reading, taken))
      return linesOf(requirement, rules.reading, packet);
  }
  return {};
}

void logRefusal(const PacketRules& rules, PacketView packet, SystemLog& log) {
  for (const auto& [priority, format, numbers] : refusalOf(rules, packet)) {
    log.log(priority, format, numbers[0], numbers[1], numbers[2], numbers[3]);
  }
}

}  // namespace kestro
