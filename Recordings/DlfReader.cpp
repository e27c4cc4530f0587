// SPDX-License-Identifier: MIT
#include "Recordings/DlfReader.h"

#include <fmt/format.h>

#include <chrono>
#include <utility>

#include "Recordings/DlfFormat.h"
#include "Recordings/PacketTechnology.h"

namespace kestro {
namespace {

std::optional<Moment> timeOfPacket(ByteView packet) {
  constexpr Moment kEnd = std::chrono::sys_days(std::chrono::year(10'000) / 1 / 1);
  const auto time = loadLittleEndian<std::uint64_t>(packet, 1 + kDlfTimeOffset);
  if (time >= static_cast<std::uint64_t>(kEnd.time_since_epoch().count())) return std::nullopt;
  return Moment(std::chrono::microseconds(static_cast<std::int64_t>(time)));
}

}  // namespace

Result<std::unique_ptr<DlfReader>> DlfReader::open(RecordedFile file,
                                                   const RecordingContext& context) {
  if (context.technology.empty() && !file.isOnDisk()) {
    const auto ahead = file.ahead(kLongestInMemory);
    if (!ahead) return tl::unexpected(ahead.error());
    if (ahead->size() >= kLongestInMemory) {
      return failure(fmt::format(
          "{}: too long to find its technology; --technology must say which it is", file.path()));
    }
  }
  std::unique_ptr<DlfReader> reader(
      new DlfReader(DlfRecords(std::move(file), context.technologiesOfCode)));
  if (auto decided = reader->decideTechnology(context); !decided) {
    return tl::unexpected(decided.error());
  }
  return reader;
}

Result<void> DlfReader::decideTechnology(const RecordingContext& context) {
  _technology = context.technology;
  if (!_technology.empty()) return {};
  PacketTechnology codes(context);
  while (true) {
    const auto packet = _records.next();
    if (!packet || !*packet) break;  // damage is reported when it is reached
    codes.add(**packet);
  }
  const auto decided = codes.decided(_records.file().path());
  if (!decided) return tl::unexpected(decided.error());
  _technology = *decided;
  return _records.rewind();
}

Result<std::optional<RecordedMessage>> DlfReader::next() {
  if (_error) return tl::unexpected(*_error);
  const auto packet = _records.next();
  if (!packet) {
    _error = packet.error();
    return tl::unexpected(packet.error());
  }
  if (!*packet) return std::nullopt;
  _lastTime = timeOfPacket(**packet).value_or(_lastTime);
  return counted({.time = _lastTime,
                  .technology = _technology,
                  .bytes = **packet,
                  .originalLength = (*packet)->size()});
}

}  // namespace kestro
