// SPDX-License-Identifier: MIT
#include "Recordings/DlfRecords.h"

#include <fmt/format.h>

#include <limits>

#include "Recordings/DlfFormat.h"

namespace kestro {
namespace {

constexpr std::size_t kLongestRecord = std::numeric_limits<std::uint16_t>::max();
/// A record with all that may stand before it, and as much of the next one as tells that it is one.
constexpr std::size_t kAhead = 2 * (kDlfPrefixSize + 1 + kLongestRecord);
constexpr std::uint64_t kMicrosecondsOfSecond = 1'000'000;

std::uint16_t codeAt(ByteView bytes, std::size_t record) noexcept {
  return loadLittleEndian<std::uint16_t>(bytes, record + kDlfCodeOffset);
}

std::uint64_t timeAt(ByteView bytes, std::size_t record) noexcept {
  return loadLittleEndian<std::uint64_t>(bytes, record + kDlfTimeOffset);
}

bool isType(std::uint8_t byte) noexcept {
  return byte == kDlfBasebandType || byte == kDlfExtraType;
}

/// Where a record can begin: at once; behind its type byte; behind a prefix and that; or, at the
/// beginning of a history's entry, whose first byte is left out, behind the rest of a prefix.
struct Front {
  std::size_t size;
  std::size_t prefixSize;  ///< of which the first byte is a prefix's; 0: no prefix, or its rest
};
constexpr std::array kFronts = {Front{0, 0}, Front{1, 0}, Front{kDlfPrefixSize + 1, kDlfPrefixSize},
                                Front{kDlfPrefixSize, 0}};

bool isFront(const Front& front, ByteView bytes) noexcept {
  if (front.size == 0) return true;
  if (bytes.size() < front.size || !isType(bytes[front.size - 1])) return false;
  return front.prefixSize == 0 || bytes.front() == kDlfPrefixMark;
}

}  // namespace

std::size_t DlfRecords::readingsOf(ByteView bytes, Readings& readings) noexcept {
  std::size_t count = 0;
  for (const Front& front : kFronts) {
    if (!isFront(front, bytes)) continue;
    const auto length = loadLittleEndian<std::uint16_t>(bytes, front.size);
    if (length < kShortestDlfRecord || length > bytes.size() - front.size) continue;
    readings[count] = {.start = front.size, .length = length};
    if (front.size != 0) readings[count].type = bytes[front.size - 1];
    ++count;
  }
  return count;
}

bool DlfRecords::isCode(std::uint16_t code) const {
  if (code <= kLastDlfExtraCode || code == kDlfVersionReport) return true;
  return _technologiesOfCode && !_technologiesOfCode(code).empty();
}

DlfRecords::Likelihood DlfRecords::likelihoodOf(const Reading& reading, ByteView bytes) const {
  const std::uint64_t time = timeAt(bytes, reading.start);
  const std::uint64_t distance = time > _lastTime ? time - _lastTime : _lastTime - time;
  Readings following;
  const ByteView rest = bytes.subspan(reading.end());
  return {.hasKnownCode = isCode(codeAt(bytes, reading.start)),
          .isFollowed = rest.empty() || readingsOf(rest, following) != 0,
          .nearness = ~distance};
}

DlfRecords::Reading DlfRecords::best(const Readings& readings, std::size_t count,
                                     ByteView bytes) const {
  Reading best = readings.front();
  if (count == 1) return best;
  Likelihood likelihood = likelihoodOf(best, bytes);
  for (std::size_t i = 1; i < count; ++i) {
    const Likelihood other = likelihoodOf(readings[i], bytes);
    if (other <= likelihood) continue;
    likelihood = other;
    best = readings[i];
  }
  return best;
}

Result<std::optional<ByteView>> DlfRecords::next() {
  while (true) {
    const auto ahead = _file.ahead(kAhead);
    if (!ahead) return tl::unexpected(ahead.error());
    if (ahead->empty()) return std::nullopt;
    Readings readings;
    const std::size_t count = readingsOf(*ahead, readings);
    if (count == 0) return damaged(*ahead);
    const Reading reading = best(readings, count, *ahead);
    const ByteView record = ahead->subspan(reading.start, reading.length);
    _file.take(reading.end());
    const std::uint16_t code = codeAt(record, 0);
    if (!reading.type && code == kDlfVersionReport) {
      _lastTime =
          kMicrosecondsOfSecond * loadLittleEndian<std::uint32_t>(record, kDlfVersionReportSeconds);
      continue;
    }
    _lastTime = timeAt(record, 0);
    const auto type = code <= kLastDlfExtraCode ? kDlfExtraType : kDlfBasebandType;
    _packet.assign(1, reading.type.value_or(type));
    _packet.insert(_packet.end(), record.begin(), record.end());
    return _packet;
  }
}

Result<void> DlfRecords::rewind() {
  _lastTime = 0;
  return _file.rewind();
}

tl::unexpected<Error> DlfRecords::damaged(ByteView bytes) const {
  const auto length = loadLittleEndian<std::uint16_t>(bytes, 0);
  return failure(fmt::format("{}: offset {}: no record: {} bytes are left, and its length is {}",
                             _file.path(), _file.position(), bytes.size(), length));
}

}  // namespace kestro
