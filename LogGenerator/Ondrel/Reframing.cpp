// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/Reframing.h"

#include <algorithm>

#include "LogGenerator/Ondrel/OndrelLogGenerator.h"
#include "LogGenerator/Ondrel/VersionReport.h"
#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {
namespace {

constexpr std::size_t kSmallestRecord = kPacketHeaderSize - kRecordLengthOffset;

/// A message among others: its record, and where the next message begins.
struct CollectedMessage {
  ByteView record;
  std::size_t size;
};

/// The message that `collected` begins with, when it frames.
std::optional<CollectedMessage> firstMessage(ByteView collected) {
  const ByteView packet = packetOfMessage(collected);
  if (packet.size() < kPacketHeaderSize) return std::nullopt;
  const ByteView records = packet.subspan(kRecordLengthOffset);
  const std::size_t length = PacketView(packet).u16(kRecordLengthOffset);
  if (length < kSmallestRecord || length > records.size()) return std::nullopt;
  return CollectedMessage{records.first(length), collected.size() - (records.size() - length)};
}

/// Takes `part` off the beginning of `bytes`; false when it is not there.
bool takeFront(ByteView& bytes, ByteView part) {
  if (bytes.size() < part.size() || !std::ranges::equal(bytes.first(part.size()), part)) {
    return false;
  }
  bytes = bytes.subspan(part.size());
  return true;
}

}  // namespace

CollectedRecords appendRecords(Bytes& dlf, ByteView collected) {
  CollectedRecords result;
  while (const auto message = firstMessage(collected)) {
    dlf.insert(dlf.end(), message->record.begin(), message->record.end());
    collected = collected.subspan(message->size);
    ++result.count;
  }
  result.unframedSize = collected.size();
  return result;
}

std::optional<ReframedDlf> reframedDlf(ByteView exported, const Array& entries) {
  if (exported.size() < kVersionReportSize) return std::nullopt;
  ByteView rest = exported.subspan(kVersionReportSize);
  ReframedDlf result;
  result.dlf.assign(exported.begin(), rest.begin());
  for (std::size_t i = 0; i < entries.size(); ++i) {
    const Value packets = entries[i].dictionary()[kStateDisplayState];
    const ByteView exportedBytes = exportedPart(packets.bytes());
    if (exportedBytes.empty()) continue;
    if (!takeFront(rest, exportedBytes)) return std::nullopt;
    const CollectedRecords records = appendRecords(result.dlf, packets.bytes());
    result.packetCount += records.count;
    if (records.unframedSize != 0) result.unframed.push_back({i + 1, records.unframedSize});
  }
  if (!rest.empty()) return std::nullopt;
  return result;
}

}  // namespace kestro
