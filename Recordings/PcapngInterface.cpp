// SPDX-License-Identifier: MIT
#include "Recordings/PcapngInterface.h"

#include <fmt/format.h>

#include <chrono>
#include <limits>

#include "Recordings/PcapFormat.h"
#include "Recordings/PcapngOptions.h"

namespace kestro {
namespace {

constexpr std::uint64_t kMicrosecondsPerSecond = 1'000'000;
constexpr unsigned kMicrosecondDigits = 6;
constexpr std::uint8_t kBinaryResolution = 0x80;

/// 10^exponent, or 0 when that is more than any time has units.
constexpr std::uint64_t powerOfTen(unsigned exponent) noexcept {
  constexpr unsigned kDigits = std::numeric_limits<std::uint64_t>::digits10;
  if (exponent > kDigits) return 0;
  std::uint64_t power = 1;
  for (unsigned i = 0; i < exponent; ++i) power *= 10;
  return power;
}

__extension__ using Wide = __int128;

/// `units` * `multiplier` < 2^64 * 10^6, so nothing can overflow.
Wide scaled(std::uint64_t units, std::uint64_t multiplier, std::uint64_t divisor, unsigned shift) {
  if (divisor == 0) return 0;
  if (multiplier == 1) return units / divisor;
  return (Wide{units} * multiplier) >> shift;
}

}  // namespace

PcapngTimeScale::PcapngTimeScale(std::uint8_t resolution, std::int64_t offset) noexcept
    : _offset(offset) {
  const unsigned exponent = resolution & ~kBinaryResolution;
  if ((resolution & kBinaryResolution) != 0) {
    _multiplier = kMicrosecondsPerSecond;
    _shift = exponent;
  } else if (exponent <= kMicrosecondDigits) {
    _multiplier = powerOfTen(kMicrosecondDigits - exponent);
  } else {
    _divisor = powerOfTen(exponent - kMicrosecondDigits);
  }
  _isMicroseconds = resolution == kMicrosecondDigits && offset == 0;
}

std::optional<Moment> PcapngTimeScale::scaledMomentOf(std::uint64_t units) const noexcept {
  const Wide count = scaled(units, _multiplier, _divisor, _shift) +
                     Wide{_offset} * static_cast<std::int64_t>(kMicrosecondsPerSecond);
  if (count < kFirstPcapngTime.time_since_epoch().count() ||
      count > kLastPcapngTime.time_since_epoch().count()) {
    return std::nullopt;
  }
  return Moment(std::chrono::microseconds(static_cast<std::int64_t>(count)));
}

Result<PcapngInterface> pcapngInterfaceOf(PcapngBytes body) {
  constexpr std::size_t kFields = 8;
  if (body.size() < kFields) return failure("an interface that is too short");
  PcapngInterface interface { .linkType = body.u16(0), .longestPacket = body.u32(4) };
  interface.technology = technologyOfLinkType(interface.linkType).value_or(std::string_view());
  std::uint8_t resolution = kMicrosecondDigits;
  std::int64_t offset = 0;
  const auto read = forEachPcapngOption(
      body.from(kFields), [&](PcapngOption code, PcapngBytes value) -> Result<void> {
        if (code == PcapngOption::InterfaceTimeResolution) {
          if (value.size() != 1) return failure("a time resolution that is no byte");
          resolution = value.view()[0];
        } else if (code == PcapngOption::InterfaceTimeOffset) {
          if (value.size() != 8) return failure("a time offset that is not of 8 bytes");
          offset = static_cast<std::int64_t>(value.u64(0));
        }
        return {};
      });
  if (!read) return tl::unexpected(read.error());
  interface.times = PcapngTimeScale(resolution, offset);
  return interface;
}

}  // namespace kestro
