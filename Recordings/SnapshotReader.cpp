// SPDX-License-Identifier: MIT
#include "Recordings/SnapshotReader.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Platform/TelephonyService.h"
#include "Recordings/DlfFormat.h"
#include "Recordings/PacketTechnology.h"
#include "Recordings/SnapshotFile.h"

namespace kestro {
namespace {

/// The packet that an entry's packets begin with, and how many bytes it and its prefix are; empty
/// when its length cannot be right.
struct CollectedPacket {
  ByteView packet;
  std::size_t size = 0;
};

CollectedPacket firstPacket(ByteView collected) noexcept {
  const bool hasPrefix = collected.size() >= kDlfPrefixSize && collected[0] == kDlfPrefixMark;
  const std::size_t start = hasPrefix ? kDlfPrefixSize : 0;
  if (collected.size() < start + 1 + kShortestDlfRecord) return {};
  const auto length = loadLittleEndian<std::uint16_t>(collected, start + 1);
  if (length < kShortestDlfRecord || length > collected.size() - start - 1) return {};
  return {.packet = collected.subspan(start, length + std::size_t{1}), .size = start + 1 + length};
}

Result<Dictionary> snapshotIn(RecordedFile& file, const PropertyListCoding& coding) {
  const auto bytes = file.ahead(PropertyListLimits::snapshotFile().bytes + 1);
  if (!bytes) return tl::unexpected(bytes.error());
  auto snapshot = parseSnapshot(coding, *bytes);
  if (!snapshot) return failure(fmt::format("{}: {}", file.path(), snapshot.error().message));
  return snapshot;
}

}  // namespace

Result<std::unique_ptr<SnapshotReader>> SnapshotReader::open(RecordedFile file,
                                                             const RecordingContext& context) {
  const auto snapshot = snapshotIn(file, context.coding);
  if (!snapshot) return tl::unexpected(snapshot.error());
  std::unique_ptr<SnapshotReader> reader(new SnapshotReader(file.path(), context.coding));
  reader->takeEntries(*snapshot);
  if (auto decided = reader->decideTechnology(context); !decided) {
    return tl::unexpected(decided.error());
  }
  return reader;
}

void SnapshotReader::takeEntries(const Dictionary& snapshot) {
  Moment date = momentOfDate(snapshot[kSnapshotTimestamp].text()).value_or(Moment());
  const Array entries = snapshot[kSnapshotData].array();
  for (std::size_t i = 0; i < entries.size(); ++i) {
    const Dictionary entry = entries[i].dictionary();
    Value state = entry[kSnapshotEntryState];
    if (state.isNull()) continue;
    date = momentOfDate(entry[kSnapshotEntryDate].text()).value_or(date);
    _entries.push_back({.number = i + 1, .date = date, .state = std::move(state)});
  }
}

Result<void> SnapshotReader::decideTechnology(const RecordingContext& context) {
  PacketTechnology codes(context);
  bool hasPackets = false;
  bool hasLists = false;
  for (const Entry& entry : _entries) {
    hasLists |= !entry.state.isData();
    ByteView collected = entry.state.bytes();
    for (auto first = firstPacket(collected); first.size != 0; first = firstPacket(collected)) {
      codes.add(first.packet);
      collected = collected.subspan(first.size);
      hasPackets = true;
    }
  }
  if (hasLists) _technologies.push_back(kTqLogChannelTechnology_IFX);
  if (!hasPackets) return {};
  const auto decided = codes.decided(_path);
  if (!decided) return tl::unexpected(decided.error());
  _packetTechnology = *decided;
  if (std::ranges::find(_technologies, *decided) == _technologies.end()) {
    _technologies.push_back(*decided);
  }
  return {};
}

Result<std::optional<RecordedMessage>> SnapshotReader::next() {
  for (; _entry < _entries.size(); ++_entry, _offset = 0) {
    if (auto message = nextOf(_entries[_entry])) return counted(*message);
  }
  if (!_unframed.empty()) return failure(_unframed);
  return std::nullopt;
}

std::optional<RecordedMessage> SnapshotReader::nextOf(const Entry& entry) {
  if (!entry.state.isData()) {
    if (_offset++ != 0) return std::nullopt;
    _message = _coding.binary(entry.state).value_or(Bytes());
    return RecordedMessage{.time = entry.date,
                           .technology = kTqLogChannelTechnology_IFX,
                           .bytes = _message,
                           .originalLength = _message.size()};
  }
  const ByteView rest = entry.state.bytes().subspan(_offset);
  const CollectedPacket first = firstPacket(rest);
  if (first.size != 0) {
    _offset += first.size;
    return RecordedMessage{.time = entry.date,
                           .technology = _packetTechnology,
                           .bytes = first.packet,
                           .originalLength = first.packet.size()};
  }
  if (!rest.empty() && _unframed.empty()) {
    _unframed = fmt::format("{}: entry {}: the last {} bytes are no packets and are left out",
                            _path, entry.number, rest.size());
  }
  return std::nullopt;
}

std::optional<double> SnapshotReader::fractionRead() const noexcept {
  if (_entries.empty()) return 1;
  return static_cast<double>(_entry) / static_cast<double>(_entries.size());
}

}  // namespace kestro
