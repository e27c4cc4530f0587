// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/VersionReport.h"

#include <algorithm>

#include "Platform/Bytes.h"

namespace kestro {
namespace {

constexpr std::uint16_t kRecordCode = 0x1FFD;

constexpr std::size_t kLengthOffset = 0;
constexpr std::size_t kCodeOffset = 2;
constexpr std::size_t kFirstVersionOffset = 12;
constexpr std::size_t kSecondVersionOffset = 14;
constexpr std::size_t kWallClockOffset = 97;
constexpr std::size_t kZoneOffset = 101;
constexpr std::size_t kDaylightOffset = 103;

/// A text field; its size includes the terminating zero.
struct TextPlace {
  std::size_t offset;
  std::size_t size;
};
constexpr TextPlace kVersionText{16, 7};
constexpr TextPlace kExecutableText{23, 16};
constexpr TextPlace kBuildDateText{63, 18};

constexpr unsigned kZoneShift = 32;
constexpr unsigned kDaylightShift = 48;

void storeText(std::span<std::uint8_t> record, const TextPlace& place, std::string_view text) {
  const std::string_view stored = text.substr(0, place.size - 1);
  std::ranges::copy(stored, record.begin() + static_cast<std::ptrdiff_t>(place.offset));
}

}  // namespace

std::uint64_t packedReportTime(std::uint32_t seconds, std::int16_t zoneMinutes,
                               bool daylightSaving) noexcept {
  return seconds |
         (static_cast<std::uint64_t>(static_cast<std::uint16_t>(zoneMinutes)) << kZoneShift) |
         (static_cast<std::uint64_t>(daylightSaving ? 1 : 0) << kDaylightShift);
}

// The parameters are the record's fields, in the record's order.
int QbxDLFAddVersionReport(std::span<std::uint8_t> buffer, std::uint32_t bufferLength,
                           std::uint32_t& writtenLength, std::uint16_t firstVersion,
                           std::uint16_t secondVersion, std::string_view version,
                           std::string_view executableName, std::string_view buildDate,
                           std::uint64_t packedTime) {
  writtenLength = 0;
  if (std::min<std::size_t>(bufferLength, buffer.size()) < kVersionReportSize) {
    return kVersionReportBufferTooShort;
  }
  const auto record = buffer.first(kVersionReportSize);
  std::ranges::fill(record, std::uint8_t{0});
  storeLittleEndian(record, kLengthOffset, static_cast<std::uint16_t>(kVersionReportSize));
  storeLittleEndian(record, kCodeOffset, kRecordCode);
  storeLittleEndian(record, kFirstVersionOffset, firstVersion);
  storeLittleEndian(record, kSecondVersionOffset, secondVersion);
  storeText(record, kVersionText, version);
  storeText(record, kExecutableText, executableName);
  storeText(record, kBuildDateText, buildDate);
  storeLittleEndian(record, kWallClockOffset, static_cast<std::uint32_t>(packedTime));
  storeLittleEndian(record, kZoneOffset, static_cast<std::uint16_t>(packedTime >> kZoneShift));
  storeLittleEndian(record, kDaylightOffset,
                    static_cast<std::uint16_t>((packedTime >> kDaylightShift) & 0xFF));
  writtenLength = kVersionReportSize;
  return kVersionReportWritten;
}

}  // namespace kestro
